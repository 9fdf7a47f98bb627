#!/usr/bin/env python3
"""Turns rounds of benchmark results into a table: our median, and for each peer its median and the ratio peer / ours.

A round is one run of a subject's program, which measures everything in random order. A ratio is formed within each
round; the table has its median and range over the rounds.
Benchmarks are named "<row>/<who>[/<argument>...]", with who = basalt for ours; arguments become part of the row.
Who = limit_<what> is the least that the machine allows; the table has our time as a multiple of it.
Fails for any other name, for a row without a figure of ours, and when a benchmark reported an error, such as
results that differ from a peer's.

Usage: bench_table.py ROUND.json ...                    prints the table
       bench_table.py --page PAGE SUBJECT ROUND.json ...    writes it between the page's marks of that subject
       bench_table.py --page PAGE MARK --text TEXT          writes a text there
"""
import json
import pathlib
import re
import statistics
import sys

NANOSECONDS = {"ns": 1.0, "us": 1e3, "ms": 1e6, "s": 1e9}
HOW_TIMED = {"real_time", "manual_time", "process_time"}
LIMIT = "limit "


def split_name(name):
    row, _, rest = name.partition("/")
    who, *rest = rest.split("/")
    if not who:
        sys.exit(f"{name}: a benchmark is named <row>/<who>")
    arguments = [part.replace(":", " ") for part in rest
                 if part not in HOW_TIMED and not part.startswith(("iterations:", "repeats:"))]
    return ", ".join([row.replace("_", " "), *arguments]), who.replace("_", " ")


def read_round(file):
    """{row: {who: (nanoseconds, counters)}}, in the order in which the rows are written."""
    rows = {}
    benchmarks = json.loads(pathlib.Path(file).read_text(encoding="utf-8"))["benchmarks"]
    for entry in sorted(benchmarks, key=lambda e: (e["family_index"], e["per_family_instance_index"])):
        if entry.get("error_occurred"):
            sys.exit(f"{entry['name']}: {entry['error_message']}")
        row, who = split_name(entry["run_name"])
        counters = {k: v for k, v in entry.items() if k.endswith("_ns") or k == "bytes_per_cell"}
        rows.setdefault(row, {})[who] = (entry["real_time"] * NANOSECONDS[entry["time_unit"]], counters)
    for row, figures in rows.items():
        if "basalt" not in figures:
            sys.exit(f"{row}: no figure of basalt to set beside {', '.join(figures)}")
    return rows


def number(value):
    return f"{value:,.0f}" if value >= 1000 else f"{value:.3g}"


def median_of(rounds, row, who):
    return statistics.median(r[row][who][0] for r in rounds)


def ratios(rounds, row, who):
    return [r[row][who][0] / r[row]["basalt"][0] for r in rounds if r[row]["basalt"][0] > 0]


def table(rounds):
    first = rounds[0]
    counters = list(dict.fromkeys(name for figures in first.values() for name in figures["basalt"][1]))
    has_peers = any(len(figures) > 1 for figures in first.values())
    heads = ["row", "basalt", *(name.replace("_", " ") for name in counters)]
    if has_peers:
        heads += ["peer", "its figure", "ratio", "lowest to highest", "limit", "times the limit"]
    lines = ["| " + " | ".join(heads) + " |", "|---|" + "---:|" * (len(heads) - 1)]
    for row, figures in first.items():
        own = [row, number(median_of(rounds, row, "basalt"))]
        own += [number(figures["basalt"][1][name]) if name in figures["basalt"][1] else "" for name in counters]
        limits = [who for who in figures if who.startswith(LIMIT)]
        peers = [who for who in figures if who != "basalt" and who not in limits]
        limit = ["", ""]
        if limits:
            times = statistics.median(1 / r for r in ratios(rounds, row, limits[0]))
            limit = [f"{limits[0].removeprefix(LIMIT)} {number(median_of(rounds, row, limits[0]))}", f"{times:.2f}"]
        for who in peers or [None]:
            cells = ["", "", "", ""]
            if who:
                seen = ratios(rounds, row, who)
                cells = [who, number(median_of(rounds, row, who)), f"{statistics.median(seen):.2f}",
                        f"{min(seen):.2f} to {max(seen):.2f}"]
            lines.append("| " + " | ".join(own + (cells + limit if has_peers else [])) + " |")
            limit = ["", ""]
    return "\n".join(lines)


def put_into(page, subject, text):
    begin, end = f"<!-- {subject} -->", f"<!-- end {subject} -->"
    pattern = re.compile(re.escape(begin) + ".*?" + re.escape(end), re.DOTALL)
    old = page.read_text(encoding="utf-8")
    if not pattern.search(old):
        sys.exit(f"{page}: no marks {begin} and {end}")
    page.write_text(pattern.sub(lambda _: f"{begin}\n{text}\n{end}", old), encoding="utf-8")


def main():
    arguments = sys.argv[1:]
    page = None
    if arguments[:1] == ["--page"]:
        page, subject, *arguments = arguments[1:]
    if page and arguments[:1] == ["--text"] and len(arguments) == 2:
        text = arguments[1]
    elif not arguments or arguments[0].startswith("-"):
        sys.exit(__doc__)
    else:
        text = table([read_round(file) for file in arguments])
    if page:
        put_into(pathlib.Path(page), subject, text)
    else:
        print(text)


if __name__ == "__main__":
    main()
