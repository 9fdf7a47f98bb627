#include "src/geo/elementary/huge_angle.h"

#include <cstddef>

#include "src/geo/elementary/exact_product.h"

namespace basalt::geo::elementary {

// The angle is m 2^e with a 53-bit m, so words of 2/pi whose products with it are multiples of 4 quarters can
// be left out. Seven words from there keep the error of the fraction below 2^-137; no double is nearer than
// 2^-62 to a multiple of pi/2.
Reduced<double> reduce_huge(double angle) {
    constexpr std::size_t WORDS = 7;
    const auto bits = static_cast<std::uint64_t>(bits_of(angle));
    const std::uint64_t mantissa = (bits & 0xFFFFFFFFFFFFFU) | 0x10000000000000U;
    // TWO_OVER_PI_WORDS begins with two words of 0, so this is at least 0: e >= -36 and e + 62 counts its
    // bits.
    const std::size_t skipped = (bits >> 52 & 0x7FFU) - 1075 + 62;
    const std::size_t first = skipped / 32;
    // m shifted left by what is left of e, in three words from the lowest.
    const std::size_t shift = skipped % 32;
    const std::uint64_t low = (mantissa & 0xFFFFFFFFU) << shift;
    const std::uint64_t high = ((mantissa >> 32) << shift) + (low >> 32);
    const std::uint64_t multiplier[3] = {low & 0xFFFFFFFFU, high & 0xFFFFFFFFU, high >> 32};

    // Quarters as a fixed-point number modulo 4: the topmost two bits of the last word are whole.
    std::uint64_t quarters[WORDS] = {};  // 32 bits each, from the lowest
    for (std::size_t i = 0; i < 3; ++i) {
        std::uint64_t carry = 0;
        for (std::size_t k = 0; i + k < WORDS; ++k) {
            carry += quarters[i + k] + multiplier[i] * TWO_OVER_PI_WORDS[first + WORDS - 1 - k];
            quarters[i + k] = carry & 0xFFFFFFFFU;
            carry >>= 32;
        }
    }
    const std::uint64_t whole = (quarters[6] + 0x20000000U) >> 30;  // to the nearest
    const double part = static_cast<double>(static_cast<std::int64_t>(quarters[6] - (whole << 30))) * 0x1p-30;
    const double next = static_cast<double>(quarters[5]) * 0x1p-62;
    const double last =
        static_cast<double>(quarters[4]) * 0x1p-94 + static_cast<double>(quarters[3]) * 0x1p-126;
    const double sum = part + next;
    const double fraction = sum + last;
    const double fraction_low = ((part - sum) + next) + ((sum - fraction) + last);

    const double product = fraction * HALF_PI_SUM[0];
    const double rest = product_less(fraction, HALF_PI_SUM[0], product) +
                        (fraction * HALF_PI_SUM[1] + fraction_low * HALF_PI_SUM[0]);
    const double high_part = product + rest;
    const double low_part = (product - high_part) + rest;
    const auto count = static_cast<std::int64_t>(whole);
    return angle < 0.0 ? Reduced<double>{-high_part, -low_part, -count}
                       : Reduced<double>{high_part, low_part, count};
}

}  // namespace basalt::geo::elementary
