#include "src/geo/elementary/elementary.h"

#include <cmath>

#include "src/geo/elementary/huge_angle.h"
#include "src/geo/elementary/kernels.h"

namespace basalt::geo::elementary {

namespace {

// The C library's classifications, std::abs and std::copysign are exact.

/// Where reduce() would leave the angle as it is, which takes a third of the time.
bool needs_no_reduction(double angle) {
    return all_within(std::abs(angle), TINY, 0.785);
}

Reduced<double> reduce_any(double angle) {
    return std::abs(angle) <= REDUCED_LIMIT ? reduce(angle) : reduce_huge(angle);
}

/// Zero, tiny, huge, infinite or NaN.
SineCosine sin_cos_apart(double angle) {
    if (std::abs(angle) < TINY) {
        return {angle, 1.0};
    }
    if (!std::isfinite(angle)) {
        return {angle - angle, angle - angle};
    }
    SineCosine result = {};
    sine_and_cosine(reduce_huge(angle), result.sine, result.cosine);
    return result;
}

/// A component or a ratio is extreme: zero, infinite, NaN, or out of arctangent()'s range.
double atan2_apart(double y, double x) {
    if (std::isnan(x) || std::isnan(y)) {
        return x + y;
    }
    if (std::isinf(x) || std::isinf(y)) {
        return atan2(std::copysign(std::isinf(y) ? 1.0 : 0.0, y),
                     std::copysign(std::isinf(x) ? 1.0 : 0.0, x));
    }
    const double x_size = std::abs(x);
    const double y_size = std::abs(y);
    const double large = larger(x_size, y_size);
    const double small = smaller(x_size, y_size);
    // On an axis, or so close to it that the angle is the axis's, or the slope.
    if (small <= large * 0x1p-70) {
        const bool is_backwards = std::signbit(x);
        if (x_size >= y_size && !is_backwards) {
            return large == 0.0 ? y : y / x;
        }
        return std::copysign(CENTRE_ANGLES[x_size < y_size ? 6 : 12], y);
    }
    const double scale = large > 1.0 ? 0x1p-600 : 0x1p600;  // exact: no component leaves the normal numbers
    return arctangent(y * scale, x * scale);
}

}  // namespace

SineCosine sin_cos(double angle) {
    if (needs_no_reduction(angle)) {
        const SineCosinePairs<double> of = sine_cosine_pairs(angle, 0.0);
        return {of.sine, of.cosine};
    }
    if (!all_within(std::abs(angle), TINY, REDUCED_LIMIT)) {
        return sin_cos_apart(angle);
    }
    SineCosine result = {};
    sine_and_cosine(reduce(angle), result.sine, result.cosine);
    return result;
}

double sin(double angle) {
    return needs_no_reduction(angle) ? sine_cosine_pairs(angle, 0.0).sine : sin_cos(angle).sine;
}

double cos(double angle) {
    return needs_no_reduction(angle) ? sine_cosine_pairs(angle, 0.0).cosine : sin_cos(angle).cosine;
}

double tan(double angle) {
    if (!(std::abs(angle) >= TINY)) {
        return angle;
    }
    if (std::isinf(angle)) {
        return angle - angle;
    }
    return tangent(reduce_any(angle));
}

double atan(double slope) {
    return atan2(slope, 1.0);
}

double atan2(double y, double x) {
    if (all_within(std::abs(x), SMALLEST_COMPONENT, LARGEST_COMPONENT) &&
        all_within(std::abs(y), SMALLEST_COMPONENT, LARGEST_COMPONENT)) {
        return arctangent(y, x);
    }
    return atan2_apart(y, x);
}

}  // namespace basalt::geo::elementary
