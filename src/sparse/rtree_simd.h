// Four numbers at a time in the compiler's vector types, with the same bits as one at a time on every
// machine.
#ifndef BASALT_SRC_SPARSE_RTREE_SIMD_H
#define BASALT_SRC_SPARSE_RTREE_SIMD_H

#include <cmath>
#include <cstring>

#if defined(__SSE2__)
#include <emmintrin.h>
#endif

namespace vex_util::rtree {

using Float4 __attribute__((vector_size(16))) = float;
using Int4 __attribute__((vector_size(16))) = int;

inline Int4 load4(const int* p) {
    Int4 v;
    std::memcpy(&v, p, sizeof v);
    return v;
}

inline Float4 load4(const float* p) {
    Float4 v;
    std::memcpy(&v, p, sizeof v);
    return v;
}

inline void store4(float* p, Float4 v) {
    std::memcpy(p, &v, sizeof v);
}

inline Int4 all4(int x) {
    return Int4{x, x, x, x};
}
inline Float4 all4(float x) {
    return Float4{x, x, x, x};
}

inline Float4 to_float(Int4 v) {
    return __builtin_convertvector(v, Float4);
}

inline Float4 min4(Float4 a, Float4 b) {
    return a < b ? a : b;
}
inline Float4 max4(Float4 a, Float4 b) {
    return a > b ? a : b;
}

inline Float4 sqrt4(Float4 v) {
#if defined(__SSE2__)
    return _mm_sqrt_ps(v);
#else
    return Float4{std::sqrt(v[0]), std::sqrt(v[1]), std::sqrt(v[2]), std::sqrt(v[3])};
#endif
}

// Bit i is element i of a comparison's result.
inline unsigned bits4(Int4 truth) {
#if defined(__SSE2__)
    return static_cast<unsigned>(_mm_movemask_ps(reinterpret_cast<__m128>(truth)));
#else
    return (truth[0] ? 1u : 0u) | (truth[1] ? 2u : 0u) | (truth[2] ? 4u : 0u) | (truth[3] ? 8u : 0u);
#endif
}

// The least and the greatest of four, in every element.
inline Float4 least4(Float4 v) {
    v = min4(v, __builtin_shufflevector(v, v, 2, 3, 0, 1));
    return min4(v, __builtin_shufflevector(v, v, 1, 0, 3, 2));
}

inline Float4 greatest4(Float4 v) {
    v = max4(v, __builtin_shufflevector(v, v, 2, 3, 0, 1));
    return max4(v, __builtin_shufflevector(v, v, 1, 0, 3, 2));
}

}  // namespace vex_util::rtree

#endif
