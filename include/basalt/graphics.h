/// @file
/// Colours, drawing and bitmaps.
///
/// A colour is 0x00BBGGRR: red in the low byte, then green, then blue.
#ifndef BASALT_GRAPHICS_H
#define BASALT_GRAPHICS_H

#include "basalt/graphics/bitmap_functions.h"
#include "basalt/graphics/drawing_functions.h"
#include "basalt/graphics/palette.h"

#endif
