"""Batch calls from Python beside plain loops in C++ over the same arrays: milliseconds of each at a million items, the
least of interleaved rounds, and how much of the loop's speed is reached.
"""
import pathlib
import sys
import time

import numpy as np

sys.path.insert(0, str(pathlib.Path(__file__).resolve().parent.parent / "tests"))
from plain_loops import FUNCTIONS, PlainLoops, arguments, columns  # noqa: E402

from basalt import geo, time_scales, units  # noqa: E402

COUNT = 1_000_000
ROUNDS = 7


def milliseconds(work):
    start = time.perf_counter()
    work()
    return (time.perf_counter() - start) * 1e3


def compare(name, ours, theirs):
    pairs = [(milliseconds(ours), milliseconds(theirs)) for _ in range(ROUNDS)]
    bound, plain = (min(column) for column in zip(*pairs))
    print(f"{name:30}{bound:12.2f}{plain:12.2f}{plain / bound:9.0%}")


def main():
    loops = PlainLoops()
    print(f"{'':30}{'Python, ms':>12}{'C++, ms':>12}{'speed':>9}")
    for name in FUNCTIONS:
        call = next(getattr(module, name) for module in (geo, time_scales, units) if hasattr(module, name))
        made = columns(name, COUNT)
        given = arguments(name, made)
        results = call(*given)  # warm, and the arrays that are written over below
        written = results if isinstance(results, tuple) else (results,)
        out = [np.empty(COUNT) for _ in range(FUNCTIONS[name][1])]
        loops.run(name, made, out)
        compare(name, lambda: call(*given, out=written), lambda: loops.run(name, made, out))

    random = np.random.default_rng(3)
    turns = np.sort(random.uniform(0, 2 * np.pi, 100))
    outline = np.stack([100 * np.cos(turns), 100 * np.sin(turns), 0 * turns], axis=1)
    north, east = random.uniform(-110, 110, (2, COUNT))
    inside = np.empty(COUNT, dtype=bool)
    compare("in_polygon, 100", lambda: geo.in_polygon(north, east, outline[:, 0], outline[:, 1], out=inside),
            lambda: loops.outline("in_polygon", north, east, outline, inside))


if __name__ == "__main__":
    main()
