#!/usr/bin/env python3
"""Compares what no test runs with what tests/uncovered.txt explains.
Usage: scripts/uncovered.py COVERAGE.json      gcovr's JSON of a run of all tests; scripts/coverage.sh makes it

Fails for a line that is neither run nor explained, for an explanation that no longer fits (one "by chance" may), and
when less than 95 % of the branches are taken or explained. A branch is explained by an entry that holds its line. Only
lines with a condition count: elsewhere the compiler's branches are ways out of inlined calls by an exception, and guards
of static objects.
"""
import json
import re
import sys
from pathlib import Path

ROOT = Path(__file__).resolve().parent.parent
LEAST_BRANCHES = 95.0
CONDITION = re.compile(r"\b(if|for|while|switch|case|catch|operator)\b|\?|&&|\|\|")


def read_entries(path):
    """[(file, lines, by chance)]: a file's name; then lines as they follow each other, and the reason after '#'."""
    entries, file, lines = [], None, []
    for text in path.read_text().splitlines()[3:]:
        if not text:
            file = None
        elif file is None:
            file = text
        elif text.startswith("# "):
            entries.append((file, lines, text.startswith("# by chance")))
            lines = []
        elif not text.startswith("  "):  # two blanks more: the reason goes on
            lines.append(text)
    return entries


def read_coverage(path):
    """{file: {line: [times run, [times of each branch]]}}; instances of a template count as one line."""
    files = {}
    for file in json.loads(Path(path).read_text())["files"]:
        lines = files.setdefault(file["file"], {})
        for line in file["lines"]:
            if not line["gcovr/noncode"]:
                entry = lines.setdefault(line["line_number"], [0, []])
                entry[0] += line["count"]
                entry[1] += [branch["count"] for branch in line["branches"] if not branch["throw"]]
    return files


def main():
    files = read_coverage(sys.argv[1])
    sources = {name: [line.strip() for line in (ROOT / name).read_text().splitlines()] for name in files}
    explained, faults = set(), []
    for name, lines, by_chance in read_entries(ROOT / "tests/uncovered.txt"):
        source, found = sources.get(name, []), False
        for first in range(len(source) - len(lines) + 1):
            if source[first:first + len(lines)] == lines:
                places = range(first + 1, first + 1 + len(lines))
                known = [files[name][n] for n in places if n in files[name]]
                if any(count == 0 or 0 in branches for count, branches in known):
                    explained.update((name, n) for n in places)
                    found = True
        if not found and not by_chance:
            faults.append(f"{name}: explained, but run or no more there: {lines[0]}")
    runs = missing_lines = branches = taken = excused = 0
    for name, lines in sorted(files.items()):
        for number, (count, counts) in sorted(lines.items()):
            is_explained = (name, number) in explained
            runs += count > 0
            missing_lines += count == 0
            counts = counts if CONDITION.search(sources[name][number - 1]) else []
            branches += len(counts)
            missed = counts.count(0)
            taken += len(counts) - missed
            excused += missed if is_explained else 0
            if count == 0 and not is_explained:
                faults.append(f"{name}:{number}: not run: {sources[name][number - 1]}")
    share = 100.0 * (taken + excused) / branches
    print(f"lines: {runs} of {runs + missing_lines} run; branches: {taken} of {branches} taken, {excused} explained, "
          f"together {share:.1f} %")
    if share < LEAST_BRANCHES:
        faults.append(f"branches: {share:.1f} %, less than {LEAST_BRANCHES} %")
    print("\n".join(faults))
    return 1 if faults else 0


if __name__ == "__main__":
    sys.exit(main())
