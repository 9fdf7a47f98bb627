#include <cmath>

#include "basalt/geo/plane.h"
#include "src/geo/directions.h"

using namespace basalt::geo;

int geo_point_on_line(const geo_nee& a, const geo_nee& b, const geo_nee& point, double tolerance) {
    return is_on_segment<double>({b.north - a.north, b.east - a.east},
                                 {point.north - a.north, point.east - a.east}, tolerance);
}

int geo_point_on_polyline(int n, const geo_nee* vertices, const geo_nee* point, double tolerance) {
    if (n < 1) {
        return 0;
    }
    const geo_nee p = *point;
    const double reach = tolerance * tolerance;
    for (int i = 0; i < n; ++i) {
        const geo_nee& a = vertices[i];
        const geo_nee& b = vertices[i + 1 < n ? i + 1 : 0];
        if ((p.east == a.east && p.north == a.north) || (p.east == b.east && p.north == b.north)) {
            return 1;
        }
        const double squared_length = geo_horz_distSq(a, b);
        // The ends first: far from them no root and division is needed.
        if (geo_horz_distSq(a, p) < squared_length + reach &&
            geo_horz_distSq(b, p) < squared_length + reach) {
            const double doubled_area =
                (b.north - p.north) * (a.east - p.east) - (b.east - p.east) * (a.north - p.north);
            if (std::abs(doubled_area) / std::sqrt(squared_length) < tolerance) {
                return 1;
            }
        }
    }
    return 0;
}

namespace {

/// Whether x lies on the open right-hand side of the directed line through `from` and `to`.
bool is_right_of(const geo_nee& from, const geo_nee& to, const geo_nee& x) {
    const double east = to.east - from.east;
    const double north = to.north - from.north;
    return east * from.north - north * from.east > east * x.north - north * x.east;
}

}  // namespace

int geo_lines_cross(const geo_nee& p1, const geo_nee& p2, const geo_nee& q1, const geo_nee& q2) {
    return is_right_of(p1, p2, q1) != is_right_of(p1, p2, q2) &&
           is_right_of(q1, q2, p1) != is_right_of(q1, q2, p2);
}
