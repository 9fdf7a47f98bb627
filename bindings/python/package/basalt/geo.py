"""Plane geometry, observations, the WGS84 ellipsoid.

Angles are radians, bearings clockwise from north, lengths metres. Components are separate arrays in the order north,
east, elevation; latitude, longitude, height; x, y, z. Most functions are NumPy universal functions: they broadcast,
read arrays where they stand, take out= and where=, and let other threads run. A result that the library leaves
unformed is NaN; GEO_NULL, a field never set, stays what it is, and so does GEO_INFINITY.
"""
from ._basalt import (GEO_INFINITY, GEO_NULL, _calculate_observation, _reduce_observation, _spiral_deltas, _xyz_to_llh,
                      arc_angle, arc_half_chord, arc_length, bearing_intersection, bisected_bearing, covariance_to_llh,
                      covariance_to_neu, cross_track, curvature_radii, direct, distances_equal, divergence,
                      divergence_of_lines, first_face, follow, follow_grade, follow_height_change, grade,
                      great_circle_bearing, great_circle_distance, grid_bearing, height_difference,
                      horizontal_distance, horizontal_distance_squared, in_polygon, in_polygon_or_near, lines_cross,
                      llh_equal, llh_to_xyz, midpoint, normalise_bearing, on_line, on_polyline, points_equal,
                      slope_angle, slope_distance, spiral_deflection, triangle_area, vector_bearing, vector_distance,
                      vector_length, vector_slope_angle, vector_slope_angle_along_x, vector_slope_angle_along_y,
                      xyz_to_local)

__all__ = ["GEO_INFINITY", "GEO_NULL", "arc_angle", "arc_half_chord", "arc_length", "bearing_intersection",
           "bisected_bearing", "calculate_observation", "covariance_to_llh", "covariance_to_neu", "cross_track",
           "curvature_radii", "direct", "distances_equal", "divergence", "divergence_of_lines", "first_face", "follow",
           "follow_grade", "follow_height_change", "grade", "great_circle_bearing", "great_circle_distance",
           "grid_bearing", "height_difference", "horizontal_distance", "horizontal_distance_squared", "in_polygon",
           "in_polygon_or_near", "lines_cross", "llh_equal", "llh_to_xyz", "midpoint", "normalise_bearing", "on_line",
           "on_polyline", "points_equal", "reduce_observation", "slope_angle", "slope_distance", "spiral_deflection",
           "spiral_deltas", "triangle_area", "vector_bearing", "vector_distance", "vector_length",
           "vector_slope_angle", "vector_slope_angle_along_x", "vector_slope_angle_along_y", "xyz_to_llh",
           "xyz_to_local"]


def xyz_to_llh(x, y, z, tolerance=5e-10, **options):
    """(latitude, longitude, height) of Cartesian points; NaN near the earth's centre and for NaN (_xyz2llh).

    The latitude has settled when two passes agree within the tolerance, radians.
    """
    return _xyz_to_llh(x, y, z, tolerance, **options)


def reduce_observation(horizontal, vertical, distance, north, east, elevation, height_offset=0.0, scale_factor=1.0,
                       **options):
    """(north, east, elevation) of what a station at the given point observes (geo_reduce_obs).

    The height offset is that of the instrument less that of the target; the scale factor is grid over ground. All
    GEO_NULL where a field of the observation is.
    """
    return _reduce_observation(horizontal, vertical, distance, north, east, elevation, height_offset, scale_factor,
                               **options)


def calculate_observation(north1, east1, elevation1, north2, east2, elevation2, height1=0.0, height2=0.0,
                          scale_factor=1.0, **options):
    """(horizontal, vertical, distance) from one point to another (geo_calc_obs); NaN where a field is GEO_NULL.

    height1 and height2 are those of instrument and target. The scale factor multiplies the grid distance: the
    reciprocal of reduce_observation's undoes it.
    """
    return _calculate_observation(north1, east1, elevation1, height1, north2, east2, elevation2, height2, scale_factor,
                                  **options)


def spiral_deltas(length, spiral_constant, tolerance=1e-6, **options):
    """(x, y) along and across the tangent after a length of spiral (geo_spiral_deltas).

    The constant is 2 R L, square metres; the tolerance ends the series, metres.
    """
    return _spiral_deltas(length, spiral_constant, tolerance, **options)
