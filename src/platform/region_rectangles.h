// A region put together in one go, where one union after another would take time by the square.
#ifndef BASALT_SRC_PLATFORM_REGION_RECTANGLES_H
#define BASALT_SRC_PLATFORM_REGION_RECTANGLES_H

#include <span>

#include "basalt/platform/graphics_types.h"

namespace basalt::platform {

// A new region of all the pixels in any of the rectangles; empty and reversed ones hold none. Fast when they
// come sorted by rows of equal top and bottom, and in each from left to right without overlap. Null when
// there is no room.
HRGN create_region(std::span<const RECT> rectangles);

}  // namespace basalt::platform

#endif
