#!/usr/bin/env python3
"""Turns benchmark results into a table: our median, each peer's median and the ratio peer / ours.

Benchmarks are named "<row>/<who>[/<argument>...]", with who = basalt for ours; arguments become part of the
row. Fails when a name is no such name, a row has no figure of ours, or a benchmark reported an error, such as
answers that differ from a peer's.

Usage: bench_table.py RESULTS.json
"""
import json
import os
import sys

NANOSECONDS = {"ns": 1.0, "us": 1e3, "ms": 1e6, "s": 1e9}
HOW_TIMED = {"real_time", "manual_time", "process_time"}


def split_name(name):
    row, _, rest = name.partition("/")
    who, *rest = rest.split("/")
    if not who:
        sys.exit(f"{name}: a benchmark is named <row>/<who>")
    arguments = [part.replace(":", " ") for part in rest
                 if part not in HOW_TIMED and not part.startswith(("iterations:", "repeats:"))]
    return ", ".join([row.replace("_", " "), *arguments]), who.replace("_", " ")


def medians(benchmarks):
    rows = {}
    # measured in random turns; told in the order in which they are written
    for entry in sorted(benchmarks, key=lambda e: (e["family_index"], e["per_family_instance_index"])):
        if entry.get("error_occurred"):
            sys.exit(f"{entry['name']}: {entry['error_message']}")
        if entry.get("aggregate_name", "median") != "median":
            continue
        row, who = split_name(entry["run_name"])
        counters = {k: v for k, v in entry.items() if k.endswith("_ns") or k == "bytes_per_cell"}
        rows.setdefault(row, {})[who] = (entry["real_time"] * NANOSECONDS[entry["time_unit"]], counters)
    return rows


def number(value):
    return f"{value:,.0f}" if value >= 1000 else f"{value:.3g}"


def main():
    if len(sys.argv) != 2 or sys.argv[1].startswith("-"):
        sys.exit(__doc__)
    with open(sys.argv[1], encoding="utf-8") as file:
        results = json.load(file)
    context = results["context"]
    print(f"\n### {os.path.basename(sys.argv[1]).removesuffix('.json')}: {context['num_cpus']} processors of "
          f"{context['mhz_per_cpu']} MHz, nanoseconds unless the row says otherwise\n")
    print("| row | basalt | peer | peer's figure | ratio |")
    print("|---|---:|---|---:|---:|")
    for row, figures in medians(results["benchmarks"]).items():
        if "basalt" not in figures:
            sys.exit(f"{row}: no figure of basalt to set beside {', '.join(figures)}")
        ours, counters = figures.pop("basalt")
        label = row + "".join(f"; {name} {number(value)}" for name, value in counters.items())
        if not figures:
            print(f"| {label} | {number(ours)} | | | |")
        for who, (theirs, _) in figures.items():
            ratio = f"{theirs / ours:.2f}" if ours > 0 else ""
            print(f"| {label} | {number(ours)} | {who} | {number(theirs)} | {ratio} |")


if __name__ == "__main__":
    main()
