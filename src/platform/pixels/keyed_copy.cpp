#include "src/platform/pixels/keyed_copy.h"

#include "src/platform/pixels/pixel_format.h"

#if defined(__x86_64__)
#include <immintrin.h>
#endif

namespace basalt::platform {

void copy_words_but_key_portable(std::uint32_t* to, const std::uint32_t* from, std::size_t count,
                                 std::uint32_t key) {
    for (std::size_t i = 0; i < count; ++i) {
        to[i] = ((from[i] ^ key) & COLOUR_BITS) != 0 ? from[i] : to[i];
    }
}

#if defined(__x86_64__)

namespace {

[[gnu::target("avx2")]] void copy_words_but_key_avx2(std::uint32_t* to, const std::uint32_t* from,
                                                     std::size_t count, std::uint32_t key) {
    constexpr std::size_t LANES = 8;
    const __m256i colour = _mm256_set1_epi32(static_cast<int>(COLOUR_BITS));
    const __m256i left_out = _mm256_set1_epi32(static_cast<int>(key & COLOUR_BITS));
    std::size_t i = 0;
    for (; i + LANES <= count; i += LANES) {
        const __m256i words = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(from + i));
        const __m256i is_key = _mm256_cmpeq_epi32(_mm256_and_si256(words, colour), left_out);
        auto* const target = reinterpret_cast<__m256i*>(to + i);
        // Long runs of either kind are common; only a mixture needs the destination's pixels.
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

void copy_words_but_key(std::uint32_t* to, const std::uint32_t* from, std::size_t count, std::uint32_t key) {
#if defined(__x86_64__)
    if (__builtin_cpu_supports("avx2") != 0) {
        return copy_words_but_key_avx2(to, from, count, key);
    }
#endif
    copy_words_but_key_portable(to, from, count, key);
}

}  // namespace basalt::platform
