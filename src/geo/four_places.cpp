// Vectors of 32 bytes never cross a call: every function that takes or returns one is inlined, at last into
// one compiled for AVX2.
#pragma GCC diagnostic ignored "-Wpsabi"

#include "src/geo/four_places.h"

#if defined(__x86_64__)

#include <immintrin.h>

#include <cstddef>
#include <cstring>

#include "src/geo/constants.h"
#include "src/geo/elementary/kernels.h"
#include "src/geo/ellipsoid_constants.h"

namespace basalt::geo {

using namespace elementary;

namespace {

using Mask = FourIntegers;

struct SineCosineFour {
    Four sine, cosine;
};

[[gnu::target("avx2")]] inline void take_roots(double* of_four) {
    _mm256_storeu_pd(of_four, _mm256_sqrt_pd(_mm256_loadu_pd(of_four)));
}

BASALT_INLINE Four root(const Four& x) {
    double of_four[4];
    std::memcpy(of_four, &x, sizeof of_four);
    take_roots(of_four);
    Four roots;
    std::memcpy(&roots, of_four, sizeof roots);
    return roots;
}

BASALT_INLINE bool is_any(const Mask& mask) {
    return (mask[0] | mask[1] | mask[2] | mask[3]) != 0;
}

/// Whether sin_cos() takes its usual way in all lanes.
BASALT_INLINE bool is_usual(const Four& angle) {
    return all_within(size_of(angle), TINY, REDUCED_LIMIT);
}

BASALT_INLINE SineCosineFour sine_cosine(const Four& angle) {
    SineCosineFour of = {};
    sine_and_cosine(reduce(angle), of.sine, of.cosine);
    return of;
}

/// Whether atan2() takes its usual way in all lanes.
BASALT_INLINE bool is_usual_direction(const Four& y, const Four& x) {
    return all_within(size_of(y), SMALLEST_COMPONENT, LARGEST_COMPONENT) &&
           all_within(size_of(x), SMALLEST_COMPONENT, LARGEST_COMPONENT);
}

BASALT_INLINE Four gather(const double* first, std::size_t stride) {
    return Four{first[0], first[stride], first[2 * stride], first[3 * stride]};
}

BASALT_INLINE void scatter(const Four& from, double* first, std::size_t stride) {
    for (int k = 0; k < 4; ++k) {
        first[static_cast<std::size_t>(k) * stride] = from[k];
    }
}

// The formulas are those of ellipsoid.cpp and geodesic_line.cpp, operation by operation.

BASALT_INLINE bool to_cartesian(const geo_llh* in, geo_vector* out) {
    const Four latitude = gather(&in->latitude, 3);
    const Four longitude = gather(&in->longitude, 3);
    const Four height = gather(&in->height, 3);
    if (!is_usual(latitude) || !is_usual(longitude)) {
        return false;
    }
    const SineCosineFour lat = sine_cosine(latitude);
    const SineCosineFour lon = sine_cosine(longitude);
    const Four n = SEMI_MAJOR_AXIS / root(1.0 - lat.sine * ECCENTRICITY2 * lat.sine);
    const Four from_axis = (n + height) * lat.cosine;
    scatter(lon.cosine * from_axis, &out->x, 3);
    scatter(lon.sine * from_axis, &out->y, 3);
    scatter(lat.sine * (n * Z_FACTOR + height), &out->z, 3);
    return true;
}

BASALT_INLINE bool to_geodetic(const geo_vector* in, geo_llh* out, double tolerance) {
    const Four x = gather(&in->x, 3);
    const Four y = gather(&in->y, 3);
    const Four z = gather(&in->z, 3);
    const Four p = root(x * x + y * y);
    const Four p2 = p * p;
    const Four distance2 = p2 + z * z;
    if (!(tolerance >= 1e-12 && tolerance <= 0.01) || is_any(~((distance2 > 1e12) & (distance2 < 1e300))) ||
        !is_usual_direction(y, x)) {
        return false;
    }
    const double margin = tolerance * 1e-4 + 1e-14;
    const Four base = p * FIRST_ESTIMATE_FACTOR;
    Four q = z + AXIS_PULL * z / root(base * base + FLAT * (z * z));
    Mask is_active = q == q;
    for (int passes = 2; is_any(is_active); ++passes) {
        const Four next = z + AXIS_PULL * q / root(p2 + FLAT * (q * q));
        const Four change = size_of(next - q) * p;
        const Four unit = p2 + next * q;
        const Mask is_settled = change <= (tolerance - margin) * unit;
        const Mask is_far = change > (tolerance + margin) * unit;
        if (passes > MOST_PASSES || is_any(is_active & ~(is_settled | is_far))) {
            return false;
        }
        q = is_active ? next : q;
        is_active &= ~is_settled;
    }
    if (!is_usual_direction(q, p)) {
        return false;
    }
    const Four latitude = arctangent(q, p);
    const Four length = root(p * p + q * q);
    const Four n = SEMI_MAJOR_AXIS / (root(p * p + FLAT * (q * q)) / length);
    const Four beyond = size_of(latitude) - POLAR_LATITUDE;
    if (is_any(~(size_of(beyond) > 1e-14))) {
        return false;
    }
    scatter(latitude, &out->latitude, 3);
    scatter(arctangent(y, x), &out->longitude, 3);
    scatter(beyond <= 0.0 ? length - n : z / (q / length) - n + n * ECCENTRICITY2, &out->height, 3);
    return true;
}

BASALT_INLINE bool direct(const geo_llh* starts, const double* azimuths, const double* distances,
                          geo_llh* ends, double* final_azimuths) {
    const Four latitude = gather(&starts->latitude, 3);
    const Four longitude = gather(&starts->longitude, 3);
    const Four height = gather(&starts->height, 3);
    const Four azimuth = gather(azimuths, 1);
    if (!is_usual(latitude) || !is_usual(azimuth)) {
        return false;
    }
    const SineCosineFour at = sine_cosine(latitude);
    const SineCosineFour towards = sine_cosine(azimuth);
    const Four tan_u = ONE_LESS_FLATTENING * (at.sine / at.cosine);
    const Four cos_u = 1.0 / root(tan_u * tan_u + 1.0);
    const Four sin_u = tan_u * cos_u;
    const Four sin_alpha = cos_u * towards.sine;
    const Four cos2_alpha = 1.0 - sin_alpha * sin_alpha;
    const Four u2 = cos2_alpha * AXES_DIFFERENCE2 / SEMI_MINOR_AXIS2;
    const Four a = 1.0 + u2 * 6.103515625e-05 * (4096.0 + u2 * (-768.0 + u2 * (320.0 - 175.0 * u2)));
    const Four b = u2 * 0.0009765625 * (256.0 + u2 * (-128.0 + u2 * (74.0 - 47.0 * u2)));
    const Four length2 = tan_u * tan_u + towards.cosine * towards.cosine;
    const Four sin_2sigma1 = 2.0 * tan_u * towards.cosine / length2;
    const Four cos_2sigma1 = (towards.cosine - tan_u) * (towards.cosine + tan_u) / length2;

    const Four first = gather(distances, 1) / (SEMI_MINOR_AXIS * a);
    if (!is_usual(first)) {
        return false;
    }
    const SineCosineFour of_first = sine_cosine(first);
    Four sigma = first;
    Four beyond = first - first;
    Four sine = of_first.sine;
    Four cosine = of_first.cosine;
    Four c = cos_2sigma1 * cosine - sin_2sigma1 * sine;
    Mask is_active = size_of(first - TWO_PI) > SETTLED_ARC;
    for (int pass = 0; is_any(is_active) && pass < MOST_ARC_PASSES; ++pass) {
        if (pass > 0) {
            const Four d2 = beyond * beyond;
            const Four turn = beyond - beyond * d2 * (1.0 / 6.0 - d2 / 120.0);
            const Four versine = d2 * (0.5 - d2 * (1.0 / 24.0 - d2 / 720.0));
            sine = is_active ? of_first.sine + (of_first.cosine * turn - of_first.sine * versine) : sine;
            cosine =
                is_active ? of_first.cosine - (of_first.sine * turn + of_first.cosine * versine) : cosine;
            c = cos_2sigma1 * cosine - sin_2sigma1 * sine;
        }
        const Four next = b * sine *
                          (c + b / 4.0 *
                                   (cosine * (2.0 * c * c - 1.0) -
                                    b / 6.0 * c * (4.0 * sine * sine - 3.0) * (4.0 * c * c - 3.0)));
        beyond = is_active ? next : beyond;
        const Four previous = sigma;
        sigma = is_active ? first + beyond : sigma;
        is_active &= size_of(sigma - previous) > SETTLED_ARC;
    }
    const Four t = sin_u * sine - cos_u * cosine * towards.cosine;
    const Four lambda_y = sine * towards.sine;
    const Four lambda_x = cos_u * cosine - sin_u * sine * towards.cosine;
    const Four end_y = sin_u * cosine + cos_u * sine * towards.cosine;
    const Four end_x = ONE_LESS_FLATTENING * root(sin_alpha * sin_alpha + t * t);
    if (!is_usual_direction(lambda_y, lambda_x) || !is_usual_direction(end_y, end_x) ||
        !is_usual_direction(sin_alpha, -t)) {
        return false;
    }
    const Four k = FLATTENING_16TH * cos2_alpha * (4.0 + FLATTENING * (4.0 - 3.0 * cos2_alpha));
    const Four change =
        arctangent(lambda_y, lambda_x) -
        (1.0 - k) * FLATTENING * sin_alpha * (sigma + k * sine * (c + k * cosine * (2.0 * c * c - 1.0)));
    scatter(arctangent(sin_alpha, -t), final_azimuths, 1);
    scatter(arctangent(end_y, end_x), &ends->latitude, 3);
    scatter(longitude + change, &ends->longitude, 3);
    scatter(height, &ends->height, 3);
    return true;
}

}  // namespace

[[gnu::target("avx2")]] bool to_cartesian_four(const geo_llh* in, geo_vector* out) {
    return to_cartesian(in, out);
}

[[gnu::target("avx2")]] bool to_geodetic_four(const geo_vector* in, geo_llh* out, double tolerance) {
    return to_geodetic(in, out, tolerance);
}

[[gnu::target("avx2")]] bool direct_four(const geo_llh* starts, const double* azimuths,
                                         const double* distances, geo_llh* ends, double* final_azimuths) {
    return direct(starts, azimuths, distances, ends, final_azimuths);
}

}  // namespace basalt::geo

#else

namespace basalt::geo {

bool to_cartesian_four(const geo_llh*, geo_vector*) {
    return false;
}

bool to_geodetic_four(const geo_vector*, geo_llh*, double) {
    return false;
}

bool direct_four(const geo_llh*, const double*, const double*, geo_llh*, double*) {
    return false;
}

}  // namespace basalt::geo

#endif
