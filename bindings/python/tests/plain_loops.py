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
NEAR, AROUND = (-1e-3, 1e-3), (-10.0, 10.0)  # where some of many points are equal, and some lines cross
EARTH, VARIANCE = (-7e6, 7e6), (-1.0, 1.0)
FUNCTIONS = {
    "horizontal_distance": ([METRES] * 4, 1),
    "horizontal_distance_squared": ([METRES] * 4, 1),
    "height_difference": ([METRES] * 2, 1),
    "slope_distance": ([METRES] * 6, 1),
    "points_equal": ([NEAR] * 6, 1),
    "distances_equal": ([NEAR] * 2, 1),
    "midpoint": ([METRES] * 6, 3),
    "grid_bearing": ([METRES] * 4, 1),
    "slope_angle": ([METRES] * 6, 1),
    "grade": ([METRES] * 6, 1),
    "triangle_area": ([METRES] * 6, 1),
    "normalise_bearing": ([(-60.0, 60.0)], 1),
    "divergence": ([TURN] * 2, 1),
    "divergence_of_lines": ([METRES] * 8, 1),
    "bisected_bearing": ([TURN] * 2, 1),
    "bearing_intersection": ([AROUND] * 4 + [TURN] * 2, 2),
    "on_line": ([AROUND] * 6 + [(0.0, 5.0)], 1),
    "lines_cross": ([AROUND] * 8, 1),
    "vector_distance": ([METRES] * 6, 1),
    "vector_length": ([METRES] * 3, 1),
    "vector_bearing": ([METRES] * 2, 1),
    "vector_slope_angle": ([METRES] * 3, 1),
    "vector_slope_angle_along_x": ([METRES] * 2, 1),
    "vector_slope_angle_along_y": ([METRES] * 2, 1),
    "arc_length": ([TURN, (-1e3, 1e3)], 1),
    "arc_angle": ([METRES, (-1e3, 1e3)], 1),
    "arc_half_chord": ([(0.0, 1e3), (0.0, 1e3)], 1),
    "spiral_deflection": ([(-10.0, 300.0), (1e4, 1e6)], 1),
    "spiral_deltas": ([(-100.0, 200.0), (1e4, 1e6), (1e-9, 1e-3)], 2),
    "follow": ([METRES] * 3 + [TURN, (0.0, 1e4), (-1.5, 1.5)], 3),
    "follow_grade": ([METRES] * 3 + [TURN, (0.0, 1e4), (-2.0, 2.0)], 3),
    "follow_height_change": ([METRES] * 3 + [TURN, (0.0, 1e4), (-50.0, 50.0)], 3),
    "first_face": ([TURN, (0.0, 6.2)], 2),
    "reduce_observation": ([TURN, (0.0, 6.2), (0.0, 1e3)] + [METRES] * 3 + [(-2.0, 2.0), (0.999, 1.001)], 3),
    "calculate_observation": ([METRES] * 6 + [(1.0, 2.0)] * 2 + [(0.999, 1.001)], 3),
    "llh_to_xyz": ([LATITUDE, LONGITUDE, (-100.0, 9e3)], 3),
    "xyz_to_llh": ([EARTH] * 3, 3),
    "xyz_to_local": ([EARTH] * 6, 3),
    "curvature_radii": ([LATITUDE], 2),
    "llh_equal": ([(-1e-10, 1e-10)] * 2 + [NEAR] + [(-1e-10, 1e-10)] * 2 + [NEAR], 1),
    "covariance_to_llh": ([EARTH] * 3 + [VARIANCE] * 6, 6),
    "covariance_to_neu": ([EARTH] * 3 + [VARIANCE] * 6, 6),
    "direct": ([LATITUDE, LONGITUDE, TURN, (0.0, 1e6)], 3),
    "great_circle_distance": ([LATITUDE, LONGITUDE] * 2, 1),
    "great_circle_bearing": ([LATITUDE, LONGITUDE] * 2, 1),
    "cross_track": ([(0.8, 0.81), (0.1, 0.11)] * 3, 1),
    "date_to_mjd": ([(1858.0, 65536.0), (1.0, 13.0), (1.0, 32.0)], 1),
    "mjd_to_date": ([(0.0, 6e8)], 4),
    "mjd_to_gps": ([(44244.0, 80000.0), (0.0, 86400.0)], 2),
    "gps_to_mjd": ([(0.0, 65536.0), (0.0, 604800.0)], 1),
    "calendar_to_java_time": ([(1970.0, 30000.0), (1.0, 13.0), (1.0, 29.0), (0.0, 24.0), (0.0, 60.0), (0.0, 60.0),
                               (0.0, 1000.0)], 1),
    "java_time_to_calendar": ([(0.0, 8e14)], 8),
    "degrees_to_radians": ([(-720.0, 720.0)], 1),
    "factorial": ([(0.0, 180.0)], 1),
    "radians_to_dms": ([TURN], 3),
    "dms_to_radians": ([(-360.0, 360.0), (0.0, 60.0), (0.0, 60.0)], 1),
    "metres_to_feet_inches": ([(-1e4, 1e4), (0.0, 129.0)], 5),
    "feet_inches_to_metres": ([(-1e4, 1e4), (0.0, 12.0), (0.0, 64.0), (0.0, 65.0)], 1),
}
# columns in that are whole numbers
WHOLE = {"date_to_mjd": {0, 1, 2}, "mjd_to_date": {0}, "mjd_to_gps": {0}, "gps_to_mjd": {0},
         "calendar_to_java_time": set(range(7)), "java_time_to_calendar": {0}, "factorial": {0},
         "dms_to_radians": {0, 1}, "metres_to_feet_inches": {1}, "feet_inches_to_metres": {0, 2, 3}}
SIX_AT_ONCE = {"covariance_to_llh", "covariance_to_neu"}  # what follows the position is one argument


def columns(name, count, seed=1):
    """Random columns for a function, with whole numbers where it wants them."""
    random = np.random.default_rng(seed)
    made = [random.uniform(least, greatest, count) for least, greatest in FUNCTIONS[name][0]]
    return [np.floor(column) if i in WHOLE.get(name, ()) else column for i, column in enumerate(made)]


def arguments(name, made):
    """The same columns as the bindings take them."""
    if name in SIX_AT_ONCE:
        return [*made[:3], np.stack(made[3:], axis=-1)]
    return [column.astype(np.int64) if i in WHOLE.get(name, ()) else column for i, column in enumerate(made)]


def pointers(arrays):
    return (ctypes.c_void_p * len(arrays))(*(array.ctypes.data for array in arrays))


class PlainLoops:
    def __init__(self):
        made = BUILD / ("loops" + sysconfig.get_config_var("SHLIB_SUFFIX"))
        pixman = subprocess.run(["pkg-config", "--libs", "pixman-1"], check=True, capture_output=True, text=True)
        subprocess.run(["g++", "-std=c++20", "-O3", "-ffp-contract=off", "-shared", "-fPIC", f"-I{ROOT / 'include'}",
                        f"-I{LIBRARY / 'include'}", *sorted(HERE.glob("*loops.cpp")), "-o", made,
                        LIBRARY / "src" / "libbasalt.a", *pixman.stdout.split()], check=True)
        self._loops = ctypes.CDLL(made)
        self._loops.run_loop.restype = self._loops.run_outline_loop.restype = ctypes.c_bool

    def run(self, name, made, out=None):
        out = [np.empty(len(made[0])) for _ in range(FUNCTIONS[name][1])] if out is None else out
        assert self._loops.run_loop(name.encode(), ctypes.c_size_t(len(made[0])), pointers(made), pointers(out))
        return out

    def outline(self, name, north, east, outline, inside, tolerance=0.0):
        assert self._loops.run_outline_loop(
            name.encode(), ctypes.c_size_t(len(north)), pointers([north, east]), ctypes.c_size_t(len(outline)),
            ctypes.c_void_p(outline.ctypes.data), ctypes.c_double(tolerance), ctypes.c_void_p(inside.ctypes.data))
