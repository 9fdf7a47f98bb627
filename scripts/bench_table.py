#!/usr/bin/env python3
"""Turns benchmark results into a table: our median, each peer's median and the ratio peer / ours.

Rows are named "<row>/<who>", with who = basalt for ours.
Usage: bench_table.py RESULTS.json
"""
import json
import os
import sys


def medians(benchmarks):
    rows = {}
    for entry in benchmarks:
        if entry.get("aggregate_name", "median") != "median":
            continue
        row, who = entry["run_name"].split("/")[:2]
        counters = {k: v for k, v in entry.items() if k.endswith("_ns") or k == "bytes_per_cell"}
        rows.setdefault(row, {})[who] = (entry["real_time"], counters)
    return rows


def number(value):
    return f"{value:,.0f}" if value >= 1000 else f"{value:.3g}"


def main():
    if len(sys.argv) != 2:
        sys.exit(__doc__)
    with open(sys.argv[1], encoding="utf-8") as file:
        results = json.load(file)
    context = results["context"]
    print(f"\n### {os.path.basename(sys.argv[1]).removesuffix('.json')}: {context['num_cpus']} processors of "
          f"{context['mhz_per_cpu']} MHz, nanoseconds unless the row says otherwise\n")
    print("| row | basalt | peer | peer's figure | ratio |")
    print("|---|---:|---|---:|---:|")
    for row, figures in medians(results["benchmarks"]).items():
        ours, counters = figures.pop("basalt", (None, {}))
        label = row + "".join(f"; {name} {number(value)}" for name, value in counters.items())
        if not figures and ours is not None:
            print(f"| {label} | {number(ours)} | | | |")
        for who, (theirs, _) in figures.items():
            ratio = f"{theirs / ours:.2f}" if ours else ""
            print(f"| {label} | {number(ours) if ours is not None else ''} | {who} | {number(theirs)} | {ratio} |")


main()
