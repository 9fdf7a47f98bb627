/// @file
/// The search for the palette's colour nearest to another, by SIMD where the processor has it and in a
/// portable form. Both return the same result for every input.
#ifndef BASALT_SRC_GRAPHICS_CLOSEST_COLOUR_H
#define BASALT_SRC_GRAPHICS_CLOSEST_COLOUR_H

#include <cstdint>

namespace basalt::graphics {

inline constexpr int PALETTE_COLOURS = 256;

/// Index of the first of 256 colours that equals the wanted one, or else of the first nearest to it.
unsigned char closest_colour(const std::uint32_t* colours, std::uint32_t wanted);

unsigned char closest_colour_portable(const std::uint32_t* colours, std::uint32_t wanted);

}  // namespace basalt::graphics

#endif
