"""Plane geometry, observations, the WGS84 ellipsoid.

Angles are radians, bearings clockwise from north, lengths metres. Components are separate arrays in the order north,
east, elevation; latitude, longitude, height; x, y, z. Most functions are NumPy universal functions: they broadcast,
read arrays where they stand, take out= and where=, and let other threads run. A result that the library does not set
is NaN; GEO_NULL, a field never set, stays GEO_NULL, and GEO_INFINITY likewise.
"""
import numpy as np

from ._basalt import (GEO_INFINITY, GEO_NULL, _calculate_observation, _frame_llh_to_local, _frame_local_to_llh,
                      _frame_local_to_xyz, _frame_xyz_to_local, _is_frame_origin, _prepared_polygon,
                      _reduce_observation, _spiral_deltas, _xyz_to_llh, arc_angle, arc_half_chord, arc_length,
                      bearing_intersection, bisected_bearing, covariance_to_llh, covariance_to_neu, cross_track,
                      curvature_radii, direct, distances_equal, divergence, divergence_of_lines, first_face, follow,
                      follow_grade, follow_height_change, geodesic_inverse, grade, great_circle_bearing,
                      great_circle_distance, grid_bearing, height_difference, horizontal_distance,
                      horizontal_distance_squared, in_polygon, in_polygon_or_near, lines_cross, llh_equal, llh_to_xyz,
                      midpoint, normalise_bearing, on_line, on_polyline, points_equal, polygon_area, polygon_perimeter,
                      slope_angle, slope_distance, spiral_deflection, triangle_area, vector_bearing, vector_distance,
                      vector_length, vector_slope_angle, vector_slope_angle_along_x, vector_slope_angle_along_y,
                      xyz_to_local)

__all__ = ["GEO_INFINITY", "GEO_NULL", "LocalFrame", "PreparedPolygon", "arc_angle", "arc_half_chord", "arc_length",
           "bearing_intersection", "bisected_bearing", "calculate_observation", "covariance_to_llh",
           "covariance_to_neu", "cross_track", "curvature_radii", "direct", "distances_equal", "divergence",
           "divergence_of_lines", "first_face", "follow", "follow_grade", "follow_height_change", "geodesic_inverse",
           "grade", "great_circle_bearing", "great_circle_distance", "grid_bearing", "height_difference",
           "horizontal_distance", "horizontal_distance_squared", "in_polygon", "in_polygon_or_near", "lines_cross",
           "llh_equal", "llh_to_xyz", "midpoint", "normalise_bearing", "on_line", "on_polyline", "points_equal",
           "polygon_area", "polygon_perimeter", "reduce_observation", "slope_angle", "slope_distance",
           "spiral_deflection", "spiral_deltas", "triangle_area", "vector_bearing", "vector_distance", "vector_length",
           "vector_slope_angle", "vector_slope_angle_along_x", "vector_slope_angle_along_y", "xyz_to_llh",
           "xyz_to_local"]


def xyz_to_llh(x, y, z, tolerance=5e-10, **options):
    """(latitude, longitude, height) of Cartesian points; NaN near the earth's centre and for NaN (_xyz2llh).

    x, y, z and height in metres, angles in radians. The latitude has settled when two passes agree within the
    tolerance, radians.
    """
    return _xyz_to_llh(x, y, z, tolerance, **options)


def reduce_observation(horizontal, vertical, distance, north, east, elevation, height_offset=0.0, scale_factor=1.0,
                       **options):
    """(north, east, elevation) of what a station at the given point observes (geo_reduce_obs).

    horizontal and vertical in radians, the latter from the zenith; all else in metres. The height offset is that of the
    instrument less that of the target; the scale factor is grid over ground. All GEO_NULL where a field of the
    observation is.
    """
    return _reduce_observation(horizontal, vertical, distance, north, east, elevation, height_offset, scale_factor,
                               **options)


def calculate_observation(north1, east1, elevation1, north2, east2, elevation2, height1=0.0, height2=0.0,
                          scale_factor=1.0, **options):
    """(horizontal, vertical, distance) from one point to another (geo_calc_obs); NaN where a field is GEO_NULL.

    Angles in radians, vertical from the zenith; all else in metres. height1 and height2 are those of instrument and
    target. The scale factor multiplies the grid distance: the reciprocal of reduce_observation's undoes it.
    """
    return _calculate_observation(north1, east1, elevation1, height1, north2, east2, elevation2, height2, scale_factor,
                                  **options)


def spiral_deltas(length, spiral_constant, tolerance=1e-6, **options):
    """(x, y) along and across the tangent after a length of spiral (geo_spiral_deltas).

    Length and result in metres. The constant is 2 R L, square metres; the tolerance ends the series, metres.
    """
    return _spiral_deltas(length, spiral_constant, tolerance, **options)


class PreparedPolygon:
    """A polygon prepared once for many points (basalt::PreparedPolygon).

    norths and easts of its vertices in metres, in either order, without a repeated closing vertex; they are copied.
    Any thread may test points at any time.
    """

    def __init__(self, norths, easts):
        self._contains, self._contains_or_near = _prepared_polygon(
            np.ascontiguousarray(norths, dtype=float), np.ascontiguousarray(easts, dtype=float))

    def contains(self, north, east, tolerance=None, **options):
        """Whether points lie inside, as in_polygon; with a tolerance in metres, as in_polygon_or_near."""
        if tolerance is None:
            return self._contains(north, east, **options)
        return self._contains_or_near(north, east, tolerance, **options)


class LocalFrame:
    """North, east and elevation in the plane that touches the ellipsoid below an origin (basalt::LocalFrame).

    The origin's latitude and longitude in radians, its height in metres. Points that cannot be converted, and
    all points of a frame that is not valid, become three GEO_NULL.
    """

    def __init__(self, latitude, longitude, height):
        self._origin = (float(latitude), float(longitude), float(height))

    def __repr__(self):
        return "LocalFrame({!r}, {!r}, {!r})".format(*self._origin)

    @property
    def valid(self):
        """Whether the origin is a place: not three zeros, NaN, infinite, or near the earth's centre."""
        return bool(_is_frame_origin(*self._origin))

    def llh_to_local(self, latitude, longitude, height, **options):
        """(north, east, elevation), metres, of geodetic points in radians and metres."""
        return _frame_llh_to_local(*self._origin, latitude, longitude, height, **options)

    def xyz_to_local(self, x, y, z, **options):
        """(north, east, elevation), metres, of Cartesian points in metres."""
        return _frame_xyz_to_local(*self._origin, x, y, z, **options)

    def local_to_llh(self, north, east, elevation, **options):
        """(latitude, longitude, height), radians and metres, of local points in metres."""
        return _frame_local_to_llh(*self._origin, north, east, elevation, **options)

    def local_to_xyz(self, north, east, elevation, **options):
        """(x, y, z), metres, of local points in metres."""
        return _frame_local_to_xyz(*self._origin, north, east, elevation, **options)
