#include "src/geo/four_places.h"

#if defined(__x86_64__)

#include <cstddef>

#include "src/geo/directions.h"
#include "src/geo/ellipsoid_formulas.h"
#include "src/geo/geodesic_inverse.h"
#include "src/geo/geodesic_line.h"

namespace basalt::geo {

using namespace elementary;

namespace {

BASALT_INLINE Four gather(const double* first, std::size_t stride) {
    return Four{first[0], first[stride], first[2 * stride], first[3 * stride]};
}

BASALT_INLINE void scatter(const Four& from, double* first, std::size_t stride) {
    for (int k = 0; k < 4; ++k) {
        first[static_cast<std::size_t>(k) * stride] = from[k];
    }
}

BASALT_INLINE FourIntegers is_missing(const Four& numbers) {
    return bits_of(numbers) == bits_of(GEO_NULL);
}

BASALT_INLINE Point<Four> gather(const geo_nee* from) {
    return {gather(&from->north, 3), gather(&from->east, 3), gather(&from->elevation, 3)};
}

BASALT_INLINE Offset<Four> gather_offset(const geo_nee* from, const geo_nee* to) {
    return {gather(&to->north, 3) - gather(&from->north, 3), gather(&to->east, 3) - gather(&from->east, 3)};
}

/// Where one is NaN, the single calls say which.
BASALT_INLINE unsigned written(const Four& results, double* out) {
    store(results, out);
    return is_any(results != results) ? ALL_FOUR : 0;
}

BASALT_INLINE unsigned written(const Point<Four>& results, geo_nee* out) {
    if (is_any(results.north != results.north)) {
        return ALL_FOUR;
    }
    scatter(results.north, &out->north, 3);
    scatter(results.east, &out->east, 3);
    scatter(results.elevation, &out->elevation, 3);
    return 0;
}

BASALT_INLINE unsigned to_cartesian(const geo_llh* in, geo_vector* out) {
    const Four latitude = gather(&in->latitude, 3);
    const Four longitude = gather(&in->longitude, 3);
    const Four height = gather(&in->height, 3);
    // Refused by the single call.
    if (is_any((latitude == 0.0) & (longitude == 0.0) & (height == 0.0))) {
        return ALL_FOUR;
    }
    const Cartesian<Four> at(latitude, longitude, height);
    scatter(at.x, &out->x, 3);
    scatter(at.y, &out->y, 3);
    scatter(at.z, &out->z, 3);
    return 0;
}

BASALT_INLINE unsigned to_geodetic(const geo_vector* in, geo_llh* out, double tolerance) {
    const Four x = gather(&in->x, 3);
    const Four y = gather(&in->y, 3);
    Four latitude = {};
    Four height = {};
    if (!convert_quickly<Four>(root(x * x + y * y), gather(&in->z, 3), tolerance, latitude, height)) {
        return ALL_FOUR;
    }
    scatter(latitude, &out->latitude, 3);
    scatter(elementary::atan2(y, x), &out->longitude, 3);
    scatter(height, &out->height, 3);
    return 0;
}

BASALT_INLINE unsigned direct(const geo_llh* starts, const double* azimuths, const double* distances,
                              geo_llh* ends, double* final_azimuths) {
    const Four longitude = gather(&starts->longitude, 3);
    const Four height = gather(&starts->height, 3);
    const GeodesicLines<Four> lines(gather(&starts->latitude, 3), gather(azimuths, 1));
    const LineEnds<Four> at = lines.at(gather(distances, 1));
    const auto [forward, latitude] =
        atan2_two(at.azimuth_sine, at.azimuth_cosine, at.latitude_sine, at.latitude_cosine);
    if (is_any(latitude != latitude)) {
        return ALL_FOUR;
    }
    scatter(forward, final_azimuths, 1);
    scatter(latitude, &ends->latitude, 3);
    scatter(longitude + at.longitude_change, &ends->longitude, 3);
    scatter(height, &ends->height, 3);
    return 0;
}

BASALT_INLINE unsigned inverse(const geo_llh* from, const geo_llh* to, GeodesicInverse* out) {
    constexpr double ROUNDING = 0x1.8p52;  // added to it, a number becomes an integer
    const Four latitude1 = gather(&from->latitude, 3);
    const Four latitude2 = gather(&to->latitude, 3);
    const Four difference = gather(&to->longitude, 3) - gather(&from->longitude, 3);
    const Four longitude = less_turns<Four>(difference, (difference / TWO_PI + ROUNDING) - ROUNDING);
    // Those on a meridian, on the equator, from a pole or with special numbers are left to the single call.
    const Four size1 = size_of(latitude1);
    const Four size2 = size_of(latitude2);
    const Four east = size_of(longitude);
    FourIntegers is_wanted = (size1 < HALF_PI) & (size2 < HALF_PI) & ((size1 > TINY) | (size2 > TINY)) &
                             (size_of(difference) < 100.0) & (east > 0.0) & (east < PI);
    if (is_any(is_wanted)) {
        const Arranged<Four> pairs(latitude1, latitude2, longitude);
        const Line<Four> lines = pairs.line(solve(pairs.problem, is_wanted));
        scatter(lines.distance, &out->distance, 3);
        scatter(lines.azimuth_from, &out->azimuth_from, 3);
        scatter(lines.azimuth_to, &out->azimuth_to, 3);
    }
    unsigned left = 0;
    for (int k = 0; k < 4; ++k) {
        left |= is_wanted[k] != 0 ? 0U : 1U << k;
    }
    return left;
}

BASALT_INLINE unsigned bearings(const geo_nee* from, const geo_nee* to, double* out) {
    return written(gather_offset(from, to).bearing(), out);
}

BASALT_INLINE unsigned bearings(const geo_llh* from, const geo_llh* to, double* out) {
    const Four change = gather(&to->longitude, 3) - gather(&from->longitude, 3);
    return written(sphere_bearing<Four>(sin_cos(gather(&from->latitude, 3)),
                                        sin_cos(gather(&to->latitude, 3)), sin_cos(change)),
                   out);
}

BASALT_INLINE unsigned distances(const geo_llh* from, const geo_llh* to, double* out) {
    const Four start = gather(&from->latitude, 3);
    const Four end = gather(&to->latitude, 3);
    const Four change = gather(&to->longitude, 3) - gather(&from->longitude, 3);
    return written(sphere_distance<Four>(sin_cos((end - start) / 2.0).sine, sin_cos(change / 2.0).sine,
                                         sin_cos(start).cosine, sin_cos(end).cosine),
                   out);
}

BASALT_INLINE unsigned bearings(const geo_vector* in, double* out) {
    return written(bearing_of<Four>(gather(&in->y, 3), gather(&in->x, 3)), out);
}

BASALT_INLINE unsigned on_segments(const geo_nee* from, const geo_nee* to, const geo_nee* points,
                                   const double* tolerances, bool* out) {
    const FourIntegers is_on =
        is_on_segment<Four>(gather_offset(from, to), gather_offset(from, points), gather(tolerances, 1));
    for (int k = 0; k < 4; ++k) {
        out[k] = is_on[k] != 0;
    }
    return 0;
}

BASALT_INLINE unsigned follow(Rise given, const geo_nee* starts, const double* bearings,
                              const double* distances, const double* rises, geo_nee* out) {
    const Point<Four> start = gather(starts);
    const Four bearing = gather(bearings, 1);
    const Four distance = gather(distances, 1);
    const Four rise = gather(rises, 1);
    switch (given) {
        case Rise::ANGLE:
            return written(followed<Rise::ANGLE>(start, bearing, distance, rise), out);
        case Rise::GRADE:
            return written(followed<Rise::GRADE>(start, bearing, distance, rise), out);
        case Rise::METRES:
            break;
    }
    return written(followed<Rise::METRES>(start, bearing, distance, rise), out);
}

BASALT_INLINE unsigned reduce(const geo_hvd* observations, const geo_nee* stations,
                              const double* height_offsets, const double* scale_factors, geo_nee* out) {
    const Four horizontal = gather(&observations->horizontal, 3);
    const Four vertical = gather(&observations->vertical, 3);
    const Four distance = gather(&observations->distance, 3);
    if (is_any(is_missing(horizontal) | is_missing(vertical) | is_missing(distance))) {
        return ALL_FOUR;
    }
    return written(reduced<Four>(horizontal, vertical, distance, gather(stations), gather(height_offsets, 1),
                                 gather(scale_factors, 1)),
                   out);
}

}  // namespace

// Apart, since Clang refuses calls that return vectors in functions for AVX2, inlined ones too.
[[gnu::target("avx2")]] unsigned to_cartesian_four(const geo_llh* in, geo_vector* out) {
    return to_cartesian(in, out);
}

[[gnu::target("avx2")]] unsigned to_geodetic_four(const geo_vector* in, geo_llh* out, double tolerance) {
    return to_geodetic(in, out, tolerance);
}

[[gnu::target("avx2")]] unsigned direct_four(const geo_llh* starts, const double* azimuths,
                                             const double* distances, geo_llh* ends, double* final_azimuths) {
    return direct(starts, azimuths, distances, ends, final_azimuths);
}

[[gnu::target("avx2")]] unsigned inverse_four(const geo_llh* from, const geo_llh* to, GeodesicInverse* out) {
    return inverse(from, to, out);
}

[[gnu::target("avx2")]] unsigned bearings_four(const geo_nee* from, const geo_nee* to, double* out) {
    return bearings(from, to, out);
}

[[gnu::target("avx2")]] unsigned bearings_four(const geo_llh* from, const geo_llh* to, double* out) {
    return bearings(from, to, out);
}

[[gnu::target("avx2")]] unsigned distances_four(const geo_llh* from, const geo_llh* to, double* out) {
    return distances(from, to, out);
}

[[gnu::target("avx2")]] unsigned bearings_four(const geo_vector* in, double* out) {
    return bearings(in, out);
}

[[gnu::target("avx2")]] unsigned on_segments_four(const geo_nee* from, const geo_nee* to,
                                                  const geo_nee* points, const double* tolerances,
                                                  bool* out) {
    return on_segments(from, to, points, tolerances, out);
}

[[gnu::target("avx2")]] unsigned follow_four(Rise given, const geo_nee* starts, const double* bearings,
                                             const double* distances, const double* rises, geo_nee* out) {
    return follow(given, starts, bearings, distances, rises, out);
}

[[gnu::target("avx2")]] unsigned reduce_four(const geo_hvd* observations, const geo_nee* stations,
                                             const double* height_offsets, const double* scale_factors,
                                             geo_nee* out) {
    return reduce(observations, stations, height_offsets, scale_factors, out);
}

}  // namespace basalt::geo

#endif
