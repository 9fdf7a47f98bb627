// Where a call draws to or copies from: a context's surface, and the way there from the call's coordinates.
#ifndef BASALT_SRC_PLATFORM_DRAWING_DRAWING_TARGET_H
#define BASALT_SRC_PLATFORM_DRAWING_DRAWING_TARGET_H

#include <cstdint>
#include <optional>

#include "src/platform/drawing/graphics_object_kinds.h"

namespace basalt::platform {

struct PixelShift {
    std::int64_t x;
    std::int64_t y;
};

// The shift by whole pixels that a context's transform is; nothing for another transform.
std::optional<PixelShift> whole_pixel_shift(const Context& context);

// The same for calls that can do no more: ERROR_NOT_SUPPORTED for another transform.
std::optional<PixelShift> required_shift(const Context& context);

inline Box shifted(const RECT& rectangle, const PixelShift& shift) {
    return {rectangle.left + shift.x, rectangle.top + shift.y, rectangle.right + shift.x,
            rectangle.bottom + shift.y};
}

}  // namespace basalt::platform

#endif
