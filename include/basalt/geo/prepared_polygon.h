/// @file
/// A polygon prepared for many points.
#ifndef BASALT_GEO_PREPARED_POLYGON_H
#define BASALT_GEO_PREPARED_POLYGON_H

#include <cstddef>
#include <cstdint>
#include <utility>
#include <vector>

#include "basalt/export.h"
#include "basalt/geo/records.h"

namespace basalt {

/// Tests many points against one polygon, with the results of geo_point_in_poly() and geo_point_in_poly_2()
/// for every point and polygon, NaN and infinities included. The vertices are copied.
///
/// Cost: building takes time and memory linear in the vertices, about 100 bytes a vertex. Edges are sorted
/// into buckets by northing, and a test reads those at the point's northing: for an outline that a parallel
/// crosses in c places some 2 c edges.
///
/// Threads: const calls may run on any number of threads at once.
class PreparedPolygon {
public:
    /// @param vertices in either order, without a repeated closing vertex; may be null when count is 0
    /// @param count of vertices, at most 2^31 - 1; 0 makes a polygon that contains nothing
    /// Throws std::bad_alloc when out of memory, std::length_error for a larger count.
    BASALT_API PreparedPolygon(const geo_nee* vertices, std::size_t count);

    /// From any contiguous container of geo_nee: std::vector, std::array, std::span.
    template <class Container,
              class = decltype(static_cast<const geo_nee*>(std::declval<const Container&>().data()))>
    explicit PreparedPolygon(const Container& vertices) : PreparedPolygon(vertices.data(), vertices.size()) {}

    /// Whether the point lies inside or exactly on a vertex, as geo_point_in_poly().
    BASALT_API bool contains(const geo_nee& point) const noexcept;

    /// Whether the point lies inside or within a tolerance of the outline, as geo_point_in_poly_2().
    /// @param tolerance metres; only the crossings count where it is negative or NaN
    BASALT_API bool contains(const geo_nee& point, double tolerance) const noexcept;

    /// contains() of each of `count` points.
    /// @param[out] inside buffer of `count` results
    BASALT_API void contains(const geo_nee* points, std::size_t count, bool* inside) const noexcept;

private:
    /// Edges of a bucket, four at a time: from the previous vertex to the vertex. Padded with NaN.
    struct Quad {
        double north[4], east[4], previous_north[4], previous_east[4];
    };
    friend struct PolygonQuads;

    std::size_t choose_buckets(const geo_nee* vertices, std::size_t count);
    std::size_t bucket_of(double north) const noexcept;
    const Quad* quads_of(std::size_t bucket) const noexcept;  ///< the first; they end at the next bucket's

    double m_low = 0.0, m_scale = 0.0;  ///< bucket = (north - low) * scale, in [0, last]
    double m_last = 0.0;
    double m_extent = 0.0;               ///< largest finite extent of an edge, metres
    std::vector<std::uint32_t> m_first;  ///< first quad of each bucket, and the end of the last
    std::vector<Quad> m_quads;
    std::vector<geo_nee> m_unbounded;  ///< vertex and previous vertex of edges of infinite extent
};

}  // namespace basalt

#endif
