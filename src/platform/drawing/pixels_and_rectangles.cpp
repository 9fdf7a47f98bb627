// Single pixels and filled rectangles.
#include <cmath>
#include <utility>

#include "basalt/platform/drawing.h"
#include "basalt/platform/error.h"
#include "src/platform/drawing/drawing_target.h"
#include "src/platform/pixel_format.h"
#include "src/platform/pixels/pixel_rows.h"

namespace {

using basalt::platform::AffineRows;
using basalt::platform::Context;
using basalt::platform::object_of;
using basalt::platform::Surface;

// The pixel nearest to a point of the context's own coordinates.
std::pair<double, double> pixel_at(const Context& context, int x, int y) {
    return {std::floor(context.world.x_of(x, y) + 0.5), std::floor(context.world.y_of(x, y) + 0.5)};
}

// The surface and pixel that a point of a context leads to; a null surface where there is none.
struct Place {
    Surface* surface = nullptr;
    int x = 0;
    int y = 0;

    Place(HDC dc, int point_x, int point_y) {
        auto* const context = object_of<Context>(dc);
        if (context == nullptr) {
            return;
        }
        Surface& whole = context->surface();
        const auto [pixel_x, pixel_y] = pixel_at(*context, point_x, point_y);
        if (pixel_x >= 0 && pixel_x < whole.width && pixel_y >= 0 && pixel_y < whole.height) {
            surface = &whole;
            x = static_cast<int>(pixel_x);
            y = static_cast<int>(pixel_y);
        } else {
            SetLastError(ERROR_INVALID_PARAMETER);
        }
    }
};

COLORREF colour_at(const Surface& surface, int x, int y) {
    const std::uint32_t value = basalt::platform::read_pixel(surface.depth, surface.row(y), x);
    return basalt::platform::colour_of_word(basalt::platform::word_of_value(surface.depth, value));
}

void fill_box(Surface& surface, const basalt::platform::Box& box, std::uint32_t value) {
    const RECT part = basalt::platform::part_on(surface, box);
    for (int y = part.top; y < part.bottom; ++y) {
        basalt::platform::fill_pixels(surface.depth, surface.row(y), part.left, part.right - part.left,
                                      value);
    }
}

// Fills what the context's transform makes of a rectangle.
BOOL fill_parallelogram(Context& context, const RECT& rectangle, std::uint32_t value) {
    const std::optional<AffineRows> rows = AffineRows::create(
        *context.world.inverse(), rectangle.left, rectangle.top, rectangle.right, rectangle.bottom);
    if (!rows) {
        SetLastError(ERROR_ARITHMETIC_OVERFLOW);
        return 0;
    }
    Surface& surface = context.surface();
    rows->on(surface, [&](int y, const AffineRows::Run& run) {
        basalt::platform::fill_pixels(surface.depth, surface.row(y), run.begin, run.end - run.begin, value);
    });
    return 1;
}

}  // namespace

COLORREF GetPixel(HDC dc, int x, int y) {
    const Place place(dc, x, y);
    return place.surface != nullptr ? colour_at(*place.surface, place.x, place.y) : CLR_INVALID;
}

COLORREF SetPixel(HDC dc, int x, int y, COLORREF colour) {
    const Place place(dc, x, y);
    if (place.surface == nullptr) {
        return CLR_INVALID;
    }
    Surface& surface = *place.surface;
    basalt::platform::fill_pixels(surface.depth, surface.row(place.y), place.x, 1,
                                  basalt::platform::value_of_colour(surface.depth, colour));
    return colour_at(surface, place.x, place.y);
}

int FillRect(HDC dc, const RECT* rectangle, HBRUSH brush) {
    auto* const context = object_of<Context>(dc);
    if (context == nullptr) {
        return 0;
    }
    if (rectangle == nullptr) {
        SetLastError(ERROR_INVALID_PARAMETER);
        return 0;
    }
    const std::optional<basalt::platform::Paint> paint =
        basalt::platform::paint_of(brush, basalt::platform::GraphicsKind::BRUSH);
    if (!paint) {
        return 0;
    }
    if (!paint->draws) {
        return 1;
    }
    Surface& surface = context->surface();
    const std::uint32_t value = basalt::platform::value_of_colour(surface.depth, paint->colour);
    if (const auto shift = basalt::platform::whole_pixel_shift(*context)) {
        fill_box(surface, basalt::platform::shifted(*rectangle, *shift), value);
        return 1;
    }
    return fill_parallelogram(*context, *rectangle, value);
}
