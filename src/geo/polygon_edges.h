/// @file
/// The two tests of a polygon's edges, each portable and with AVX2: which edges cross the ray from a point
/// towards east, and which may have the point in their tolerance band. Both forms have the same result for
/// every input. Edges run from vertex i - 1 to vertex i.
#ifndef BASALT_SRC_GEO_POLYGON_EDGES_H
#define BASALT_SRC_GEO_POLYGON_EDGES_H

#include <cmath>
#include <cstddef>

#include "basalt/geo/plane.h"

#if defined(__x86_64__)
#define BASALT_HAS_AVX2_FORM 1
#include <immintrin.h>
#else
#define BASALT_HAS_AVX2_FORM 0
#endif

namespace basalt::geo {

enum class VertexTest { NO, YES };

/// Divisor instead of the rise of a level edge; metres.
inline constexpr double LEVEL_EDGE_RISE = 1e-8;

/// Whether the edge from j to i straddles the point's northing (the lower end counts, the upper does not) and
/// passes east of the point. A level edge never straddles, so there is no division by 0.
inline bool crosses_east_of(const geo_nee& j, const geo_nee& i, const geo_nee& point) {
    const bool straddles = (i.north <= point.north && point.north < j.north) ||
                           (j.north <= point.north && point.north < i.north);
    return straddles &&
           (j.east - i.east) * (point.north - i.north) / (j.north - i.north) + i.east > point.east;
}

/// 1 when an odd number of edges crosses east of the point or, with VertexTest::YES, the point is a vertex.
/// n >= 1.
template <VertexTest TEST>
int crossing_parity_portable(int n, const geo_nee* polygon, const geo_nee& point) {
    int inside = 0;
    const geo_nee* j = polygon + (n - 1);
    for (const geo_nee* i = polygon; i != polygon + n; j = i++) {
        if (TEST == VertexTest::YES && i->north == point.north && i->east == point.east) {
            return 1;
        }
        inside ^= static_cast<int>(crosses_east_of(*j, *i, point));
    }
    return inside;
}

/// Bounds for the band of an edge. The exact test accepts a point only in the rectangle that reaches
/// `tolerance` beyond the edge, with rounding of some 1e-14 of edge and tolerance, and 1e-161 m where squares
/// underflow. A turned rectangle reaches at most sqrt(2) tolerances along either axis. The bounds are wider
/// than all of that, so the exact test would refuse every point outside.
inline constexpr double BAND_REACH = 1.5;
inline constexpr double BAND_ROUNDING = 1e-12;
inline constexpr double BAND_UNDERFLOW = 1e-150;

/// Fixed part of the margin around an edge's bounding box; the rest grows with the edge.
inline double band_reach(double tolerance) {
    return BAND_REACH * tolerance + BAND_UNDERFLOW;
}

/// Whether the band of edge a-b may hold the point. Differences are compared with the margin, since they keep
/// their relative accuracy far from the origin. With NaN anywhere the exact test refuses, so either result is
/// right; infinite edges and tolerances make the margin infinite or NaN, which keeps the edge.
inline bool may_be_in_band(const geo_nee& a, const geo_nee& b, const geo_nee& point, double reach) {
    const double margin = reach + BAND_ROUNDING * (std::abs(a.north - b.north) + std::abs(a.east - b.east));
    const double north_a = a.north - point.north;
    const double north_b = b.north - point.north;
    const double east_a = a.east - point.east;
    const double east_b = b.east - point.east;
    return !((north_a > margin && north_b > margin) || (north_a < -margin && north_b < -margin) ||
             (east_a > margin && east_b > margin) || (east_a < -margin && east_b < -margin));
}

/// Whether edge i - 1, i has the point in its band.
inline bool is_in_band(const geo_nee* i, const geo_nee& point, double tolerance) {
    return geo_point_on_line(i[0], i[-1], point, tolerance) == 1;
}

/// Whether the point lies in the band of an edge, the closing edge left out. tolerance >= 0.
inline bool is_in_a_band_portable(int n, const geo_nee* polygon, const geo_nee& point, double tolerance) {
    const double reach = band_reach(tolerance);
    for (int i = 1; i < n; ++i) {
        if (may_be_in_band(polygon[i - 1], polygon[i], point, reach) &&
            is_in_band(polygon + i, point, tolerance)) {
            return true;
        }
    }
    return false;
}

#if BASALT_HAS_AVX2_FORM

inline bool can_use_avx2() {
    return __builtin_cpu_supports("avx2") != 0;
}

#define BASALT_AVX2 [[gnu::target("avx2")]]
#define BASALT_AVX2_INLINE [[gnu::target("avx2"), gnu::always_inline]] inline

/// Four vertices.
struct Quad {
    __m256d north;
    __m256d east;
};

/// Loads the north and east of each vertex as a pair and never touches an elevation.
BASALT_AVX2_INLINE Quad load_quad(const geo_nee* v) {
    const __m256d even = _mm256_set_m128d(_mm_loadu_pd(&v[2].north), _mm_loadu_pd(&v[0].north));
    const __m256d odd = _mm256_set_m128d(_mm_loadu_pd(&v[3].north), _mm_loadu_pd(&v[1].north));
    return {_mm256_unpacklo_pd(even, odd), _mm256_unpackhi_pd(even, odd)};
}

BASALT_AVX2_INLINE unsigned lane_bits(__m256d mask) {
    return static_cast<unsigned>(_mm256_movemask_pd(mask));
}

/// crosses_east_of() of the four edges that end at vertices i[0] to i[3], a bit each.
BASALT_AVX2_INLINE unsigned cross_east_of(const geo_nee* i, const Quad& point) {
    const Quad a = load_quad(i - 1);
    const Quad b = load_quad(i);
    const __m256d straddles = _mm256_or_pd(_mm256_and_pd(_mm256_cmp_pd(b.north, point.north, _CMP_LE_OQ),
                                                         _mm256_cmp_pd(point.north, a.north, _CMP_LT_OQ)),
                                           _mm256_and_pd(_mm256_cmp_pd(a.north, point.north, _CMP_LE_OQ),
                                                         _mm256_cmp_pd(point.north, b.north, _CMP_LT_OQ)));
    // Level edges do not straddle, but a host may trap a division by zero.
    const __m256d rise = _mm256_blendv_pd(_mm256_sub_pd(a.north, b.north), _mm256_set1_pd(LEVEL_EDGE_RISE),
                                          _mm256_cmp_pd(a.north, b.north, _CMP_EQ_OQ));
    const __m256d run = _mm256_mul_pd(_mm256_sub_pd(a.east, b.east), _mm256_sub_pd(point.north, b.north));
    const __m256d crossing = _mm256_add_pd(_mm256_div_pd(run, rise), b.east);
    return lane_bits(_mm256_and_pd(straddles, _mm256_cmp_pd(crossing, point.east, _CMP_GT_OQ)));
}

/// State of crossing_parity_avx2() along the vertices.
struct Walk {
    unsigned not_above;  ///< whether the last vertex seen is at most as far north as the point
    unsigned crossings;  ///< parity of crossings, spread over four bits
    bool on_vertex;
};

/// Continues over 4 * QUADS vertices. Only edges whose ends differ in `not_above` can straddle; one branch a
/// step skips all others. Edges that end before vertex `fresh` of the first quad are not counted.
template <VertexTest TEST, int QUADS>
BASALT_AVX2_INLINE void step(Walk& walk, const geo_nee* vertices, const Quad& point, int fresh = 0) {
    unsigned not_above = 0;
    __m256d same = _mm256_setzero_pd();
    for (int q = 0; q < QUADS; ++q) {
        const Quad v = load_quad(vertices + std::ptrdiff_t{4} * q);
        not_above |= lane_bits(_mm256_cmp_pd(v.north, point.north, _CMP_LE_OQ)) << 4 * q;
        if (TEST == VertexTest::YES) {
            same = _mm256_or_pd(same, _mm256_and_pd(_mm256_cmp_pd(v.north, point.north, _CMP_EQ_OQ),
                                                    _mm256_cmp_pd(v.east, point.east, _CMP_EQ_OQ)));
        }
    }
    walk.on_vertex = TEST == VertexTest::YES && lane_bits(same) != 0;
    const unsigned counted = (1U << 4 * QUADS) - (1U << fresh);
    const unsigned ends = (not_above ^ (not_above << 1 | walk.not_above)) & counted;
    if (ends != 0) {
        for (int q = 0; q < QUADS; ++q) {
            if ((ends >> 4 * q & 0xF) != 0) {
                walk.crossings ^= cross_east_of(vertices + std::ptrdiff_t{4} * q, point) & counted >> 4 * q;
            }
        }
    }
    walk.not_above = not_above >> (4 * QUADS - 1);
}

/// As crossing_parity_portable(). n >= 5.
template <VertexTest TEST>
BASALT_AVX2 int crossing_parity_avx2(int n, const geo_nee* polygon, const geo_nee& point) {
    const Quad p = {_mm256_set1_pd(point.north), _mm256_set1_pd(point.east)};
    const geo_nee& first = polygon[0];
    Walk walk = {first.north <= point.north ? 1U : 0U,
                 crosses_east_of(polygon[n - 1], first, point) ? 1U : 0U,
                 TEST == VertexTest::YES && first.north == point.north && first.east == point.east};
    int i = 1;
    for (; i <= n - 16 && !walk.on_vertex; i += 16) {
        step<TEST, 4>(walk, polygon + i, p);
    }
    for (; i <= n - 4 && !walk.on_vertex; i += 4) {
        step<TEST, 1>(walk, polygon + i, p);
    }
    if (i < n && !walk.on_vertex) {
        // The last one to three vertices, reached through the last whole quad.
        step<TEST, 1>(walk, polygon + (n - 4), p, i - (n - 4));
    }
    return walk.on_vertex ? 1 : __builtin_parity(walk.crossings);
}

/// may_be_in_band() of the four edges that end at vertices i[0] to i[3], a bit each.
BASALT_AVX2_INLINE unsigned may_be_in_bands(const geo_nee* i, const Quad& point, double reach) {
    const Quad a = load_quad(i - 1);
    const Quad b = load_quad(i);
    const __m256d sign = _mm256_set1_pd(-0.0);
    const __m256d extent = _mm256_add_pd(_mm256_andnot_pd(sign, _mm256_sub_pd(a.north, b.north)),
                                         _mm256_andnot_pd(sign, _mm256_sub_pd(a.east, b.east)));
    const __m256d margin =
        _mm256_add_pd(_mm256_set1_pd(reach), _mm256_mul_pd(_mm256_set1_pd(BAND_ROUNDING), extent));
    const __m256d north_a = _mm256_sub_pd(a.north, point.north);
    const __m256d north_b = _mm256_sub_pd(b.north, point.north);
    const __m256d east_a = _mm256_sub_pd(a.east, point.east);
    const __m256d east_b = _mm256_sub_pd(b.east, point.east);
    // How far the nearer end lies beyond the point, on the axis where that is most.
    const __m256d beyond = _mm256_max_pd(_mm256_min_pd(north_a, north_b), _mm256_min_pd(east_a, east_b));
    const __m256d before = _mm256_min_pd(_mm256_max_pd(north_a, north_b), _mm256_max_pd(east_a, east_b));
    const __m256d gap = _mm256_max_pd(beyond, _mm256_xor_pd(sign, before));
    return lane_bits(_mm256_cmp_pd(gap, margin, _CMP_NGT_UQ));
}

/// As is_in_a_band_portable(). n >= 5.
BASALT_AVX2 inline bool is_in_a_band_avx2(int n, const geo_nee* polygon, const geo_nee& point,
                                          double tolerance) {
    const Quad p = {_mm256_set1_pd(point.north), _mm256_set1_pd(point.east)};
    const double reach = band_reach(tolerance);
    for (std::ptrdiff_t i = 1; i < n; i += 4) {
        // The last quad may overlap the one before; testing an edge twice changes nothing.
        const geo_nee* first = polygon + (i <= n - 4 ? i : n - 4);
        for (unsigned ends = may_be_in_bands(first, p, reach); ends != 0; ends &= ends - 1) {
            if (is_in_band(first + __builtin_ctz(ends), point, tolerance)) {
                return true;
            }
        }
    }
    return false;
}

#undef BASALT_AVX2
#undef BASALT_AVX2_INLINE

#endif

}  // namespace basalt::geo

#endif
