#include "src/platform/drawing/drawing_target.h"

#include <algorithm>
#include <cmath>

#include "basalt/platform/error.h"

namespace basalt::platform {

std::optional<PixelShift> whole_pixel_shift(const Context& context) {
    const Affine& world = context.world;
    if (world != Affine::shift(std::trunc(world.dx), std::trunc(world.dy))) {
        return std::nullopt;
    }
    // Beyond this nothing can be on a surface, and sums with coordinates stay far from overflow.
    constexpr double FARTHEST = 0x1p40;
    return PixelShift{static_cast<std::int64_t>(std::clamp(world.dx, -FARTHEST, FARTHEST)),
                      static_cast<std::int64_t>(std::clamp(world.dy, -FARTHEST, FARTHEST))};
}

std::optional<PixelShift> required_shift(const Context& context) {
    const std::optional<PixelShift> shift = whole_pixel_shift(context);
    if (!shift) {
        SetLastError(ERROR_NOT_SUPPORTED);
    }
    return shift;
}

}  // namespace basalt::platform
