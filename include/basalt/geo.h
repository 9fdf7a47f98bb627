/// @file
/// Survey geometry: coordinate records, plane measures and predicates.
#ifndef BASALT_GEO_H
#define BASALT_GEO_H

#include "basalt/export.h"

/// Grid point.
struct geo_nee {
    double north;      ///< grid northing, metres
    double east;       ///< grid easting, metres
    double elevation;  ///< height, metres
};

/// Geodetic point.
struct geo_llh {
    double latitude;   ///< radians, north positive
    double longitude;  ///< radians, east positive
    double height;     ///< ellipsoidal height, metres
};

/// Vector: earth-centred Cartesian, or local with x east, y north and z up; metres.
struct geo_vector {
    double x;
    double y;
    double z;
};

/// Observation.
struct geo_hvd {
    double horizontal;  ///< bearing, radians
    double vertical;    ///< zenith angle, radians: 0 overhead, pi/2 level
    double distance;    ///< slope distance, metres
};

/// No value: a field never set, or a result that cannot be formed. Compared by exact equality.
inline constexpr double GEO_NULL = 2e-308;
/// Infinite: the gradient ratio of a vertical line, the radius of a straight. Compared by exact equality.
inline constexpr double GEO_INFINITY = 2e100;

// Plane measures
BASALT_API double geo_normalised_bearing(double angle);
BASALT_API double geo_horz_dist(const geo_nee& a, const geo_nee& b);
BASALT_API double geo_horz_distSq(const geo_nee& a, const geo_nee& b);
BASALT_API double geo_vert_dist(const geo_nee& from, const geo_nee& to);
BASALT_API double geo_slope_dist(const geo_nee& a, const geo_nee& b);
BASALT_API int nee_equal(const geo_nee& a, const geo_nee& b);
BASALT_API bool geo_dist_equal(double a, double b);
BASALT_API double geo_grid_bearing(const geo_nee& from, const geo_nee& to);
BASALT_API double geo_gradient(const geo_nee& from, const geo_nee& to);
BASALT_API double geo_gradient2(const geo_nee& from, const geo_nee& to);
BASALT_API double geo_grid_divergence(double bearing1, double bearing2);
BASALT_API double geo_grid_divergence(const geo_nee& a1, const geo_nee& a2, const geo_nee& b1,
                                      const geo_nee& b2);
BASALT_API double geo_bisected_bearing(double bearing1, double bearing2);
BASALT_API double geo_vector_length(geo_vector& a, geo_vector& b);
BASALT_API double geo_vector_len(geo_vector& v);
BASALT_API double geo_vector_direction(geo_vector& v);
BASALT_API double geo_vector_gradient(geo_vector& v);
BASALT_API double geo_vector_x_component_gradient(geo_vector& v);
BASALT_API double geo_vector_y_component_gradient(geo_vector& v);
BASALT_API geo_vector& geo_vector_reverse(geo_vector& v);
BASALT_API void geo_vector_add(geo_vector& a, geo_vector& b, geo_vector& sum);
BASALT_API void geo_grid_centroid(const geo_nee& a, const geo_nee& b, geo_nee& out);
BASALT_API double geo_triangle_area(const geo_nee& a, const geo_nee& b, const geo_nee& c);

// Polygon and line predicates
BASALT_API int geo_point_in_poly(int n, const geo_nee* polygon, const geo_nee* point);
BASALT_API int geo_point_in_poly_2(int n, const geo_nee* polygon, const geo_nee* point, double tolerance);
BASALT_API int geo_point_on_line(const geo_nee& a, const geo_nee& b, const geo_nee& point, double tolerance);
BASALT_API int geo_point_on_polyline(int n, const geo_nee* vertices, const geo_nee* point, double tolerance);
BASALT_API int geo_lines_cross(const geo_nee& p1, const geo_nee& p2, const geo_nee& q1, const geo_nee& q2);
BASALT_API int geo_grid_bb_intersect(const geo_nee& p1, const geo_nee& p2, double bearing1, double bearing2,
                                     geo_nee& out);

#endif
