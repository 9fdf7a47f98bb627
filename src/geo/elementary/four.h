/// @file
/// Four doubles side by side, beside the functions of one: formulas written for either have the same bits.
/// Code that is to be fast has to be compiled for AVX2, with every function of vectors inlined into it.
#ifndef BASALT_SRC_GEO_ELEMENTARY_FOUR_H
#define BASALT_SRC_GEO_ELEMENTARY_FOUR_H

// Vectors of 32 bytes never cross a call.
#pragma GCC diagnostic ignored "-Wpsabi"

#include <cmath>
#include <cstring>

#include "src/geo/elementary/elementary.h"
#include "src/geo/elementary/kernels.h"

#if defined(__x86_64__)
#include <immintrin.h>
#endif

namespace basalt::geo::elementary {

/// Result of a comparison; in lanes all bits or none.
template <typename Lane>
using Mask = decltype(Lane() < Lane());

BASALT_INLINE bool is_any(bool mask) {
    return mask;
}
BASALT_INLINE bool is_any(const FourIntegers& mask) {
    return (mask[0] | mask[1] | mask[2] | mask[3]) != 0;
}

BASALT_INLINE bool negated(bool mask) {
    return !mask;
}
BASALT_INLINE FourIntegers negated(const FourIntegers& mask) {
    return ~mask;
}

/// The same number in all lanes.
template <typename Lane>
BASALT_INLINE Lane all_of(double number) {
    return Lane{} + number;
}

BASALT_INLINE Four load_four(const double* from) {
    Four four;
    std::memcpy(&four, from, sizeof four);
    return four;
}
BASALT_INLINE void store(const Four& four, double* to) {
    std::memcpy(to, &four, sizeof four);
}

#if defined(__x86_64__)
[[gnu::target("avx2")]] inline void take_roots(double* of_four) {
    _mm256_storeu_pd(of_four, _mm256_sqrt_pd(_mm256_loadu_pd(of_four)));
}
#else
inline void take_roots(double* of_four) {
    for (int i = 0; i < 4; ++i) {
        of_four[i] = std::sqrt(of_four[i]);
    }
}
#endif

BASALT_INLINE double root(double x) {
    return std::sqrt(x);
}
BASALT_INLINE Four root(const Four& x) {
    double of_four[4];
    store(x, of_four);
    take_roots(of_four);
    return load_four(of_four);
}

struct SineCosineFour {
    Four sine, cosine;
};

BASALT_INLINE SineCosineFour sin_cos(const Four& angle) {
    SineCosineFour of = {};
    // Rounded, the sine of a tiny angle is the angle; only of -0 the kernel loses the sign.
    if (all_within(size_of(angle), 0x1p-1022, REDUCED_LIMIT)) {
        sine_and_cosine(reduce(angle), of.sine, of.cosine);
        return of;
    }
    for (int i = 0; i < 4; ++i) {
        const SineCosine one = sin_cos(angle[i]);
        of.sine[i] = one.sine;
        of.cosine[i] = one.cosine;
    }
    return of;
}

struct SineCosineFours {
    SineCosineFour first, second;
};

BASALT_INLINE SineCosineFours sin_cos_two(const Four& first, const Four& second) {
    return {sin_cos(first), sin_cos(second)};
}

BASALT_INLINE Four tan(const Four& angle) {
    if (all_within(size_of(angle), TINY, REDUCED_LIMIT)) {
        return tangent(reduce(angle));
    }
    return Four{tan(angle[0]), tan(angle[1]), tan(angle[2]), tan(angle[3])};
}

BASALT_INLINE Four atan2(const Four& y, const Four& x) {
    if (all_within(size_of(y), SMALLEST_COMPONENT, LARGEST_COMPONENT) &&
        all_within(size_of(x), SMALLEST_COMPONENT, LARGEST_COMPONENT)) {
        return arctangent(y, x);
    }
    return Four{atan2(y[0], x[0]), atan2(y[1], x[1]), atan2(y[2], x[2]), atan2(y[3], x[3])};
}

struct AngleFours {
    Four first, second;
};

BASALT_INLINE AngleFours atan2_two(const Four& first_y, const Four& first_x, const Four& second_y,
                                   const Four& second_x) {
    return {atan2(first_y, first_x), atan2(second_y, second_x)};
}

}  // namespace basalt::geo::elementary

#endif
