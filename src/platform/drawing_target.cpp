#include "src/platform/drawing_target.h"

#include <cmath>

#include "basalt/platform/error.h"

namespace basalt::platform {

std::optional<PixelShift> whole_pixel_shift(const Context& context) {
    const Affine& world = context.world;
    const Affine shift = Affine::shift(std::trunc(world.dx), std::trunc(world.dy));
    // Beyond this nothing can be on a surface, and sums with coordinates stay far from overflow.
    constexpr double FARTHEST = 0x1p40;
    if (world != shift || std::fabs(world.dx) > FARTHEST || std::fabs(world.dy) > FARTHEST) {
        return std::nullopt;
    }
    return PixelShift{static_cast<std::int64_t>(world.dx), static_cast<std::int64_t>(world.dy)};
}

std::optional<PixelShift> required_shift(const Context& context) {
    const std::optional<PixelShift> shift = whole_pixel_shift(context);
    if (!shift) {
        SetLastError(ERROR_NOT_SUPPORTED);
    }
    return shift;
}

}  // namespace basalt::platform
