/// @file
/// The elementary functions where nothing is special, for one lane or four. Comments give each step's error
/// in units of u = 2^-53, half a unit in the last place of 1.
#ifndef BASALT_SRC_GEO_ELEMENTARY_KERNELS_H
#define BASALT_SRC_GEO_ELEMENTARY_KERNELS_H

#include "src/geo/elementary/coefficients.h"
#include "src/geo/elementary/exact_product.h"
#include "src/geo/elementary/lane.h"

namespace basalt::geo::elementary {

/// Angles up to this size are reduced by reduce(): 2^16 quarter turns.
inline constexpr double REDUCED_LIMIT = 102943.0;
/// Below this size sine and tangent are the angle, to 0.2 units in the last place.
inline constexpr double TINY = 0x1p-27;

/// An angle less quarter turns: high + low in [-pi/4, pi/4].
template <typename Lane>
struct Reduced {
    Lane high, low;
    Integers<Lane> quarters;  ///< their number, of which the two lowest bits count
};

/// Cody and Waite's reduction, |x| <= REDUCED_LIMIT; relative error 0.001 u at the double nearest to each of
/// the 65,536 multiples of pi/2, which fit.py enumerates, and less elsewhere.
template <typename Lane>
BASALT_INLINE Reduced<Lane> reduce(const Lane& x) {
    constexpr double ROUNDING = 0x1.8p52;  // added to it, a number becomes an integer
    const Lane shifted = x * TWO_OVER_PI + ROUNDING;
    const Lane quarters = shifted - ROUNDING;
    const Lane rest =
        x - quarters * HALF_PI_PARTS[0];  // exact: both within a factor of 2, the product has 53 bits
    const Lane second = quarters * HALF_PI_PARTS[1];  // exact
    const Lane high = rest - second;
    const Lane low = (rest - high - second) - quarters * HALF_PI_PARTS[2];
    return {high, low, bits_of(shifted)};
}

/// A sine and a cosine, each rounded, with the rest: the sums are within 0.15 u.
template <typename Lane>
struct SineCosinePairs {
    Lane sine, sine_low, cosine, cosine_low;
};

/// Of high + low in [-pi/4, pi/4].
template <typename Lane>
BASALT_INLINE SineCosinePairs<Lane> sine_cosine_pairs(const Lane& high, const Lane& low) {
    constexpr double ROUNDING = 0x1.8p40;  // to multiples of 2^-12
    // -1/6 in two parts; products of the first with cubes of 12 bits are exact.
    constexpr double SIXTH = -0x1.5555p-3;
    constexpr double SIXTH_LOW = SINE[0] - SIXTH;
    const Lane head = (high + ROUNDING) - ROUNDING;  // 12 bits
    const Lane tail = (high - head) + low;           // below 2^-12
    const Lane both = high + head;
    const Lane head2 = head * head;  // exact
    const Lane cube = head2 * head;  // exact
    const Lane x2 = high * high;
    const Lane x4 = x2 * x2;

    // sin = head + tail - head^3 / 6 - ...: high - head^3 / 6 is formed without error (high is the larger),
    // the others are at most 0.0026 with an error of 4 u of it. 0.03 u of the result in all.
    const Lane sixth = SIXTH * cube;  // exact
    const Lane sine_main = high + sixth;
    const Lane s = (SINE[1] + x2 * SINE[2]) + x4 * ((SINE[3] + x2 * SINE[4]) + x4 * SINE[5]);
    const Lane cube_rest = SINE[0] * (tail * (head2 + high * both)) + (low + SIXTH_LOW * cube);
    const Lane sine_rest = (((high - sine_main) + sixth) + cube_rest) + (high * x4) * s;

    // cos = 1 - head^2 / 2 - tail (head + tail / 2) + x^4 C: the first two terms are exact and at least 0.69,
    // the others are at most 0.016 with an error of 5 u of it; low in x^4 is left out, 0.04 u. 0.12 u in all.
    const Lane cosine_main = 1.0 - 0.5 * head2;
    const Lane c = (COSINE[0] + x2 * COSINE[1]) +
                   x4 * ((COSINE[2] + x2 * COSINE[3]) + x4 * (COSINE[4] + x2 * COSINE[5]));
    const Lane cosine_rest = x4 * c - tail * (0.5 * both);

    const Lane sine = sine_main + sine_rest;
    const Lane cosine = cosine_main + cosine_rest;
    return {sine, (sine_main - sine) + sine_rest, cosine, (cosine_main - cosine) + cosine_rest};
}

/// Sine and cosine of a reduced angle and its quarter turns.
template <typename Lane>
BASALT_INLINE void sine_and_cosine(const Reduced<Lane>& angle, Lane& sine, Lane& cosine) {
    const SineCosinePairs<Lane> of = sine_cosine_pairs(angle.high, angle.low);
    const Integers<Lane> s = bits_of(of.sine);
    const Integers<Lane> c = bits_of(of.cosine);
    const Integers<Lane> swap = (s ^ c) & -(angle.quarters & 1);  // odd quarters exchange the two
    sine = from_bits<Lane>((s ^ swap) ^ ((angle.quarters << 62) & SIGN));
    cosine = from_bits<Lane>((c ^ swap) ^ (((angle.quarters + 1) << 62) & SIGN));
}

/// Tangent of a reduced angle and its quarter turns.
template <typename Lane>
BASALT_INLINE Lane tangent(const Reduced<Lane>& angle) {
    const SineCosinePairs<Lane> of = sine_cosine_pairs(angle.high, angle.low);
    // sin / cos, or after an odd number of quarters -cos / sin.
    const auto is_odd = (angle.quarters & 1) != 0;
    const Lane n = is_odd ? -of.cosine : of.sine;
    const Lane n_low = is_odd ? -of.cosine_low : of.sine_low;
    const Lane d = is_odd ? of.sine : of.cosine;
    const Lane d_low = is_odd ? of.sine_low : of.cosine_low;
    // The quotient of the first parts, corrected by what it leaves: 0.04 u from n and d, 1 u from the last
    // rounding.
    const Lane q = n / d;
    return q + ((n_low - q * d_low) - product_less<Lane>(q, d, n)) / d;
}

/// Components of a direction are between these for arctangent(): no product overflows or loses digits.
inline constexpr double SMALLEST_COMPONENT = 0x1p-400;
inline constexpr double LARGEST_COMPONENT = 0x1p400;

/// Angle of the direction (x, y). Signs and the diagonal leave small / large in [0, 1]; of it the nearest
/// centre of slope 0, 1/2 or 1 leaves a slope of at most 1/4, whose arctangent is a polynomial.
template <typename Lane>
BASALT_INLINE Lane arctangent(const Lane& y, const Lane& x) {
    constexpr double CENTRES[3] = {0.0, 0.5, 1.0};
    const Lane x_size = size_of(x);
    const Lane y_size = size_of(y);
    const Lane large = larger(x_size, y_size);
    const Lane small = smaller(x_size, y_size);
    const Integers<Lane> beyond_diagonal = is_less(x_size, y_size);
    const Integers<Lane> backwards = (bits_of(x) >> 63) & 1;
    const Integers<Lane> segment = is_less<Lane>(large * 0.25, small) + is_less<Lane>(large * 0.7675, small);

    // Slope from the centre: n / (d + d_low), all three exact (n, as its terms are within a factor of 2).
    // Signs are taken in here, where they delay nothing.
    const Integers<Lane> y_sign = bits_of(y) & SIGN;
    const Integers<Lane> slope_sign = y_sign ^ ((beyond_diagonal ^ backwards) << 63);
    const Lane centre = lookup<Lane>(CENTRES, segment);
    const Lane n = from_bits<Lane>(bits_of(small - centre * large) ^ slope_sign);
    const Lane turned = centre * small;
    const Lane d = large + turned;
    const Lane d_low = (large - d) + turned;
    // Its quotient in two parts, from one division: the first has 26 bits, so that the remainder is exact up
    // to d_low's term; the second has an error of 4 u of it, 2^-24 u of the slope.
    const Lane inverse = 1.0 / d;
    const Lane first = head_of(n * inverse);
    const Lane d_head = head_of(d);
    const Lane remainder = (n - first * d_head) - first * ((d - d_head) + d_low);
    const Lane second = remainder * inverse;
    const Lane slope = first + second;
    const Lane slope_low = (first - slope) + second;

    // atan = slope + slope^3 A(slope^2): the second term is at most 0.0053, with an error of 4 u of it.
    const Lane t2 = slope * slope;
    const Lane t4 = t2 * t2;
    const Lane a = ((ARCTANGENT[0] + t2 * ARCTANGENT[1]) + t4 * (ARCTANGENT[2] + t2 * ARCTANGENT[3])) +
                   (t4 * t4) * ((ARCTANGENT[4] + t2 * ARCTANGENT[5]) +
                                t4 * ((ARCTANGENT[6] + t2 * ARCTANGENT[7]) + t4 * ARCTANGENT[8]));

    // To the centre's angle, 0 or larger than that, the slope is added without error.
    const Integers<Lane> at = (segment + 3 * beyond_diagonal + 6 * backwards) * 2;
    const Lane angle = from_bits<Lane>(bits_of(lookup<Lane>(CENTRE_ANGLES, at)) ^ y_sign);
    const Lane angle_low = from_bits<Lane>(bits_of(lookup<Lane>(CENTRE_ANGLES + 1, at)) ^ y_sign);
    const Lane sum = angle + slope;
    const Lane sum_low = ((angle - sum) + slope) + (angle_low + (slope_low - slope_low * t2));
    return sum + (sum_low + (slope * t2) * a);
}

}  // namespace basalt::geo::elementary

#endif
