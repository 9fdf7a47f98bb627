// A small font of pixels: digits, capital letters and the signs that figures need.
#ifndef EXAMPLES_PIXEL_FONT_H
#define EXAMPLES_PIXEL_FONT_H

#include <array>
#include <cstdint>

inline constexpr int GLYPH_WIDTH = 5;
inline constexpr int GLYPH_HEIGHT = 7;

/// A character's rows, top first, the left pixel in bit 4.
using Glyph = std::array<std::uint8_t, GLYPH_HEIGHT>;

/// Small letters look like capitals; a character without a glyph is a blank.
const Glyph& glyph(char character);

#endif
