#include "src/graphics/opaque_runs.h"

#include <algorithm>
#include <bit>

#if defined(__SSE2__)
#define BASALT_HAS_SSE2_FORM 1
#include <emmintrin.h>
#else
#define BASALT_HAS_SSE2_FORM 0
#endif

namespace basalt::graphics {

namespace {

constexpr std::size_t WORD_BITS = 64;

template <class Pixel>
std::uint64_t opaque_bits(const Pixel* pixels, std::size_t count, Pixel key) {
    std::uint64_t bits = 0;
    for (std::size_t i = 0; i < count; ++i) {
        bits |= std::uint64_t{pixels[i] != key} << i;
    }
    return bits;
}

#if BASALT_HAS_SSE2_FORM

__m128i load(const void* pixels) {
    return _mm_loadu_si128(static_cast<const __m128i*>(pixels));
}

/// Sixteen pixels at once: all ones in the byte of each that is of the key's colour.
__m128i equal_bytes(const std::uint32_t* pixels, __m128i key) {
    const __m128i low =
        _mm_packs_epi32(_mm_cmpeq_epi32(load(pixels), key), _mm_cmpeq_epi32(load(pixels + 4), key));
    const __m128i high =
        _mm_packs_epi32(_mm_cmpeq_epi32(load(pixels + 8), key), _mm_cmpeq_epi32(load(pixels + 12), key));
    return _mm_packs_epi16(low, high);
}

__m128i equal_bytes(const std::uint16_t* pixels, __m128i key) {
    return _mm_packs_epi16(_mm_cmpeq_epi16(load(pixels), key), _mm_cmpeq_epi16(load(pixels + 8), key));
}

__m128i in_all_lanes(std::uint32_t key) {
    return _mm_set1_epi32(static_cast<int>(key));
}

__m128i in_all_lanes(std::uint16_t key) {
    return _mm_set1_epi16(static_cast<short>(key));
}

template <class Pixel>
std::uint64_t opaque_word(const Pixel* pixels, Pixel key) {
    const __m128i keys = in_all_lanes(key);
    std::uint64_t equal = 0;
    for (std::size_t i = 0; i < WORD_BITS; i += 16) {
        const auto bits = static_cast<unsigned>(_mm_movemask_epi8(equal_bytes(pixels + i, keys)));
        equal |= std::uint64_t{bits} << i;
    }
    return ~equal;
}

#else

template <class Pixel>
std::uint64_t opaque_word(const Pixel* pixels, Pixel key) {
    return opaque_bits(pixels, WORD_BITS, key);
}

#endif

template <class Pixel>
void mask_row(std::span<const Pixel> pixels, Pixel key, std::uint64_t* mask) {
    std::size_t i = 0;
    for (; i + WORD_BITS <= pixels.size(); i += WORD_BITS) {
        *mask++ = opaque_word(pixels.data() + i, key);
    }
    if (i < pixels.size()) {
        *mask = opaque_bits(pixels.data() + i, pixels.size() - i, key);
    }
}

}  // namespace

void mask_opaque(std::span<const std::uint32_t> pixels, std::uint32_t key, std::uint64_t* mask) {
    mask_row(pixels, key, mask);
}

void mask_opaque(std::span<const std::uint16_t> pixels, std::uint16_t key, std::uint64_t* mask) {
    mask_row(pixels, key, mask);
}

void append_runs(std::span<const std::uint64_t> mask, int top, int bottom, std::vector<RECT>& rectangles) {
    RECT run = {0, top, 0, bottom};
    bool is_open = false;
    int column = 0;
    for (const std::uint64_t word : mask) {
        // A bit of its own wherever a pixel differs from the one before.
        std::uint64_t changes = word ^ (word << 1 | std::uint64_t{is_open});
        for (; changes != 0; changes &= changes - 1) {
            const int at = column + std::countr_zero(changes);
            if (is_open) {
                run.right = at;
                rectangles.push_back(run);
            } else {
                run.left = at;
            }
            is_open = !is_open;
        }
        column += static_cast<int>(WORD_BITS);
    }
    if (is_open) {
        run.right = column;
        rectangles.push_back(run);
    }
}

}  // namespace basalt::graphics
