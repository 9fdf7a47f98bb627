#!/usr/bin/env python3
"""Draws the errors of the geodesics against their distance, docs/pictures/accuracy.svg, from docs/accuracy.md's tables.

Usage: accuracy_chart.py       scripts/accuracy.sh calls it
"""
import math
import pathlib
import re
import sys

from bench_chart import STYLE

PAGE = pathlib.Path(__file__).resolve().parent.parent / "docs/accuracy.md"
CHART = PAGE.parent / "pictures/accuracy.svg"
TABLES = [("direct", "slow", "Direct geodesic"), ("inverse", "fast", "Inverse geodesic")]  # class, title
LEFT, TOP, WIDTH, HEIGHT = 70, 16, 480, 240
METRES = (0, 7.5)  # log10 of the distance
ERRORS = (-11, -3)
MARKS = {0: "1 m", 3: "1 km", 6: "1000 km", -9: "1 nm", -6: "1 um", -3: "1 mm"}


def metres(text):
    number, unit = re.search(r"([\d,]+)(?: (k?m))?$", text).groups()
    return float(number.replace(",", "")) * (1000 if unit == "km" else 1)


def errors(page, title):
    """(upper end of the band, median, largest error in metres) of each band of a table's first quantity."""
    rows = re.search(rf"### {title},.*?\n\n?(\|.*?)\n\n", page, re.DOTALL)
    cells = [line.strip("|").split("|") for line in rows[1].splitlines()[2:]] if rows else []
    return [(metres(row[0].strip()), *map(float, row[2].split("/")[::2])) for row in cells if "/" in row[2]]


def point(distance, error):
    across = (math.log10(distance) - METRES[0]) / (METRES[1] - METRES[0])
    up = (math.log10(error) - ERRORS[0]) / (ERRORS[1] - ERRORS[0])
    return f"{LEFT + WIDTH * across:.1f},{TOP + HEIGHT * (1 - min(max(up, 0), 1)):.1f}"


def chart(page):
    size = f"{LEFT + WIDTH + 170} {TOP + HEIGHT + 40}"
    lines = [f'<svg xmlns="http://www.w3.org/2000/svg" viewBox="0 0 {size}" role="img">',
             "<title>Errors of the geodesics against their distance, both logarithmic</title>",
             f"<style>{STYLE}polyline{{stroke-width:2}}.median{{stroke-dasharray:4 4}}"
             ".axis{stroke-width:.5}polyline.fast{fill:none;stroke:#2a78b5}polyline.slow{fill:none;stroke:#c4661f}</style>"]
    for power, text in MARKS.items():
        ends = ((10 ** power, 10 ** ERRORS[0]), (10 ** power, 10 ** ERRORS[1])) if power >= 0 else \
               ((1, 10 ** power), (10 ** METRES[1], 10 ** power))
        (x1, y1), (x2, y2) = (point(*end).split(",") for end in ends)
        lines.append(f'<line class="axis" x1="{x1}" y1="{y1}" x2="{x2}" y2="{y2}"/>')
        lines.append(f'<text x="{x1}" y="{TOP + HEIGHT + 18}" text-anchor="middle">{text}</text>' if power >= 0 else
                     f'<text x="{LEFT - 6}" y="{float(y1) + 4}" text-anchor="end">{text}</text>')
    for kind, color, title in TABLES:
        bands = errors(page, title)
        if not bands:
            sys.exit(f"{PAGE}: no table: {title}")
        for name, column, down in (("largest", 2, 0), ("median", 1, 10)):
            path = [point(max(band[0], 1), band[column]) for band in bands]
            x, y = path[-1].split(",")
            lines.append(f'<polyline class="{color} {name}" points="{" ".join(path)}"/>'
                         f'<text x="{float(x) + 8}" y="{float(y) + down:.1f}">{kind}, {name}</text>')
    return "\n".join(lines) + "\n</svg>\n"


if __name__ == "__main__":
    if len(sys.argv) > 1:
        sys.exit(__doc__)
    CHART.write_text(chart(PAGE.read_text(encoding="utf-8")), encoding="utf-8")
