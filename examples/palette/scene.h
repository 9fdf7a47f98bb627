// A generated scene with the smooth gradients of a photograph, and the same in the palette's colours.
#ifndef PALETTE_SCENE_H
#define PALETTE_SCENE_H

#include <basalt/graphics.h>

#include <cstdint>

#include "drawing.h"

/// Evening sky and hills in haze, the same on every run.
Canvas make_scene(int width, int height);

struct Matched {
    Canvas picture;
    std::int64_t pixels;
    int colours_used;
    double mean_difference;  ///< over pixels and channels, of 255
};

/// The picture with each pixel's colour replaced by the palette's nearest.
Matched match(const Canvas& picture, const ColorPalette& palette);

#endif
