"""The extension module: universal functions of NumPy, batches of a sparse array, paths and hexadecimal text."""
import os
from collections.abc import Callable

import numpy as np
import numpy.typing as npt

_Path = str | os.PathLike[str]

VERSION: str
GEO_NULL: float
GEO_INFINITY: float

_calculate_observation: np.ufunc
_frame_llh_to_local: np.ufunc
_frame_local_to_llh: np.ufunc
_frame_local_to_xyz: np.ufunc
_frame_xyz_to_local: np.ufunc
_is_frame_origin: np.ufunc
_reduce_observation: np.ufunc
_spiral_deltas: np.ufunc
_xyz_to_llh: np.ufunc
arc_angle: np.ufunc
arc_half_chord: np.ufunc
arc_length: np.ufunc
bearing_intersection: np.ufunc
bisected_bearing: np.ufunc
calendar_to_java_time: np.ufunc
covariance_to_llh: np.ufunc
covariance_to_neu: np.ufunc
cross_track: np.ufunc
curvature_radii: np.ufunc
date_to_mjd: np.ufunc
degrees_to_radians: np.ufunc
direct: np.ufunc
distances_equal: np.ufunc
divergence: np.ufunc
divergence_of_lines: np.ufunc
dms_to_radians: np.ufunc
factorial: np.ufunc
feet_inches_to_metres: np.ufunc
first_face: np.ufunc
follow: np.ufunc
follow_grade: np.ufunc
follow_height_change: np.ufunc
geodesic_inverse: np.ufunc
gps_to_mjd: np.ufunc
grade: np.ufunc
great_circle_bearing: np.ufunc
great_circle_distance: np.ufunc
grid_bearing: np.ufunc
height_difference: np.ufunc
horizontal_distance: np.ufunc
horizontal_distance_squared: np.ufunc
in_polygon: np.ufunc
in_polygon_or_near: np.ufunc
java_time_to_calendar: np.ufunc
lines_cross: np.ufunc
llh_equal: np.ufunc
llh_to_xyz: np.ufunc
metres_to_feet_inches: np.ufunc
midpoint: np.ufunc
mjd_to_date: np.ufunc
mjd_to_gps: np.ufunc
normalise_bearing: np.ufunc
on_line: np.ufunc
on_polyline: np.ufunc
points_equal: np.ufunc
polygon_area: np.ufunc
polygon_perimeter: np.ufunc
radians_to_dms: np.ufunc
slope_angle: np.ufunc
slope_distance: np.ufunc
spiral_deflection: np.ufunc
triangle_area: np.ufunc
vector_bearing: np.ufunc
vector_distance: np.ufunc
vector_length: np.ufunc
vector_slope_angle: np.ufunc
vector_slope_angle_along_x: np.ufunc
vector_slope_angle_along_y: np.ufunc
xyz_to_local: np.ufunc

_Numbers = npt.NDArray[np.float64]

def _prepared_polygon(norths: _Numbers, easts: _Numbers) -> tuple[np.ufunc, np.ufunc]: ...
def current_java_time() -> int: ...
def format_angle(radians: float, decimals: int = 0, style: str = "sign") -> str: ...
def parse_angle(text: str) -> float: ...

def split_path(path: _Path) -> tuple[str, str, str, str]: ...
def combine_path(first: _Path, second: _Path) -> str: ...
def set_extension(path: _Path, extension: str) -> str: ...
def files_in_directory(directory: _Path, pattern: str) -> list[str]: ...
def bytes_to_hex(bytes: bytes) -> str: ...
def hex_to_bytes(text: str) -> bytes: ...

_Cells = npt.NDArray[np.int32]
_Bytes = npt.NDArray[np.uint8]
_Flags = npt.NDArray[np.bool_]

class SparseBytes:
    def __init__(self, element_size: int, block_side: int, elements_per_chunk: int) -> None: ...
    def insert(self, x: _Cells, y: _Cells, elements: _Bytes) -> None: ...
    def find(self, x: _Cells, y: _Cells) -> tuple[_Bytes, _Flags]: ...
    def remove(self, x: _Cells, y: _Cells) -> _Flags: ...
    def update(self, x: _Cells, y: _Cells, change: Callable[[_Bytes, _Flags], _Bytes]) -> None: ...
    def insert_rows(self, x: int, y: int, columns: int, elements: _Bytes) -> None: ...
    def copy_rows(self, x: int, y: int, columns: int, elements: _Bytes, found: _Flags) -> None: ...
    def remove_window(self, min_x: int, min_y: int, max_x: int, max_y: int) -> int: ...
    def size(self) -> int: ...
    def clear(self) -> None: ...
    def select(self, min_x: int, min_y: int, max_x: int, max_y: int) -> tuple[_Cells, _Cells, _Bytes]: ...
    def all(self) -> tuple[_Cells, _Cells, _Bytes]: ...
