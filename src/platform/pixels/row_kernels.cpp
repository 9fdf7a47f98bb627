#include "src/platform/pixels/row_kernels.h"

#include <algorithm>

#include "src/platform/pixel_format.h"

#if defined(__x86_64__)
#define BASALT_HAS_AVX2_FORM 1
#include <immintrin.h>
#else
#define BASALT_HAS_AVX2_FORM 0
#endif

namespace basalt::platform {

#if BASALT_HAS_AVX2_FORM

namespace {

constexpr std::size_t LANES = 8;

[[gnu::target("avx2")]] void fill_words_avx2(std::uint32_t* to, std::size_t count, std::uint32_t word) {
    const __m256i words = _mm256_set1_epi32(static_cast<int>(word));
    std::size_t i = 0;
    for (; i + 4 * LANES <= count; i += 4 * LANES) {
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(to + i), words);
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(to + i + LANES), words);
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(to + i + 2 * LANES), words);
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(to + i + 3 * LANES), words);
    }
    std::fill(to + i, to + count, word);
}

[[gnu::target("avx2")]] void copy_words_but_key_avx2(std::uint32_t* to, const std::uint32_t* from,
                                                     std::size_t count, std::uint32_t key) {
    const __m256i telling = _mm256_set1_epi32(static_cast<int>(COLOUR_BITS));
    const __m256i left_out = _mm256_set1_epi32(static_cast<int>(key & COLOUR_BITS));
    std::size_t i = 0;
    for (; i + LANES <= count; i += LANES) {
        const __m256i words = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(from + i));
        const __m256i is_key = _mm256_cmpeq_epi32(_mm256_and_si256(words, telling), left_out);
        auto* const target = reinterpret_cast<__m256i*>(to + i);
        // Long runs of either kind are the rule: they need no look at what is there.
        if (_mm256_testz_si256(is_key, is_key) != 0) {
            _mm256_storeu_si256(target, words);
        } else if (_mm256_movemask_epi8(is_key) != -1) {
            _mm256_storeu_si256(target, _mm256_blendv_epi8(words, _mm256_loadu_si256(target), is_key));
        }
    }
    copy_words_but_key_portable(to + i, from + i, count - i, key);
}

}  // namespace

#endif

void fill_words(std::uint32_t* to, std::size_t count, std::uint32_t word) {
#if BASALT_HAS_AVX2_FORM
    if (__builtin_cpu_supports("avx2") != 0) {
        fill_words_avx2(to, count, word);
        return;
    }
#endif
    std::fill_n(to, count, word);
}

void copy_words_but_key_portable(std::uint32_t* to, const std::uint32_t* from, std::size_t count,
                                 std::uint32_t key) {
    for (std::size_t i = 0; i < count; ++i) {
        to[i] = ((from[i] ^ key) & COLOUR_BITS) != 0 ? from[i] : to[i];
    }
}

void copy_words_but_key(std::uint32_t* to, const std::uint32_t* from, std::size_t count, std::uint32_t key) {
#if BASALT_HAS_AVX2_FORM
    if (__builtin_cpu_supports("avx2") != 0) {
        copy_words_but_key_avx2(to, from, count, key);
        return;
    }
#endif
    copy_words_but_key_portable(to, from, count, key);
}

}  // namespace basalt::platform
