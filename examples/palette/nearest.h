// A picture in the palette's colours.
#ifndef PALETTE_NEAREST_H
#define PALETTE_NEAREST_H

#include <basalt/graphics.h>

#include <cstdint>

#include "canvas.h"

struct Matched {
    Canvas picture;
    std::int64_t pixels;
    int colours_used;
    double mean_difference;  ///< over pixels and channels, of 255
    int largest_difference;  ///< in one channel, of 255
};

/// The picture with each pixel's colour replaced by the palette's nearest.
Matched match(const Canvas& picture, const ColorPalette& palette);

#endif
