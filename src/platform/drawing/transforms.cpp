// Coordinates of a context: mapping and graphics mode, and the transform.
#include <cmath>
#include <limits>
#include <optional>
#include <utility>

#include "basalt/platform/device_context.h"
#include "src/platform/drawing/objects.h"
#include "src/platform/system/failure.h"

namespace {

using namespace basalt::platform;

bool fits(double value) {
    return value >= std::numeric_limits<LONG>::min() && value <= std::numeric_limits<LONG>::max();
}

std::optional<Affine> affine_of(const XFORM* transform) {
    if (transform == nullptr) {
        return std::nullopt;
    }
    return Affine{transform->eM11, transform->eM12, transform->eM21,
                  transform->eM22, transform->eDx,  transform->eDy};
}

// Sets a transform where the mode permits one and it can be undone.
BOOL set_world(Context& context, const std::optional<Affine>& world) {
    if (context.graphics_mode != GM_ADVANCED || !world || !world->inverse()) {
        return fail_with(ERROR_INVALID_PARAMETER, 0);
    }
    context.world = *world;
    return 1;
}

}  // namespace

int SetMapMode(HDC dc, int mode) {
    auto* const context = object_of<Context>(dc);
    if (context == nullptr) {
        return 0;
    }
    if (mode != MM_TEXT && mode != MM_ANISOTROPIC) {
        return fail_with(ERROR_INVALID_PARAMETER, 0);
    }
    return std::exchange(context->map_mode, mode);
}

int GetMapMode(HDC dc) {
    const auto* const context = object_of<Context>(dc);
    return context != nullptr ? context->map_mode : 0;
}

BOOL DPtoLP(HDC dc, POINT* points, int count) {
    const auto* const context = object_of<Context>(dc);
    if (context == nullptr) {
        return 0;
    }
    if (count < 0 || (points == nullptr && count > 0)) {
        return fail_with(ERROR_INVALID_PARAMETER, 0);
    }
    if (context->world == Affine()) {
        return 1;
    }
    const Affine back = *context->world.inverse();  // set_world accepts no other
    const auto logical = [&back](const POINT& point) {
        return std::pair(std::floor(back.x_of(point.x, point.y) + 0.5),
                         std::floor(back.y_of(point.x, point.y) + 0.5));
    };
    for (int i = 0; i < count; ++i) {
        const auto [x, y] = logical(points[i]);
        if (!fits(x) || !fits(y)) {
            return fail_with(ERROR_ARITHMETIC_OVERFLOW, 0);
        }
    }
    for (int i = 0; i < count; ++i) {
        const auto [x, y] = logical(points[i]);
        points[i] = {static_cast<LONG>(x), static_cast<LONG>(y)};
    }
    return 1;
}

int SetGraphicsMode(HDC dc, int mode) {
    auto* const context = object_of<Context>(dc);
    if (context == nullptr) {
        return 0;
    }
    const bool is_allowed = mode == GM_COMPATIBLE ? context->world == Affine() : mode == GM_ADVANCED;
    if (!is_allowed) {
        return fail_with(ERROR_INVALID_PARAMETER, 0);
    }
    return std::exchange(context->graphics_mode, mode);
}

BOOL SetWorldTransform(HDC dc, const XFORM* transform) {
    auto* const context = object_of<Context>(dc);
    return context != nullptr ? set_world(*context, affine_of(transform)) : 0;
}

BOOL ModifyWorldTransform(HDC dc, const XFORM* transform, DWORD mode) {
    auto* const context = object_of<Context>(dc);
    if (context == nullptr) {
        return 0;
    }
    std::optional<Affine> world;
    if (mode == MWT_IDENTITY) {
        world = Affine();
    } else if (const std::optional<Affine> next = affine_of(transform)) {
        if (mode == MWT_LEFTMULTIPLY) {
            world = next->then(context->world);
        } else if (mode == MWT_RIGHTMULTIPLY) {
            world = context->world.then(*next);
        }
    }
    return set_world(*context, world);
}
