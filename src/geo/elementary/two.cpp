#include "src/geo/elementary/elementary.h"
#include "src/geo/elementary/kernels.h"

namespace basalt::geo::elementary {

namespace {

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
#endif

}  // namespace

SineCosineTwo sin_cos_two(double first, double second) {
    const double first_size = size_of(first);
    const double second_size = size_of(second);
    if (!(smaller(first_size, second_size) >= TINY && larger(first_size, second_size) <= REDUCED_LIMIT)) {
        return {sin_cos(first), sin_cos(second)};
    }
#if defined(__x86_64__)
    if (__builtin_cpu_supports("avx2") != 0) {
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

}  // namespace basalt::geo::elementary
