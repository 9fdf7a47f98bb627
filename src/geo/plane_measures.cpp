#include <cmath>

#include "basalt/geo/plane.h"
#include "src/geo/constants.h"
#include "src/geo/directions.h"
#include "src/geo/elementary/elementary.h"

using basalt::is_null;
using namespace basalt::geo;

double geo_normalised_bearing(double angle) {
    if (is_null(angle) || angle > REDUCTION_LIMIT || angle < -REDUCTION_LIMIT) {
        return angle;
    }
    return to_one_turn(angle);
}

double geo_horz_dist(const geo_nee& a, const geo_nee& b) {
    return std::sqrt(geo_horz_distSq(a, b));
}

double geo_horz_distSq(const geo_nee& a, const geo_nee& b) {
    const double east = a.east - b.east;
    const double north = a.north - b.north;
    return east * east + north * north;
}

double geo_vert_dist(const geo_nee& from, const geo_nee& to) {
    return to.elevation - from.elevation;
}

double geo_slope_dist(const geo_nee& a, const geo_nee& b) {
    const double north = a.north - b.north;
    const double east = a.east - b.east;
    const double elevation = a.elevation - b.elevation;
    return std::sqrt(north * north + east * east + elevation * elevation);
}

int nee_equal(const geo_nee& a, const geo_nee& b) {
    return std::abs(a.north - b.north) < EQUALITY_TOLERANCE &&
           std::abs(a.east - b.east) < EQUALITY_TOLERANCE &&
           std::abs(a.elevation - b.elevation) < EQUALITY_TOLERANCE;
}

bool geo_dist_equal(double a, double b) {
    return (is_null(a) && is_null(b)) || std::abs(a - b) < EQUALITY_TOLERANCE;
}

double geo_grid_bearing(const geo_nee& from, const geo_nee& to) {
    return grid_bearing(to.north - from.north, to.east - from.east);
}

double geo_gradient(const geo_nee& from, const geo_nee& to) {
    const double run = geo_horz_dist(from, to);
    const double rise = geo_vert_dist(from, to);
    if (run < VERTICAL_RUN) {
        return rise > 0.0 ? HALF_PI : -HALF_PI;
    }
    return elementary::atan(rise / run);
}

double geo_gradient2(const geo_nee& from, const geo_nee& to) {
    const double run = geo_horz_dist(from, to);
    const double rise = geo_vert_dist(from, to);
    if (run < VERTICAL_RUN) {
        return rise > 0.0 ? GEO_INFINITY : -GEO_INFINITY;
    }
    return rise / run;
}

double geo_grid_divergence(double bearing1, double bearing2) {
    if (is_null(bearing1) || is_null(bearing2)) {
        return GEO_NULL;
    }
    return shorter_turn(geo_normalised_bearing(bearing1 - bearing2));
}

double geo_grid_divergence(const geo_nee& a1, const geo_nee& a2, const geo_nee& b1, const geo_nee& b2) {
    return geo_grid_divergence(geo_grid_bearing(a1, a2), geo_grid_bearing(b1, b2));
}

double geo_bisected_bearing(double bearing1, double bearing2) {
    double turn = geo_normalised_bearing(bearing2 - bearing1);
    if (turn > PI) {
        turn -= TWO_PI;
    }
    return geo_normalised_bearing(bearing1 + turn * 0.5);
}

double geo_vector_length(geo_vector& a, geo_vector& b) {
    const double x = a.x - b.x;
    const double y = a.y - b.y;
    const double z = a.z - b.z;
    return std::sqrt(x * x + y * y + z * z);
}

double geo_vector_len(geo_vector& v) {
    return std::sqrt(v.x * v.x + v.y * v.y + v.z * v.z);
}

double geo_vector_direction(geo_vector& v) {
    return bearing_of(v.y, v.x);
}

namespace {

/// Angle of slope over a run; vertical for a run that is too short, negative or NaN.
double slope_angle(double rise, double run) {
    if (run > VERTICAL_RUN) {
        return elementary::atan2(rise, run);
    }
    return rise >= 0.0 ? HALF_PI : -HALF_PI;
}

}  // namespace

double geo_vector_gradient(geo_vector& v) {
    return slope_angle(v.z, std::sqrt(v.x * v.x + v.y * v.y));
}

double geo_vector_x_component_gradient(geo_vector& v) {
    return slope_angle(v.z, v.x);
}

double geo_vector_y_component_gradient(geo_vector& v) {
    return slope_angle(v.z, v.y);
}

geo_vector& geo_vector_reverse(geo_vector& v) {
    v.x = -v.x;
    v.y = -v.y;
    v.z = -v.z;
    return v;
}

void geo_vector_add(geo_vector& a, geo_vector& b, geo_vector& sum) {
    sum = {a.x + b.x, a.y + b.y, a.z + b.z};
}

void geo_grid_centroid(const geo_nee& a, const geo_nee& b, geo_nee& out) {
    // `out` may be a or b.
    geo_nee middle = {GEO_NULL, GEO_NULL, GEO_NULL};
    if (!is_null(a.east) && !is_null(a.north) && !is_null(b.east) && !is_null(b.north)) {
        middle.east = (a.east + b.east) * 0.5;
        middle.north = (a.north + b.north) * 0.5;
        if (!is_null(a.elevation) && !is_null(b.elevation)) {
            middle.elevation = (a.elevation + b.elevation) * 0.5;
        }
    }
    out = middle;
}

double geo_triangle_area(const geo_nee& a, const geo_nee& b, const geo_nee& c) {
    return std::abs((a.east - b.east) * (a.north - c.north) - (a.east - c.east) * (a.north - b.north)) * 0.5;
}
