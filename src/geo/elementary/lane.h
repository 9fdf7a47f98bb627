/// @file
/// What the kernels need of a number beside + - * /: of one double, and of two or four side by side.
#ifndef BASALT_SRC_GEO_ELEMENTARY_LANE_H
#define BASALT_SRC_GEO_ELEMENTARY_LANE_H

#include <cfloat>
#include <cstdint>
#include <type_traits>

static_assert(FLT_EVAL_METHOD == 0, "each operation must round to double");

/// Inlined everywhere, so that code compiled for AVX2 takes its callees with it.
#define BASALT_INLINE [[gnu::always_inline]] inline

namespace basalt::geo::elementary {

/// Two need SSE2 or NEON, which every supported processor has; four are two pairs without AVX.
using Two __attribute__((vector_size(16))) = double;
using TwoIntegers __attribute__((vector_size(16))) = std::int64_t;
using Four __attribute__((vector_size(32))) = double;
using FourIntegers __attribute__((vector_size(32))) = std::int64_t;

template <typename Lane>
using Integers = std::conditional_t<std::is_same_v<Lane, double>, std::int64_t,
                                    std::conditional_t<std::is_same_v<Lane, Two>, TwoIntegers, FourIntegers>>;

inline constexpr std::int64_t SIGN = INT64_MIN;

/// The builtin is no call without optimisation, unlike std::bit_cast: vectors of 32 bytes never cross a call.
template <typename Lane>
BASALT_INLINE Integers<Lane> bits_of(const Lane& x) {
    return __builtin_bit_cast(Integers<Lane>, x);
}

template <typename Lane>
BASALT_INLINE Lane from_bits(const Integers<Lane>& bits) {
    return __builtin_bit_cast(Lane, bits);
}

template <typename Lane>
BASALT_INLINE Lane size_of(const Lane& x) {
    return from_bits<Lane>(bits_of(x) & ~SIGN);
}

/// The leading 26 bits of x; the rest of x takes 27.
template <typename Lane>
BASALT_INLINE Lane head_of(const Lane& x) {
    return from_bits<Lane>(bits_of(x) & -(std::int64_t{1} << 27));
}

/// 1 where a < b, else 0.
template <typename Lane>
BASALT_INLINE Integers<Lane> is_less(const Lane& a, const Lane& b) {
    return (a < b) & 1;
}

template <typename Lane>
BASALT_INLINE Lane larger(const Lane& a, const Lane& b) {
    return a < b ? b : a;
}

template <typename Lane>
BASALT_INLINE Lane smaller(const Lane& a, const Lane& b) {
    return a < b ? a : b;
}

template <typename Lane>
BASALT_INLINE Lane lookup(const double* table, const Integers<Lane>& at) {
    if constexpr (std::is_same_v<Lane, double>) {
        return table[at];
    } else if constexpr (std::is_same_v<Lane, Two>) {
        return Lane{table[at[0]], table[at[1]]};
    } else {
        return Lane{table[at[0]], table[at[1]], table[at[2]], table[at[3]]};
    }
}

/// True where `low` <= size <= `high` in all lanes; false for NaN.
template <typename Lane>
BASALT_INLINE bool all_within(const Lane& size, double low, double high) {
    const Integers<Lane> within = (size >= low) & (size <= high);
    if constexpr (std::is_same_v<Lane, double>) {
        return within != 0;
    } else if constexpr (std::is_same_v<Lane, Two>) {
        return (within[0] & within[1]) != 0;
    } else {
        return (within[0] & within[1] & within[2] & within[3]) != 0;
    }
}

}  // namespace basalt::geo::elementary

#endif
