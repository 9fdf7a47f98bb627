// Depths of pixels, and the colours that their stored values mean.
//
// A value is what a surface stores: an index into the depth's table (1, 4, 8 bits), a 5-5-5 code (16), or the
// word 0x00RRGGBB (24 and 32; the high byte at 32 is unused). A word is a colour in that last form.
#ifndef BASALT_SRC_PLATFORM_PIXELS_PIXEL_FORMAT_H
#define BASALT_SRC_PLATFORM_PIXELS_PIXEL_FORMAT_H

#include <cstdint>
#include <span>

#include "basalt/platform/graphics_types.h"

namespace basalt::platform {

inline constexpr std::uint32_t COLOUR_BITS = 0x00FFFFFF;

constexpr bool is_depth(std::uint32_t bits) {
    return bits == 1 || bits == 4 || bits == 8 || bits == 16 || bits == 24 || bits == 32;
}

// The bits of a value that determine its colour.
constexpr std::uint32_t colour_bits(int depth) {
    return depth > 16 ? COLOUR_BITS : depth == 16 ? 0x7FFF : (std::uint32_t{1} << depth) - 1;
}

// Between a COLORREF and a word: red and blue are swapped.
constexpr std::uint32_t word_of_colour(COLORREF colour) {
    return (colour & 0xFF) << 16 | (colour & 0xFF00) | (colour >> 16 & 0xFF);
}
constexpr COLORREF colour_of_word(std::uint32_t word) {
    return word_of_colour(word);
}

// Five bits to eight, the top bits repeated below, and back to the nearest level.
constexpr std::uint32_t word_of_555(std::uint32_t code) {
    const std::uint32_t high = (code & 0x7C00) << 9 | (code & 0x3E0) << 6 | (code & 0x1F) << 3;
    return high | (high >> 5 & 0x070707);
}
constexpr std::uint32_t nearest_555(std::uint32_t word) {
    const auto level = [word](int shift) { return ((word >> shift & 0xFF) * 31 + 127) / 255; };
    return level(16) << 10 | level(8) << 5 | level(0);
}
// The upper five bits of each channel.
constexpr std::uint32_t truncated_555(std::uint32_t word) {
    return (word >> 9 & 0x7C00) | (word >> 6 & 0x3E0) | (word >> 3 & 0x1F);
}

// The words of a depth's table; empty above 8 bits.
std::span<const std::uint32_t> colour_table(int depth);

// The colour of a value.
std::uint32_t word_of_value(int depth, std::uint32_t value);

// The value whose colour is nearest to a word: the least sum of squared channel differences, the first of
// equals. At 16 bits the level of each channel is rounded.
std::uint32_t value_of_word(int depth, std::uint32_t word);
inline std::uint32_t value_of_colour(int depth, COLORREF colour) {
    return value_of_word(depth, word_of_colour(colour));
}

// Converts values of one depth to another.
class ValueConverter {
public:
    // For reading a picture: each value to the nearest colour.
    ValueConverter(int from, int to);
    // For a copy between contexts: from monochrome by the destination's text and background colours, to
    // monochrome by the source's background colour.
    ValueConverter(int from, int to, COLORREF text, COLORREF background, COLORREF source_background);

    // Converts values in place.
    void convert(std::span<std::uint32_t> values) const;

private:
    int m_from;
    int m_to;
    bool m_by_background = false;
    std::uint32_t m_background = 0;  // the source's value for it
    std::uint32_t m_table[256];      // for sources of up to 8 bits; the rest is unset
};

}  // namespace basalt::platform

#endif
