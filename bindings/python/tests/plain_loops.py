"""The C++ library in plain loops, compiled for the occasion: what results and speed are held against."""
import ctypes
import os
import pathlib
import subprocess
import sysconfig

import numpy as np

HERE = pathlib.Path(__file__).resolve().parent
ROOT = HERE.parent.parent.parent
BUILD = ROOT / "build" / "python"
LIBRARY = pathlib.Path(os.environ.get("BASALT_LIBRARY", BUILD / "library"))  # as the package was built with

# name: (least and greatest of each column in, columns out)
LATITUDE, LONGITUDE, TURN, METRES = (-1.57, 1.57), (-3.14, 3.14), (-6.3, 6.3), (-5e5, 5e5)
FUNCTIONS = {
    "horizontal_distance": ([METRES] * 4, 1),
    "slope_distance": ([METRES] * 6, 1),
    "grid_bearing": ([METRES] * 4, 1),
    "triangle_area": ([METRES] * 6, 1),
    "normalise_bearing": ([(-60.0, 60.0)], 1),
    "follow": ([METRES] * 3 + [TURN, (0.0, 1e4), (-1.5, 1.5)], 3),
    "reduce_observation": ([TURN, (0.0, 6.2), (0.0, 1e3)] + [METRES] * 3 + [(-2.0, 2.0), (0.999, 1.001)], 3),
    "llh_to_xyz": ([LATITUDE, LONGITUDE, (-100.0, 9e3)], 3),
    "xyz_to_llh": ([(-7e6, 7e6)] * 3, 3),
    "direct": ([LATITUDE, LONGITUDE, TURN, (0.0, 1e6)], 3),
    "great_circle_distance": ([LATITUDE, LONGITUDE] * 2, 1),
    "cross_track": ([(0.8, 0.81), (0.1, 0.11)] * 3, 1),
    "mjd_to_gps": ([(44244.0, 80000.0), (0.0, 86400.0)], 2),
    "radians_to_dms": ([TURN], 3),
}
WHOLE = {("mjd_to_gps", 0)}  # columns in that are whole numbers


def columns(name, count, seed=1):
    """Random columns for a function, with whole numbers where it wants them."""
    random = np.random.default_rng(seed)
    made = [random.uniform(least, greatest, count) for least, greatest in FUNCTIONS[name][0]]
    return [np.floor(column) if (name, i) in WHOLE else column for i, column in enumerate(made)]


def arguments(name, made):
    """The same columns as the bindings take them."""
    return [column.astype(np.int64) if (name, i) in WHOLE else column for i, column in enumerate(made)]


def pointers(arrays):
    return (ctypes.c_void_p * len(arrays))(*(array.ctypes.data for array in arrays))


class PlainLoops:
    def __init__(self):
        made = BUILD / ("loops" + sysconfig.get_config_var("SHLIB_SUFFIX"))
        pixman = subprocess.run(["pkg-config", "--libs", "pixman-1"], check=True, capture_output=True, text=True)
        subprocess.run(["g++", "-std=c++20", "-O3", "-ffp-contract=off", "-shared", "-fPIC", f"-I{ROOT / 'include'}",
                        f"-I{LIBRARY / 'include'}", HERE / "loops.cpp", "-o", made, LIBRARY / "src" / "libbasalt.a",
                        *pixman.stdout.split()], check=True)
        self._loops = ctypes.CDLL(made)
        self._loops.run_loop.restype = ctypes.c_bool

    def run(self, name, made, out=None):
        out = [np.empty(len(made[0])) for _ in range(FUNCTIONS[name][1])] if out is None else out
        assert self._loops.run_loop(name.encode(), ctypes.c_size_t(len(made[0])), pointers(made), pointers(out))
        return out

    def in_polygon(self, north, east, outline, inside):
        self._loops.in_polygon_loop(ctypes.c_size_t(len(north)), pointers([north, east]),
                                    ctypes.c_size_t(len(outline)), ctypes.c_void_p(outline.ctypes.data),
                                    ctypes.c_void_p(inside.ctypes.data))
