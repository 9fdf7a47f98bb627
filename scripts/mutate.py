#!/usr/bin/env python3
"""Asks the tests whether they notice: makes one small change at a time in src/ and runs the tests on it.

Changes: a comparison, an operator, a constant, a negated condition, a dropped statement, two swapped arguments.
A changed family meets its own tests first, then those of the families above it. What fails, crashes or exceeds the
time limit is noticed. A change that does not compile, or gives the same object code, does not count. Interrupted,
it tells what it has found so far.
Works on copies below the build folder; the checkout is never written to. What tests/mutants_explained.txt explains is
not tried and told apart; explanations of lines that are no more are named. The exit status is 1 when anything else
survived.
"""
import argparse
import collections
import concurrent.futures
import pathlib
import queue
import random
import shutil
import sys
import time

sys.dont_write_bytecode = True  # nothing is written into the checkout
from mutation_runner import ROOT, Build, Worker, family_of  # noqa: E402
from mutations import mutations  # noqa: E402


def read_explained(file):
    """{(file, before, after): reason}; a file's name, then '-' and '+' lines, each pair with its reason after '#'."""
    explained, name, before, after = {}, None, None, None
    for line in file.read_text(encoding="utf-8").splitlines() if file.is_file() else []:
        mark, text = line[:2], line[2:].strip()
        if mark == "- ":
            before = text
        elif mark in ("+ ", "+"):
            after = text
        elif mark == "# " and after is not None:
            explained[name, before, after] = text
        elif line.endswith((".cpp", ".h")):
            name = line.strip()
    return explained


def parse_arguments():
    parser = argparse.ArgumentParser(description=__doc__, formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("--seed", type=int, default=1, help="which sample (default %(default)s)")
    parser.add_argument("--count", type=int, default=300, help="how many changes (default %(default)s; 0: all)")
    parser.add_argument("--in", dest="within", default="src/", metavar="PREFIX",
                        help="only files whose path begins so, such as src/geo/ (default %(default)s)")
    parser.add_argument("--jobs", type=int, default=2, help="changes tried at a time (default %(default)s)")
    parser.add_argument("--build", type=pathlib.Path, default=ROOT / "build/mutants", help="where to work")
    parser.add_argument("--list", action="store_true", help="print the sample and do nothing")
    parser.add_argument("--every-test", action="store_true",
                        help="run all tests on each change, and tell how many changes each test noticed and how many "
                             "no other test did")
    return parser.parse_args()


def sample(options, explained):
    found = []
    for file in sorted([*ROOT.glob("src/**/*.cpp"), *ROOT.glob("src/**/*.h")]):
        name = str(file.relative_to(ROOT))
        if name.startswith(options.within):
            found += mutations(name, file.read_text(encoding="utf-8"))
    if not found:
        sys.exit(f"nothing to change in {options.within}")
    keys = {mutation.key for mutation in found}
    for name, before, after in sorted(key for key in explained if key[0].startswith(options.within)):
        if (name, before, after) not in keys:
            print(f"explained, but not there any more: {name}: {before} -> {after}")
    if 0 < options.count < len(found):
        found = random.Random(options.seed).sample(found, options.count)
    return found


def tell_tests(results):
    noticed, alone = collections.Counter(), collections.Counter()
    for _, (_, _, failed) in results:
        noticed.update(failed)
        if len(failed) == 1:
            alone.update(failed)
    print("\nnoticed  alone  test")
    for name, count in sorted(noticed.items(), key=lambda item: (alone[item[0]], item[1])):
        print(f"{count:7d} {alone[name]:6d}  {name}")


def tell(results):
    """Prints the survivors and the table of families; returns how many survived without an explanation."""
    table = collections.defaultdict(collections.Counter)
    new = 0
    for mutation, (outcome, by, _) in results:
        family = family_of(mutation)
        row = table[family]
        row[outcome] += 1
        row["from above"] += outcome == "noticed" and by != family
        if outcome == "survived":
            new += 1
            print(f"{mutation.file}\n- {mutation.before}\n+ {mutation.after}\n  line {mutation.line}, "
                  f"{mutation.kind}\n")
    for row in list(table.values()):
        table["all"].update(row)
    heads = ["noticed", "from above", "survived", "explained", "equivalent", "not compiled"]
    print(f"{'':12}{''.join(f'{head:>14}' for head in heads)}  noticed of counted")
    for name, row in table.items():
        counted = row["noticed"] + row["survived"]
        share = f"{100 * row['noticed'] / counted:.1f} %" if counted else "-"
        print(f"{name:12}{''.join(f'{row[head]:14d}' for head in heads)}  {share}")
    return new


def main():
    options = parse_arguments()
    explained = read_explained(ROOT / "tests/mutants_explained.txt")
    chosen = sample(options, explained)
    if options.list:
        for m in chosen:
            print(f"{m.file}:{m.line}: {m.kind}\n- {m.before}\n+ {m.after}")
        return
    for tool in ("cmake", "ninja", "c++"):
        if not shutil.which(tool):
            sys.exit(f"{tool} is needed and not there")
    folder = options.build.resolve()
    build = Build(folder, options.jobs)
    build.time_tests(folder / "scratch")
    free = queue.Queue()
    for i in range(options.jobs):
        free.put(Worker(build, folder / f"worker-{i}", options.every_test))

    def attempt(mutation):
        if mutation.key in explained:
            return "explained", None, []
        worker = free.get()
        try:
            result = worker.attempt(mutation)
        finally:
            free.put(worker)
        print(f"{result[0]}{f' by {result[1]}' if result[1] else ''}: {mutation.file}:{mutation.line}: "
              f"{mutation.before} -> {mutation.after or '(nothing)'}", flush=True)
        return result

    begin = time.monotonic()
    results = []
    pool = concurrent.futures.ThreadPoolExecutor(options.jobs)
    try:
        for mutation, result in zip(chosen, pool.map(attempt, chosen)):
            results.append((mutation, result))
    except KeyboardInterrupt:
        print("interrupted")
    finally:
        pool.shutdown(cancel_futures=True)
    print(f"\n{len(results)} changes in {(time.monotonic() - begin) / 60:.1f} minutes\n")
    if options.every_test:
        tell_tests(results)
    sys.exit(1 if tell(results) else 0)


if __name__ == "__main__":
    try:
        main()
    except KeyboardInterrupt:
        sys.exit("interrupted")
