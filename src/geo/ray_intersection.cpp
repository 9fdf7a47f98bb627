#include <cmath>

#include "basalt/geo/plane.h"
#include "src/geo/constants.h"
#include "src/geo/elementary/elementary.h"

using namespace basalt::geo;

namespace {

/// Whether a direction, anticlockwise from east, runs along the north axis, where its tangent overflows.
bool is_along_north_axis(double direction) {
    return std::abs(direction - HALF_PI) < RAY_TOLERANCE ||
           std::abs(direction - HALF_PI - PI) < RAY_TOLERANCE;
}

/// Intersection of the lines through p1 and p2 in directions a1 and a2, not parallel.
geo_nee meet_of_lines(const geo_nee& p1, const geo_nee& p2, double a1, double a2) {
    if (is_along_north_axis(a1)) {
        return {elementary::tan(a2) * (p1.east - p2.east) + p2.north, p1.east, GEO_NULL};
    }
    if (is_along_north_axis(a2)) {
        return {elementary::tan(a1) * (p2.east - p1.east) + p1.north, p2.east, GEO_NULL};
    }
    const double t1 = elementary::tan(a1);
    const double t2 = elementary::tan(a2);
    const double east = (p1.north - t1 * p1.east + t2 * p2.east - p2.north) / (t2 - t1);
    const double north = (t2 * p1.north - t1 * t2 * p1.east + t2 * t1 * p2.east - t1 * p2.north) / (t2 - t1);
    return {north, east, GEO_NULL};
}

bool is_ahead(const geo_nee& start, double direction, const geo_nee& target) {
    const double bearing = elementary::atan2(target.north - start.north, target.east - start.east);
    return geo_grid_divergence(direction, bearing) <= HALF_PI;
}

bool is_at(const geo_nee& start, const geo_nee& target) {
    return std::abs(target.north - start.north) < RAY_TOLERANCE &&
           std::abs(target.east - start.east) < RAY_TOLERANCE;
}

}  // namespace

int geo_grid_bb_intersect(const geo_nee& p1, const geo_nee& p2, double bearing1, double bearing2,
                          geo_nee& out) {
    // Written last: `out` may be p1 or p2.
    geo_nee result = {GEO_NULL, GEO_NULL, GEO_NULL};
    int met = 0;
    const double a1 = geo_normalised_bearing(HALF_PI - bearing1);
    const double a2 = geo_normalised_bearing(HALF_PI - bearing2);
    const double divergence = geo_grid_divergence(a1, a2);
    if (!(divergence < RAY_TOLERANCE || std::abs(divergence - PI) < RAY_TOLERANCE)) {
        const geo_nee meet = meet_of_lines(p1, p2, a1, a2);
        if ((is_ahead(p1, a1, meet) && is_ahead(p2, a2, meet)) || is_at(p1, meet) || is_at(p2, meet)) {
            result = meet;
            met = 1;
        }
    }
    out = result;
    return met;
}
