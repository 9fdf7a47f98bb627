// Two and four lanes. Vectors of 32 bytes never cross a call: every function that takes or returns one is
// inlined.
#pragma GCC diagnostic ignored "-Wpsabi"

#include <cstring>

#include "src/geo/elementary/elementary.h"
#include "src/geo/elementary/kernels.h"

namespace basalt::geo::elementary {

namespace {

BASALT_INLINE Four load(const double* from) {
    Four lane;
    std::memcpy(&lane, from, sizeof lane);
    return lane;
}

BASALT_INLINE void store(double* to, const Four& lane) {
    std::memcpy(to, &lane, sizeof lane);
}

BASALT_INLINE void sin_cos_lanes(const double* angles, double* sines, double* cosines) {
    const Four angle = load(angles);
    if (all_within(size_of(angle), TINY, REDUCED_LIMIT)) {
        Four sine;
        Four cosine;
        sine_and_cosine(reduce(angle), sine, cosine);
        store(sines, sine);
        store(cosines, cosine);
        return;
    }
    for (int i = 0; i < 4; ++i) {
        const SineCosine one = sin_cos(angle[i]);
        sines[i] = one.sine;
        cosines[i] = one.cosine;
    }
}

BASALT_INLINE void atan2_lanes(const double* ys, const double* xs, double* angles) {
    const Four y = load(ys);
    const Four x = load(xs);
    if (all_within(size_of(y), SMALLEST_COMPONENT, LARGEST_COMPONENT) &&
        all_within(size_of(x), SMALLEST_COMPONENT, LARGEST_COMPONENT)) {
        store(angles, arctangent(y, x));
        return;
    }
    for (int i = 0; i < 4; ++i) {
        angles[i] = atan2(y[i], x[i]);
    }
}

BASALT_INLINE SineCosineTwo two_sines_and_cosines(double first, double second) {
    const Two angle = {first, second};
    Two sine;
    Two cosine;
    sine_and_cosine(reduce(angle), sine, cosine);
    return {{sine[0], cosine[0]}, {sine[1], cosine[1]}};
}

#if defined(__x86_64__)

// AVX broadcasts constants as it loads them: a tenth faster for two as well.
[[gnu::target("avx2")]] SineCosineTwo sin_cos_two_avx2(double first, double second) {
    return two_sines_and_cosines(first, second);
}
[[gnu::target("avx2")]] void sin_cos_four_avx2(const double* angles, double* sines, double* cosines) {
    sin_cos_lanes(angles, sines, cosines);
}
[[gnu::target("avx2")]] void atan2_four_avx2(const double* y, const double* x, double* angles) {
    atan2_lanes(y, x, angles);
}

bool has_avx2() {
    return __builtin_cpu_supports("avx2") != 0;
}
#endif

}  // namespace

SineCosineTwo sin_cos_two(double first, double second) {
    const double first_size = size_of(first);
    const double second_size = size_of(second);
    if (!(smaller(first_size, second_size) >= TINY && larger(first_size, second_size) <= REDUCED_LIMIT)) {
        return {sin_cos(first), sin_cos(second)};
    }
#if defined(__x86_64__)
    if (has_avx2()) {
        return sin_cos_two_avx2(first, second);
    }
#endif
    return two_sines_and_cosines(first, second);
}

AngleTwo atan2_two(double first_y, double first_x, double second_y, double second_x) {
    const Two y = {first_y, second_y};
    const Two x = {first_x, second_x};
    if (!all_within(size_of(y), SMALLEST_COMPONENT, LARGEST_COMPONENT) ||
        !all_within(size_of(x), SMALLEST_COMPONENT, LARGEST_COMPONENT)) {
        return {atan2(first_y, first_x), atan2(second_y, second_x)};
    }
    const Two angle = arctangent(y, x);
    return {angle[0], angle[1]};
}

void sin_cos_four(const double* angles, double* sines, double* cosines) {
#if defined(__x86_64__)
    if (has_avx2()) {
        return sin_cos_four_avx2(angles, sines, cosines);
    }
#endif
    sin_cos_lanes(angles, sines, cosines);
}

void atan2_four(const double* y, const double* x, double* angles) {
#if defined(__x86_64__)
    if (has_avx2()) {
        return atan2_four_avx2(y, x, angles);
    }
#endif
    atan2_lanes(y, x, angles);
}

}  // namespace basalt::geo::elementary
