/// @file
/// Drawing beyond the platform's own calls: a copy that leaves one colour out, and a gradient with rounded
/// corners. What holds for all of graphics is said in basalt/graphics.h.
///
/// Both choose their way by the operating-system code as it is stored: until something asks for it
/// (_operatingsystem), it is 0. Threads: those that may use the contexts given.
#ifndef BASALT_GRAPHICS_DRAWING_H
#define BASALT_GRAPHICS_DRAWING_H

#include <cstdint>

#include "basalt/export.h"
#include "basalt/platform/graphics_types.h"

/// Copies a rectangle but for the pixels of one colour.
/// @param dest,xDest,yDest,wDest,hDest context and rectangle copied to, pixels
/// @param src,xSrc,ySrc,wSrc,hSrc context and rectangle copied from, pixels
/// @param transparentColour the colour left out, 0x00BBGGRR
/// @return with code 5 or more the result of ::TransparentBlt, which does it all and stretches where the
/// sizes differ. With 2 to 4 always 0: wSrc x hSrc pixels are combined by masks, wDest and hDest play no
/// part, and without memory for the masks or a source that can be read nothing is drawn. Below 2 the result
/// of ::BitBlt with SRCAND from the source's origin: only the destination's rectangle plays a part.
BASALT_API int _transparentblt(HDC dest, int xDest, int yDest, int wDest, int hDest, HDC src, int xSrc,
                               int ySrc, int wSrc, int hSrc, unsigned int transparentColour);

/// Fills a rectangle with a gradient from a colour to a darker one. Nothing with a code below 5.
/// @param hdc context drawn on
/// @param left,top,right,bottom the rectangle, without its right column and bottom row
/// @param cornerRadius above 0: diameter in pixels, and so twice the radius, of the circle that rounds each
/// corner; more than a side of the rectangle is cut to that side. Else the corners stay square.
/// @param cornerColour what lies outside the rounding, 0x00BBGGRR; 0x808080 leaves the gradient there
/// @param colour where the gradient starts, 0x00BBGGRR
/// @param darkening by what the start's channels are divided where the gradient ends: 1 gives one colour. A
/// channel ends within 0 and 0xFFFF, 8.8, also for darkening below 1, and at 0 where it is no number.
/// @param mode 0 from left to right, 1 from top to bottom; handed on to ::GradientFill, which draws nothing
/// for another
///
/// At 16 bits a pixel a channel of the gradient is cut to its 5 bits, where other drawing takes the nearest.
/// Corners need a right side right of the left one and a bottom below the top; the gradient alone takes
/// opposite sides in any order.
BASALT_API void _gradientfill(HDC hdc, int left, int top, int right, int bottom, int cornerRadius,
                              std::uint32_t cornerColour, std::uint32_t colour, float darkening,
                              std::uint32_t mode);

#endif
