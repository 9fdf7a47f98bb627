/// @file
/// A copy that leaves one colour out, and a gradient with rounded corners. basalt/graphics.h has what holds
/// for all of graphics.
///
/// Both choose their method by the operating-system code as it is stored, which is 0 until _operatingsystem
/// has been called. Threads: those that may use the contexts.
#ifndef BASALT_GRAPHICS_DRAWING_FUNCTIONS_H
#define BASALT_GRAPHICS_DRAWING_FUNCTIONS_H

#include <cstdint>

#include "basalt/export.h"
#include "basalt/platform/graphics_types.h"

/// Copies a rectangle except the pixels of one colour.
/// @param dest,xDest,yDest,wDest,hDest context and rectangle copied to, pixels
/// @param src,xSrc,ySrc,wSrc,hSrc context and rectangle copied from, pixels
/// @param transparentColour the colour left out, 0x00BBGGRR
/// @return code 5 or more: the result of ::TransparentBlt, which stretches where the sizes differ. Code 2 to
/// 4: always 0; wSrc x hSrc pixels are combined by masks, wDest and hDest are ignored, and nothing is drawn
/// when out of memory or when the source cannot be read. Below 2: the result of ::BitBlt with SRCAND from the
/// source's origin; only the destination's rectangle counts.
BASALT_API int _transparentblt(HDC dest, int xDest, int yDest, int wDest, int hDest, HDC src, int xSrc,
                               int ySrc, int wSrc, int hSrc, unsigned int transparentColour);

/// Fills a rectangle with a gradient from a colour to a darker one. Draws nothing with a code below 5.
/// @param hdc context drawn on
/// @param left,top,right,bottom the rectangle, without its right column and bottom row
/// @param cornerRadius above 0: the diameter in pixels (twice the radius) of the circle that rounds each
/// corner, clamped to the rectangle's sides. Otherwise the corners stay square.
/// @param cornerColour colour outside the rounding, 0x00BBGGRR; 0x808080 leaves the gradient there
/// @param colour where the gradient starts, 0x00BBGGRR
/// @param darkening divisor of the start's channels where the gradient ends; 1 gives one colour. The end of a
/// channel, 8.8, is clamped to 0 to 0xFFFF, also for darkening below 1; it is 0 where it is not a number.
/// @param mode 0 from left to right, 1 from top to bottom; passed to ::GradientFill, which draws nothing for
/// another
///
/// At 16 bits a pixel a channel of the gradient is truncated to its 5 bits, where other drawing rounds.
/// Corners need a right side right of the left one and a bottom below the top; the gradient alone takes
/// opposite sides in any order.
BASALT_API void _gradientfill(HDC hdc, int left, int top, int right, int bottom, int cornerRadius,
                              std::uint32_t cornerColour, std::uint32_t colour, float darkening,
                              std::uint32_t mode);

#endif
