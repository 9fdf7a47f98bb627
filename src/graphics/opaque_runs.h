/// @file
/// Rows of pixels as runs of those that are not of one colour. A row becomes bits first, which are compared,
/// and searched for the ends of runs, 64 at a time.
#ifndef BASALT_SRC_GRAPHICS_OPAQUE_RUNS_H
#define BASALT_SRC_GRAPHICS_OPAQUE_RUNS_H

#include <cstddef>
#include <cstdint>
#include <span>
#include <vector>

#include "basalt/platform/graphics_types.h"

namespace basalt::graphics {

/// Words of bits for a row.
constexpr std::size_t mask_words(std::size_t pixels) {
    return (pixels + 63) / 64;
}

/// One bit a pixel, the first in bit 0: whether it differs from the key. Bits behind the last pixel are 0.
/// @param pixels the row
/// @param key the colour, as pixels hold it
/// @param[out] mask mask_words(pixels.size()) words
void mask_opaque(std::span<const std::uint32_t> pixels, std::uint32_t key, std::uint64_t* mask);
void mask_opaque(std::span<const std::uint16_t> pixels, std::uint16_t key, std::uint64_t* mask);

/// Appends a rectangle from row `top` to `bottom` (excluded) for every run of bits, left to right.
void append_runs(std::span<const std::uint64_t> mask, int top, int bottom, std::vector<RECT>& rectangles);

}  // namespace basalt::graphics

#endif
