/// @file
/// Plane measures and predicates. Common rules (units, bad input, threads): basalt/geo.h.
#ifndef BASALT_GEO_PLANE_H
#define BASALT_GEO_PLANE_H

#include "basalt/export.h"
#include "basalt/geo/records.h"

/// @name Plane measures
/// @{

/// Bearing in [0, 2 pi) of an angle, by adding or subtracting 2 pi.
/// @param angle radians, any sign
/// @return the normalised bearing. A negative angle so small that adding 2 pi rounds to 2 pi gives 0; -0
/// stays -0.
///
/// Bad input: #GEO_NULL, NaN and angles beyond +-100 are returned unchanged.
BASALT_API double geo_normalised_bearing(double angle);

/// Horizontal distance between two points: sqrt(de^2 + dn^2), metres, not negative.
/// Valid from 1e-150 to 1e150 m, where no square underflows or overflows.
BASALT_API double geo_horz_dist(const geo_nee& a, const geo_nee& b);

/// Square of the horizontal distance between two points: de^2 + dn^2, square metres.
BASALT_API double geo_horz_distSq(const geo_nee& a, const geo_nee& b);

/// Height difference, metres: positive when `to` is the higher point.
BASALT_API double geo_vert_dist(const geo_nee& from, const geo_nee& to);

/// Slope distance between two points: sqrt(dn^2 + de^2 + dh^2), metres, not negative.
BASALT_API double geo_slope_dist(const geo_nee& a, const geo_nee& b);

/// Whether two points are equal within 0.5 mm (strictly less) in each of north, east and elevation.
/// @return 1 or 0
///
/// Bad input: NaN, or the same infinity in both points, is not equal: 0.
BASALT_API int nee_equal(const geo_nee& a, const geo_nee& b);

/// Whether two distances, in metres, are equal within 0.5 mm (strictly less), or both are #GEO_NULL.
/// A single #GEO_NULL counts as its value, which is next to 0.
///
/// Bad input: as for nee_equal().
BASALT_API bool geo_dist_equal(double a, double b);

/// Bearing of the line between two points.
/// @return normalised bearing, radians in [0, 2 pi); 0 for coincident points
BASALT_API double geo_grid_bearing(const geo_nee& from, const geo_nee& to);

/// Angle of slope of the line between two points.
/// @return radians in [-pi/2, pi/2], positive uphill. When the points are less than 0.1 mm apart
/// horizontally: pi/2 if `to` is higher, else -pi/2 (at equal heights and for NaN heights too).
BASALT_API double geo_gradient(const geo_nee& from, const geo_nee& to);

/// Slope of the line between two points as height over horizontal distance.
/// @return ratio, positive uphill. When the points are less than 0.1 mm apart horizontally: #GEO_INFINITY if
/// `to` is higher, else -#GEO_INFINITY (at equal heights and for NaN heights too).
BASALT_API double geo_gradient2(const geo_nee& from, const geo_nee& to);

/// Angle between two directions.
/// @param bearing1 radians
/// @param bearing2 radians
/// @return radians in [0, pi]; the same for exchanged arguments to within rounding
///
/// Bad input: #GEO_NULL if either is. Bearings more than 100 apart are not reduced: with d = bearing1 -
/// bearing2 the result is 2 pi - d for d > 100 and d for d < -100, negative both; normalise such bearings
/// first.
BASALT_API double geo_grid_divergence(double bearing1, double bearing2);

/// Angle between the direction from a1 to a2 and that from b1 to b2.
/// @return radians in [0, pi]; a direction between coincident points counts as north
BASALT_API double geo_grid_divergence(const geo_nee& a1, const geo_nee& a2, const geo_nee& b1,
                                      const geo_nee& b2);

/// Bearing halfway along the smaller turn from bearing1 to bearing2; for opposite bearings, clockwise from
/// bearing1.
/// @param bearing1 radians
/// @param bearing2 radians
/// @return normalised bearing, radians in [0, 2 pi)
///
/// Bad input: bearings more than 100 apart are not reduced, so halfway is then not along the smaller turn,
/// and a result beyond +-100 is not normalised. #GEO_NULL counts as 0.
BASALT_API double geo_bisected_bearing(double bearing1, double bearing2);

/// Distance between the ends of two vectors, metres.
BASALT_API double geo_vector_length(geo_vector& a, geo_vector& b);

/// Length of a vector, metres.
BASALT_API double geo_vector_len(geo_vector& v);

/// Bearing of a local vector (x east, y north).
/// @return normalised bearing, radians in [0, 2 pi); for a vector without horizontal part 0, or pi when its y
/// is -0, as after geo_vector_reverse()
BASALT_API double geo_vector_direction(geo_vector& v);

/// Angle of slope of a local vector against its horizontal part.
/// @return radians in [-pi/2, pi/2], positive upwards. When the horizontal part is not longer than 0.1 mm, or
/// is NaN: pi/2 for z >= 0, else -pi/2 (for NaN too).
BASALT_API double geo_vector_gradient(geo_vector& v);

/// Angle of slope of a local vector seen along x.
/// @return radians in (-pi/2, pi/2), positive upwards. When x is not above 0.1 mm (any negative x, or NaN):
/// pi/2 for z >= 0, else -pi/2 (for NaN too).
BASALT_API double geo_vector_x_component_gradient(geo_vector& v);

/// Angle of slope of a local vector seen along y; as geo_vector_x_component_gradient() with y in place of x.
BASALT_API double geo_vector_y_component_gradient(geo_vector& v);

/// Reverses a vector in place: negates x, y and z.
/// @return the same record
BASALT_API geo_vector& geo_vector_reverse(geo_vector& v);

/// Sum of two vectors, component by component, into `sum`.
BASALT_API void geo_vector_add(geo_vector& a, geo_vector& b, geo_vector& sum);

/// @}
/// @name Vector measures of constants
/// The functions above for vectors that may not be written.
/// @{

/// As above.
inline double geo_vector_length(const geo_vector& a, const geo_vector& b) {
    geo_vector va = a;
    geo_vector vb = b;
    return geo_vector_length(va, vb);
}
/// As above.
inline double geo_vector_len(const geo_vector& v) {
    geo_vector copy = v;
    return geo_vector_len(copy);
}
/// As above.
inline double geo_vector_direction(const geo_vector& v) {
    geo_vector copy = v;
    return geo_vector_direction(copy);
}
/// As above.
inline double geo_vector_gradient(const geo_vector& v) {
    geo_vector copy = v;
    return geo_vector_gradient(copy);
}
/// As above.
inline double geo_vector_x_component_gradient(const geo_vector& v) {
    geo_vector copy = v;
    return geo_vector_x_component_gradient(copy);
}
/// As above.
inline double geo_vector_y_component_gradient(const geo_vector& v) {
    geo_vector copy = v;
    return geo_vector_y_component_gradient(copy);
}
/// As above.
inline void geo_vector_add(const geo_vector& a, const geo_vector& b, geo_vector& sum) {
    geo_vector va = a;
    geo_vector vb = b;
    geo_vector_add(va, vb, sum);
}
/// @}
/// @name More plane measures
/// @{

/// Midpoint of two points.
/// @param a one point
/// @param b the other
/// @param[out] out the midpoint. All three fields are #GEO_NULL when a north or east of either point is; the
/// elevation alone is when only an elevation is.
BASALT_API void geo_grid_centroid(const geo_nee& a, const geo_nee& b, geo_nee& out);

/// Area of a triangle in the plane of north and east, square metres, not negative.
BASALT_API double geo_triangle_area(const geo_nee& a, const geo_nee& b, const geo_nee& c);

/// @}
/// @name Polygon and line predicates
/// In the plane of north and east; elevations are not read. Polygons and chains are arrays of n vertices
/// without a repeated closing vertex. A count below 1 gives 0, and no pointer is followed.
/// @{

/// Whether a point lies in a polygon: even-odd rule, by a ray from the point towards increasing east.
/// @param n count of vertices; 1 and 2 enclose nothing but their vertices, to within rounding
/// @param polygon vertices in either order; the outline may cross or touch itself
/// @param point the point to test
/// @return 1 inside or exactly on a vertex, else 0. On an edge the rounding decides; use
/// geo_point_in_poly_2() where the outline belongs to the polygon.
///
/// Bad input: an edge with NaN in it is not crossed; a point with NaN is outside.
///
/// Source: M. Shimrat, "Algorithm 112: Position of point relative to polygon", CACM 5(8), 1962.
BASALT_API int geo_point_in_poly(int n, const geo_nee* polygon, const geo_nee* point);

/// Whether a point lies in a polygon or within a tolerance of its outline.
/// @param n count of vertices
/// @param polygon vertices in either order
/// @param point the point to test
/// @param tolerance width of the band along every edge, metres; its ends are square, as in
/// geo_point_on_line()
/// @return 1 inside or in the band, else 0
///
/// Bad input: with a negative or NaN tolerance only the crossings count (there is no exact vertex test here);
/// otherwise as geo_point_in_poly() and geo_point_on_line().
BASALT_API int geo_point_in_poly_2(int n, const geo_nee* polygon, const geo_nee* point, double tolerance);

/// Whether a point lies within a tolerance of the segment a-b: in the rectangle that reaches `tolerance`
/// beyond either end and to either side.
/// @param a start; when it equals b, the rectangle is a square along the grid
/// @param b end
/// @param point the point to test
/// @param tolerance metres; all bounds are inclusive. With 0, rounding misses most points on an oblique
/// segment: give at least a few units in the last place of the coordinates, 1e-6 m on national grids.
/// @return 1 or 0
///
/// Bad input: 0 for a negative or NaN tolerance and for NaN coordinates.
BASALT_API int geo_point_on_line(const geo_nee& a, const geo_nee& b, const geo_nee& point, double tolerance);

/// Whether a point lies within a tolerance of a closed chain of segments, the last of which runs from the
/// last vertex back to the first.
/// @param n count of vertices, and of segments
/// @param vertices the chain; of segments of length 0 only the ends count
/// @param point the point to test
/// @param tolerance metres, exclusive: distance to the line below it, and squared distance to both ends below
/// squared length plus squared tolerance. A vertex always matches exactly, whatever the tolerance.
/// @return 1 or 0
///
/// Bad input: with a negative or NaN tolerance only exact vertices match.
BASALT_API int geo_point_on_polyline(int n, const geo_nee* vertices, const geo_nee* point, double tolerance);

/// Whether segment p1-p2 crosses segment q1-q2, by the sides on which their ends lie.
/// @return 1 or 0. An end exactly on the other line counts to one fixed side of it, so a touch is a crossing
/// or not depending on the directions; collinear segments never cross.
///
/// Bad input: a segment of length 0 is not crossed; a NaN end counts as lying on the line.
BASALT_API int geo_lines_cross(const geo_nee& p1, const geo_nee& p2, const geo_nee& q1, const geo_nee& q2);

/// Intersection of two rays, each from a point along a bearing.
/// @param p1 start of ray 1
/// @param p2 start of ray 2
/// @param bearing1 radians; within [-98, 101], beyond which it is not reduced
/// @param bearing2 radians, likewise
/// @param[out] out the intersection; elevation #GEO_NULL. All #GEO_NULL when there is none.
/// @return 1 when the rays meet, or meet behind a start that is closer to the point than 4.8e-7 m on both
/// axes; 0 when they do not, or are within 0.1 arc-second of parallel or opposite
///
/// Bad input: a bearing that is not finite gives 0; so does a NaN coordinate, unless the lines meet at a
/// start.
BASALT_API int geo_grid_bb_intersect(const geo_nee& p1, const geo_nee& p2, double bearing1, double bearing2,
                                     geo_nee& out);

/// @}

#endif
