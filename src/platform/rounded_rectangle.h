// What lies outside a rectangle's rounded corners.
#ifndef BASALT_SRC_PLATFORM_ROUNDED_RECTANGLE_H
#define BASALT_SRC_PLATFORM_ROUNDED_RECTANGLE_H

#include "basalt/platform/device_context.h"
#include "basalt/platform/graphics_types.h"

namespace basalt::platform {

// Fills what of a rectangle RoundRect with an ellipse of this diameter leaves out. Draws nothing where the
// surface stores the colour as it stores the key, or where the context's transform is more than a shift by
// whole pixels. Time grows with the surface, not with the rectangle.
void fill_outside_rounding(HDC dc, const RECT& rectangle, int diameter, COLORREF colour, COLORREF key);

}  // namespace basalt::platform

#endif
