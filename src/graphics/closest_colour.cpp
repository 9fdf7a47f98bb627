#include "src/graphics/closest_colour.h"

#include <algorithm>

#if defined(__x86_64__)
#include <immintrin.h>
#endif

namespace basalt::graphics {

namespace {

/// An entry's rank: its index alone if it equals the wanted colour, otherwise its distance plus 1 in the bits
/// above. The lowest rank wins, and the first of equals ranks lowest.
constexpr int INDEX_BITS = 8;
/// Three channels of at most 100 each; an entry as far away is never the nearest.
constexpr std::uint32_t LARGEST_DISTANCE = 300;
constexpr std::uint32_t NO_CANDIDATE = (LARGEST_DISTANCE + 1) << INDEX_BITS;

/// d * 100 / 255 for d from 0 to 255 is the high half of d times this.
constexpr std::uint32_t HUNDREDTHS = 25701;

constexpr bool hundredths_are_exact() {
    for (std::uint32_t d = 0; d <= 255; ++d) {
        if (d * HUNDREDTHS >> 16 != d * 100 / 255) {
            return false;
        }
    }
    return true;
}
static_assert(hundredths_are_exact());

std::uint32_t channel_distance(std::uint32_t a, std::uint32_t b, int shift) {
    const std::uint32_t x = a >> shift & 0xFF;
    const std::uint32_t y = b >> shift & 0xFF;
    return (x > y ? x - y : y - x) * HUNDREDTHS >> 16;
}

unsigned char index_of(std::uint32_t rank) {
    return static_cast<unsigned char>(rank < NO_CANDIDATE ? rank : 0);
}

#if defined(__x86_64__)

/// Eight entries at once.
[[gnu::target("avx2")]] unsigned char closest_colour_avx2(const std::uint32_t* colours,
                                                          std::uint32_t wanted) {
    const __m256i colour = _mm256_set1_epi32(static_cast<int>(wanted));
    const __m256i channels = _mm256_set1_epi32(0x00FFFFFF);
    const __m256i low_bytes = _mm256_set1_epi16(0xFF);
    const __m256i low_words = _mm256_set1_epi32(0xFFFF);
    const __m256i factor = _mm256_set1_epi16(static_cast<short>(HUNDREDTHS));
    const __m256i step = _mm256_set1_epi32(8);
    __m256i numbers = _mm256_setr_epi32(0, 1, 2, 3, 4, 5, 6, 7);
    const __m256i one = _mm256_set1_epi32(1 << INDEX_BITS);
    __m256i best = _mm256_set1_epi32(static_cast<int>(NO_CANDIDATE));
    for (int i = 0; i < PALETTE_COLOURS; i += 8) {
        const __m256i entry = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(colours + i));
        const __m256i equal = _mm256_cmpeq_epi32(entry, colour);
        const __m256i difference = _mm256_and_si256(
            _mm256_or_si256(_mm256_subs_epu8(entry, colour), _mm256_subs_epu8(colour, entry)), channels);
        const __m256i red_blue = _mm256_mulhi_epu16(_mm256_and_si256(difference, low_bytes), factor);
        const __m256i green = _mm256_mulhi_epu16(_mm256_srli_epi16(difference, 8), factor);
        const __m256i pairs = _mm256_add_epi16(red_blue, green);
        const __m256i distance =
            _mm256_add_epi32(_mm256_and_si256(pairs, low_words), _mm256_srli_epi32(pairs, 16));
        const __m256i far = _mm256_add_epi32(_mm256_slli_epi32(distance, INDEX_BITS), one);
        best = _mm256_min_epu32(best, _mm256_or_si256(_mm256_andnot_si256(equal, far), numbers));
        numbers = _mm256_add_epi32(numbers, step);
    }
    __m128i half = _mm_min_epu32(_mm256_castsi256_si128(best), _mm256_extracti128_si256(best, 1));
    half = _mm_min_epu32(half, _mm_shuffle_epi32(half, _MM_SHUFFLE(1, 0, 3, 2)));
    half = _mm_min_epu32(half, _mm_shuffle_epi32(half, _MM_SHUFFLE(2, 3, 0, 1)));
    return index_of(static_cast<std::uint32_t>(_mm_cvtsi128_si32(half)));
}

#endif

}  // namespace

unsigned char closest_colour_portable(const std::uint32_t* colours, std::uint32_t wanted) {
    std::uint32_t best = NO_CANDIDATE;
    for (std::uint32_t i = 0; i < PALETTE_COLOURS; ++i) {
        const std::uint32_t entry = colours[i];
        const std::uint32_t distance = channel_distance(entry, wanted, 0) +
                                       channel_distance(entry, wanted, 8) +
                                       channel_distance(entry, wanted, 16);
        best = std::min(best, (entry == wanted ? 0 : (distance + 1) << INDEX_BITS) | i);
    }
    return index_of(best);
}

unsigned char closest_colour(const std::uint32_t* colours, std::uint32_t wanted) {
#if defined(__x86_64__)
    if (__builtin_cpu_supports("avx2") != 0) {
        return closest_colour_avx2(colours, wanted);
    }
#endif
    return closest_colour_portable(colours, wanted);
}

}  // namespace basalt::graphics
