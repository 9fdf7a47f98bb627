#!/usr/bin/env python3
"""Summarises the tables of docs/performance.md: its first table, that of README.md, and a chart of ratios.

Usage: bench_chart.py       rewrites both tables and docs/pictures/speed.svg; scripts/bench.sh calls it

A row's peer is the fastest one. Where some peers are locked for use by several threads, as ours is, only those count.
"""
import math
import pathlib
import re
import sys

from bench_table import put_into

PAGE = pathlib.Path(__file__).resolve().parent.parent / "docs/performance.md"
CHART = PAGE.parent / "pictures/speed.svg"
README = PAGE.parent.parent / "README.md"
SHORT = ("point in a prepared polygon, 100,000 vertices", "Cartesian to geodetic", "grid: find at random",
         "R-tree: window query")  # the rows that the README has
ROWS = [  # subject, row of its table, what a reader calls it, and our form if it is not the plain one
    ("plane", "in polygon, 100", "point in a polygon of 100 vertices"),
    ("plane", "in band, 1000", "the same with a tolerance, 1,000 vertices"),
    ("plane", "in polygon, 100000", "point in a prepared polygon, 100,000 vertices", "prepared"),
    ("geodesy", "to cartesian", "geodetic to Cartesian"),
    ("geodesy", "to geodetic", "Cartesian to geodetic"),
    ("geodesy", "direct, km 10000", "direct geodesic, 10,000 km"),
    ("geodesy", "inverse, km 10000", "inverse geodesic, 10,000 km"),
    ("geodesy", "crosstrack", "distance from a geodesic"),
    ("sparse", "insert row by row", "grid: insert, row by row"),
    ("sparse", "insert row by row", "grid: insert whole rows, a cell", "basalt rows"),
    ("sparse", "find at random", "grid: find at random"),
    ("sparse", "visit all of 1000000", "grid: visit a million cells"),
    ("sparse", "select and visit 64 x 64 of 1000000 (a window)", "grid: visit a window"),
    ("rtree", "insert, 100000", "R-tree: insert 100,000"),
    ("rtree", "window, across 40, down 25", "R-tree: window query"),
    ("blocks", "blocks churn random", "blocks of one size, at random"),
    ("memory", "small mix, threads 1", "heap: small blocks, one thread"),
    ("memory", "small mix, threads 2", "heap: small blocks, two threads"),
    ("util", "hex encode, bytes 65536", "hexadecimal, 64 KiB"),
    ("logs", "log line", "one line to a log"),
    ("files", "path split", "path into its parts"),
    ("files", "list 200 files", "list 200 files"),
    ("graphics", "gradient vertical", "gradient"),
    ("graphics", "rotation, degrees 30", "rotated bitmap"),
    ("regions", "region of blobs", "region of a mask"),
    ("loading", "open and call once", "open the library"),
]
STYLE = ("text{font:13px sans-serif;fill:#222}.axis{stroke:#999}.fast{fill:#2a78b5}.slow{fill:#c4661f}"
         "@media(prefers-color-scheme:dark){text{fill:#ddd}.axis{stroke:#777}}")
LEFT, WIDTH, LINE = 330, 330, 22  # of the bars; the lines' height
LIMIT = 20.0  # longer bars are truncated


def with_unit(value):
    for unit, size in (("s", 1e9), ("ms", 1e6), ("us", 1e3)):
        if value >= size:
            return f"{value / size:.3g} {unit}"
    return f"{value:.3g} ns"


def is_ours(who):
    return who.startswith("basalt") or who in ("prepared", "preparing", "arrays", "single call")


def best_peer(page, subject, wanted, who="basalt"):
    """(our figure, peer, its figure, ratio), or None where the page has no such row."""
    lines = re.search(f"<!-- {subject} -->\n(.*?)<!-- end {subject} -->", page, re.DOTALL)
    rows = [[cell.strip() for cell in line.strip("|").split("|")] for line in lines[1].splitlines()] if lines else []
    rows = [cells for cells in rows if cells[0] == wanted and len(cells) > 4 and cells[4]]
    figures = {cells[2]: float(cells[3].replace(",", "")) for cells in rows}
    if rows:
        figures["basalt"] = float(rows[0][1].replace(",", ""))
    peers = [cells for cells in rows if not is_ours(cells[2])]
    peers = [cells for cells in peers if cells[2].endswith(" locked")] or peers
    if not peers or who not in figures:
        return None
    best = min(peers, key=lambda cells: figures[cells[2]])
    ratio = float(best[4]) if who == "basalt" else figures[best[2]] / figures[who]
    return figures[who], best[2], figures[best[2]], f"{ratio:.2f}"


def table(results):
    lines = ["| | basalt | fastest peer | its time | ratio |", "|---|---:|---|---:|---:|"]
    for name, (own, peer, other, ratio) in results:
        lines.append(f"| {name} | {with_unit(own)} | {peer} | {with_unit(other)} | {ratio} |")
    return "\n".join(lines)


def chart(results):
    height = LINE * (len(results) + 1) + 8
    lines = [f'<svg xmlns="http://www.w3.org/2000/svg" viewBox="0 0 {LEFT + WIDTH + 60} {height}" role="img">',
             "<title>Time of the fastest other library divided by ours, logarithmic</title>", f"<style>{STYLE}</style>"]
    low = -0.3  # log10 of the left edge
    scale = WIDTH / (math.log10(LIMIT) - low)
    zero = LEFT - low * scale
    for index, (name, (_, peer, _, ratio)) in enumerate(results):
        y = 4 + LINE * index
        end = LEFT + (math.log10(min(max(float(ratio), 0.5), LIMIT)) - low) * scale
        kind = "fast" if float(ratio) >= 1 else "slow"
        lines.append(f'<text x="{LEFT - 8}" y="{y + 15}" text-anchor="end">{name}</text>'
                     f'<rect class="{kind}" x="{min(zero, end):.1f}" y="{y + 3}" width="{abs(end - zero):.1f}" height="16">'
                     f"<title>{peer}</title></rect>"
                     f'<text x="{max(zero, end) + 5:.1f}" y="{y + 15}">{float(ratio):.3g}</text>')
    lines.append(f'<line class="axis" x1="{zero:.1f}" y1="2" x2="{zero:.1f}" y2="{height - LINE}"/>'
                 f'<text x="{zero:.1f}" y="{height - 6}" text-anchor="middle">1: as fast</text>'
                 f'<text x="{LEFT + WIDTH}" y="{height - 6}" text-anchor="end">20 times as fast</text></svg>')
    return "\n".join(lines) + "\n"


def main():
    page = PAGE.read_text(encoding="utf-8")
    results = [(name, best_peer(page, subject, row, *form)) for subject, row, name, *form in ROWS]
    for name, result in results:
        if not result:
            print(f"{PAGE}: no row with a peer for: {name}", file=sys.stderr)
    results = [(name, result) for name, result in results if result]
    if not results:
        sys.exit(f"{PAGE}: no tables")
    put_into(PAGE, "results", table(results))
    put_into(README, "speed", table([result for result in results if result[0] in SHORT]))
    CHART.write_text(chart(results), encoding="utf-8")


if __name__ == "__main__":
    if len(sys.argv) > 1:
        sys.exit(__doc__)
    main()
