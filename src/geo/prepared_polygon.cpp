#include "basalt/geo/prepared_polygon.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <stdexcept>

#include "src/geo/polygon_edges.h"

namespace basalt {

using namespace geo;

namespace {

constexpr double NOT_A_NUMBER = std::numeric_limits<double>::quiet_NaN();

/// Buckets cover the northings between two quantiles, and as much again on either side: a vertex far away
/// must not gather all others in one bucket.
struct Range {
    double low = 0.0, high = 0.0;
};

Range range_of(const geo_nee* vertices, std::size_t count) {
    std::vector<double> norths;
    norths.reserve(count);
    for (std::size_t i = 0; i < count; ++i) {
        if (std::isfinite(vertices[i].north)) {
            norths.push_back(vertices[i].north);
        }
    }
    if (norths.empty()) {
        return {};
    }
    const auto [lowest, highest] = std::minmax_element(norths.begin(), norths.end());
    const Range all = {*lowest, *highest};
    const auto quantile = [&norths](std::size_t rank) {
        std::nth_element(norths.begin(), norths.begin() + static_cast<std::ptrdiff_t>(rank), norths.end());
        return norths[rank];
    };
    const std::size_t outside = norths.size() / 64;
    const double low = quantile(outside);
    const double high = quantile(norths.size() - 1 - outside);
    return {std::max(all.low, low - (high - low)), std::min(all.high, high + (high - low))};
}

bool is_nan(const geo_nee& vertex) {
    return std::isnan(vertex.north) || std::isnan(vertex.east);
}

/// Calls visit(i, j) for each edge from j to i whose end i is not NaN: another one neither crosses nor
/// matches.
template <class Visit>
void for_each_edge(const geo_nee* vertices, std::size_t count, const Visit& visit) {
    for (std::size_t i = 0; i < count; ++i) {
        if (!is_nan(vertices[i])) {
            visit(vertices[i], vertices[i > 0 ? i - 1 : count - 1]);
        }
    }
}

/// Extent of an edge as may_be_in_band() forms it; infinite or NaN where it has no bounds.
double extent_of(const geo_nee& a, const geo_nee& b) {
    return std::abs(a.north - b.north) + std::abs(a.east - b.east);
}

}  // namespace

[[gnu::always_inline]] inline std::size_t PreparedPolygon::bucket_of(double north) const noexcept {
    // NaN goes to the first bucket; otherwise the function is monotone, whatever is rounded. A signed number
    // takes one instruction to convert.
    const double at = std::min(std::max(0.0, (north - m_low) * m_scale), m_last);
    return static_cast<std::size_t>(static_cast<std::ptrdiff_t>(at));
}

[[gnu::always_inline]] inline const PreparedPolygon::Quad* PreparedPolygon::quads_of(
    std::size_t bucket) const noexcept {
    return m_quads.data() + m_first[bucket];
}

/// The quads' tests, in a portable form and with AVX2. Every bucket has a quad.
struct PolygonQuads {
    using Quad = PreparedPolygon::Quad;

    static geo_nee vertex(const Quad& quad, std::size_t k) { return {quad.north[k], quad.east[k], 0.0}; }
    static geo_nee previous(const Quad& quad, std::size_t k) {
        return {quad.previous_north[k], quad.previous_east[k], 0.0};
    }

    /// Whether an odd number of edges crosses east of the point or, with VertexTest::YES, the point is a
    /// vertex.
    template <VertexTest TEST>
    static bool contains_portable(const PreparedPolygon& polygon, const geo_nee& point) {
        const std::size_t bucket = polygon.bucket_of(point.north);
        const Quad* const end = polygon.quads_of(bucket + 1);
        bool is_inside = false;
        for (const Quad* quad = polygon.quads_of(bucket); quad != end; ++quad) {
            for (std::size_t k = 0; k < 4; ++k) {
                const geo_nee v = vertex(*quad, k);
                if (TEST == VertexTest::YES && v.north == point.north && v.east == point.east) {
                    return true;
                }
                is_inside ^= crosses_east_of(previous(*quad, k), v, point);
            }
        }
        return is_inside;
    }

#if BASALT_HAS_AVX2_FORM
    template <VertexTest TEST>
    [[gnu::target("avx2")]] static bool contains_avx2(const PreparedPolygon& polygon, const geo_nee& point) {
        const __m256d north = _mm256_set1_pd(point.north);
        const __m256d east = _mm256_set1_pd(point.east);
        __m256d crossings = _mm256_setzero_pd();
        __m256d same = _mm256_setzero_pd();
        const std::size_t bucket = polygon.bucket_of(point.north);
        const Quad* const end = polygon.quads_of(bucket + 1);
        const Quad* quad = polygon.quads_of(bucket);
        do {
            const __m256d ni = _mm256_loadu_pd(quad->north);
            const __m256d nj = _mm256_loadu_pd(quad->previous_north);
            const __m256d ei = _mm256_loadu_pd(quad->east);
            // With NaN among the northings the crossing is NaN, which is not east of the point.
            const __m256d straddles =
                _mm256_xor_pd(_mm256_cmp_pd(ni, north, _CMP_LE_OQ), _mm256_cmp_pd(nj, north, _CMP_LE_OQ));
            // Nothing is divided by the 0 of a level edge, which a host may trap.
            const __m256d rise =
                _mm256_blendv_pd(_mm256_set1_pd(LEVEL_EDGE_RISE), _mm256_sub_pd(nj, ni), straddles);
            const __m256d run = _mm256_mul_pd(_mm256_sub_pd(_mm256_loadu_pd(quad->previous_east), ei),
                                              _mm256_sub_pd(north, ni));
            const __m256d crossing = _mm256_add_pd(_mm256_div_pd(run, rise), ei);
            crossings =
                _mm256_xor_pd(crossings, _mm256_and_pd(straddles, _mm256_cmp_pd(crossing, east, _CMP_GT_OQ)));
            if (TEST == VertexTest::YES) {
                same = _mm256_or_pd(same, _mm256_and_pd(_mm256_cmp_pd(ni, north, _CMP_EQ_OQ),
                                                        _mm256_cmp_pd(ei, east, _CMP_EQ_OQ)));
            }
        } while (++quad != end);
        return (__builtin_parity(static_cast<unsigned>(_mm256_movemask_pd(crossings))) |
                _mm256_movemask_pd(same)) != 0;
    }
#endif

    template <VertexTest TEST>
    [[gnu::always_inline]] static bool contains(const PreparedPolygon& polygon, const geo_nee& point) {
#if BASALT_HAS_AVX2_FORM
        if (can_use_avx2()) {
            return contains_avx2<TEST>(polygon, point);
        }
#endif
        return contains_portable<TEST>(polygon, point);
    }

    static bool is_in_a_band(const Quad* begin, const Quad* end, const geo_nee& point, double tolerance) {
        const double reach = band_reach(tolerance);
        for (const Quad* quad = begin; quad != end; ++quad) {
            for (std::size_t k = 0; k < 4; ++k) {
                const geo_nee i = vertex(*quad, k);
                const geo_nee j = previous(*quad, k);
                if (may_be_in_band(i, j, point, reach) && geo_point_on_line(i, j, point, tolerance) == 1) {
                    return true;
                }
            }
        }
        return false;
    }
};

std::size_t PreparedPolygon::choose_buckets(const geo_nee* vertices, std::size_t count) {
    const Range range = range_of(vertices, count);
    double covered = 0.0;
    for_each_edge(vertices, count, [&](const geo_nee& i, const geo_nee& j) {
        const double from = std::clamp(j.north, range.low, range.high);
        const double to = std::clamp(i.north, range.low, range.high);
        covered += std::isnan(from) ? 0.0 : std::abs(to - from);
        const double extent = extent_of(i, j);
        if (std::isfinite(extent)) {
            m_extent = std::max(m_extent, extent);
        } else if (!is_nan(j)) {
            m_unbounded.insert(m_unbounded.end(), {i, j});
        }
    });
    // As many buckets as make each edge stand in some two of them.
    const double height = range.high - range.low;
    const double crossed = covered / height;
    if (!(crossed > 0.0 && std::isfinite(crossed))) {
        return 1;
    }
    const auto buckets = std::max(
        std::size_t{1}, static_cast<std::size_t>(static_cast<double>(count) / std::max(crossed, 1.0)));
    m_low = range.low;
    m_scale = static_cast<double>(buckets) / height;
    return buckets;
}

PreparedPolygon::PreparedPolygon(const geo_nee* vertices, std::size_t count) {
    if (count == 0) {
        return;
    }
    // Positions of quads, fewer than twice the vertices, have 32 bits.
    if (count > static_cast<std::size_t>(std::numeric_limits<int>::max())) {
        throw std::length_error("too many vertices for a prepared polygon");
    }
    const std::size_t buckets = choose_buckets(vertices, count);
    m_last = static_cast<double>(buckets - 1);
    m_first.assign(buckets + 1, 0);
    // Calls visit(bucket, i, j) for each bucket of each edge.
    const auto for_each_place = [&](const auto& visit) {
        for_each_edge(vertices, count, [&](const geo_nee& i, const geo_nee& j) {
            const std::size_t own = bucket_of(i.north);
            const auto [first, last] = std::minmax({own, std::isnan(j.north) ? own : bucket_of(j.north)});
            for (std::size_t bucket = first; bucket <= last; ++bucket) {
                visit(bucket, i, j);
            }
        });
    };
    for_each_place([&](std::size_t bucket, const geo_nee&, const geo_nee&) { ++m_first[bucket + 1]; });
    for (std::size_t bucket = 0; bucket < buckets; ++bucket) {
        m_first[bucket + 1] = m_first[bucket] + std::max((m_first[bucket + 1] + 3) / 4, 1U);
    }
    const Quad nothing = {{NOT_A_NUMBER, NOT_A_NUMBER, NOT_A_NUMBER, NOT_A_NUMBER}, {}, {}, {}};
    m_quads.assign(m_first.back(), nothing);
    std::vector<std::uint32_t> filled(buckets, 0);
    for_each_place([&](std::size_t bucket, const geo_nee& i, const geo_nee& j) {
        const std::size_t at = filled[bucket]++;
        Quad& quad = m_quads[m_first[bucket] + at / 4];
        quad.north[at % 4] = i.north;
        quad.east[at % 4] = i.east;
        quad.previous_north[at % 4] = j.north;
        quad.previous_east[at % 4] = j.east;
    });
}

bool PreparedPolygon::contains(const geo_nee& point) const noexcept {
    return !m_first.empty() && PolygonQuads::contains<VertexTest::YES>(*this, point);
}

void PreparedPolygon::contains(const geo_nee* points, std::size_t count, bool* inside) const noexcept {
    for (std::size_t i = 0; i < count; ++i) {
        inside[i] = contains(points[i]);
    }
}

bool PreparedPolygon::contains(const geo_nee& point, double tolerance) const noexcept {
    if (m_first.empty()) {
        return false;
    }
    if (tolerance >= 0.0) {
        // The largest margin of may_be_in_band(), and more than what is rounded here.
        const double margin = band_reach(tolerance) + BAND_ROUNDING * m_extent;
        const double reach = margin * (1.0 + 1e-9) + std::abs(point.north) * 1e-15;
        const Quad* const begin = quads_of(bucket_of(point.north - reach));
        const Quad* const end = quads_of(bucket_of(point.north + reach) + 1);
        if (PolygonQuads::is_in_a_band(begin, end, point, tolerance)) {
            return true;
        }
        for (std::size_t k = 0; k < m_unbounded.size(); k += 2) {
            if (geo_point_on_line(m_unbounded[k], m_unbounded[k + 1], point, tolerance) == 1) {
                return true;
            }
        }
    }
    return PolygonQuads::contains<VertexTest::NO>(*this, point);
}

}  // namespace basalt
