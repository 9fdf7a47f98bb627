// The predicates as slow, obvious loops to compare the library with, and a generator that gives the same
// numbers on every compiler.
#ifndef BASALT_TESTS_GEO_PLAIN_FORMS_H
#define BASALT_TESTS_GEO_PLAIN_FORMS_H

#include <cmath>
#include <cstddef>
#include <cstdint>
#include <limits>
#include <numbers>
#include <vector>

#include "basalt/geo.h"
#include "src/geo/elementary/elementary.h"

namespace plain {

namespace elementary = basalt::geo::elementary;  // ties within the last place follow its bits

inline constexpr double PI = std::numbers::pi;
inline constexpr double INF = std::numeric_limits<double>::infinity();
inline constexpr double NOT_A_NUMBER = std::numeric_limits<double>::quiet_NaN();

// Whether an edge touches the point, or it is inside by the crossings of the line to the east.
template <class Touches>
int in_polygon(int n, const geo_nee* polygon, const geo_nee& p, Touches touches) {
    int inside = 0;
    for (int i = 0, j = n - 1; i < n; j = i++) {
        const geo_nee& vi = polygon[i];
        const geo_nee& vj = polygon[j];
        if (touches(vi, vj)) {
            return 1;
        }
        if ((vi.north <= p.north && p.north < vj.north) || (vj.north <= p.north && p.north < vi.north)) {
            const double crossing =
                (vj.east - vi.east) * (p.north - vi.north) / (vj.north - vi.north) + vi.east;
            inside ^= crossing > p.east ? 1 : 0;
        }
    }
    return inside;
}

inline int point_in_poly(int n, const geo_nee* polygon, const geo_nee& p) {
    return in_polygon(n, polygon, p, [&](const geo_nee& vertex, const geo_nee&) {
        return p.east == vertex.east && p.north == vertex.north;
    });
}

inline int point_on_line(const geo_nee& a, const geo_nee& b, const geo_nee& p, double tolerance) {
    const double pi = 3.141592653589793;
    const double theta = geo_normalised_bearing(geo_grid_bearing(a, b) - geo_grid_bearing(a, p));
    const double d = geo_horz_dist(a, p);
    const double along = elementary::cos(theta > pi ? 6.283185307179586 - theta : theta) * d;
    if (along < -tolerance || along > geo_horz_dist(a, b) + tolerance) {
        return 0;
    }
    const double offset = std::fabs(elementary::sin(theta > pi ? theta - 6.283185307179586 : theta) * d);
    return offset <= tolerance ? 1 : 0;
}

inline int point_in_poly_2(int n, const geo_nee* polygon, const geo_nee& p, double tolerance) {
    return in_polygon(n, polygon, p, [&](const geo_nee& from, const geo_nee& to) {
        return point_on_line(from, to, p, tolerance) == 1;
    });
}

inline int point_on_polyline(int n, const geo_nee* v, const geo_nee& p, double tolerance) {
    const auto square = [](const geo_nee& a, const geo_nee& b) {
        return (a.north - b.north) * (a.north - b.north) + (a.east - b.east) * (a.east - b.east);
    };
    for (int i = 0; i < n; ++i) {
        const geo_nee& a = v[i];
        const geo_nee& b = v[(i + 1) % n];
        const double length2 = square(a, b);
        const double dist =
            std::fabs((b.north - p.north) * (a.east - p.east) - (b.east - p.east) * (a.north - p.north)) /
            std::sqrt(length2);
        const double reach2 = length2 + tolerance * tolerance;
        if ((p.east == a.east && p.north == a.north) || (p.east == b.east && p.north == b.north) ||
            (dist < tolerance && square(a, p) < reach2 && square(b, p) < reach2)) {
            return 1;
        }
    }
    return 0;
}

inline int lines_cross(const geo_nee& p1, const geo_nee& p2, const geo_nee& q1, const geo_nee& q2) {
    const auto side = [](const geo_nee& a, const geo_nee& b, const geo_nee& x) {
        return (b.east - a.east) * x.north - (b.north - a.north) * x.east;
    };
    const auto parts = [&](const geo_nee& a, const geo_nee& b, const geo_nee& c, const geo_nee& d) {
        return (side(a, b, a) > side(a, b, c)) != (side(a, b, a) > side(a, b, d));
    };
    return parts(p1, p2, q1, q2) && parts(q1, q2, p1, p2) ? 1 : 0;
}

/// Knuth's MMIX generator; the low bits are poor, so the high ones are used.
class Random {
public:
    explicit Random(std::uint64_t seed) : m_state(seed) {}

    std::uint32_t bits() {
        m_state = m_state * 6364136223846793005U + 1442695040888963407U;
        return static_cast<std::uint32_t>(m_state >> 32);
    }
    int below(int n) { return static_cast<int>(bits() % static_cast<std::uint32_t>(n)); }
    /// In [low, high); exact steps of 2^-32 of the range.
    double real(double low, double high) { return low + (high - low) * (bits() * 0x1p-32); }

private:
    std::uint64_t m_state;
};

}  // namespace plain

#endif
