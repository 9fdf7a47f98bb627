// Single pixels, and rectangles filled with a brush, square or rounded.
#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <optional>

#include "basalt/platform/drawing.h"
#include "src/platform/drawing/objects.h"
#include "src/platform/pixels/pixel_format.h"
#include "src/platform/pixels/pixel_rows.h"
#include "src/platform/raster_extras.h"
#include "src/platform/system/failure.h"

namespace {

using namespace basalt::platform;

// The surface and pixel that a point of a context leads to; a null surface where there is none.
struct Place {
    Surface* surface = nullptr;
    int x = 0;
    int y = 0;

    Place(HDC dc, int point_x, int point_y) {
        auto* const context = object_of<Context>(dc);
        const std::optional<PixelShift> shift = context != nullptr ? context->required_shift() : std::nullopt;
        if (!shift) {
            return;
        }
        Surface& whole = context->surface();
        if (!whole.contains(point_x + shift->x, point_y + shift->y)) {
            SetLastError(ERROR_INVALID_PARAMETER);
            return;
        }
        surface = &whole;
        x = static_cast<int>(point_x + shift->x);
        y = static_cast<int>(point_y + shift->y);
    }
};

COLORREF colour_at(const Surface& surface, int x, int y) {
    return colour_of_word(word_of_value(surface.depth, read_pixel(surface.depth, surface.row(y), x)));
}

void fill_box(Surface& surface, const Box& box, std::uint32_t value) {
    const RECT part = part_on(surface, box);
    for (int y = part.top; y < part.bottom; ++y) {
        fill_pixels(surface.depth, surface.row(y), part.left, part.right - part.left, value);
    }
}

// A rectangle whose corners are quarters of an ellipse. A pixel belongs to it if its middle lies inside.
class RoundedBox {
public:
    RoundedBox(const Box& box, std::int64_t ellipse_width, std::int64_t ellipse_height)
        : m_box(box),
          m_width(std::min({ellipse_width, box.right - box.left, LARGEST})),
          m_height(std::min({ellipse_height, box.bottom - box.top, LARGEST})) {}

    // Columns that a row of the box leaves out at either end.
    std::int64_t inset(std::int64_t y) const {
        const std::int64_t from_edge = std::min(y - m_box.top, m_box.bottom - 1 - y);
        const std::int64_t down = m_height - (2 * from_edge + 1);  // from the middle, in half pixels
        if (down <= 0 || m_width == 0) {
            return 0;
        }
        const double ratio = static_cast<double>(down) / static_cast<double>(m_height);
        const double across = static_cast<double>(m_width) * std::sqrt(1 - ratio * ratio);
        auto columns = static_cast<std::int64_t>((static_cast<double>(m_width) - across) / 2);
        // Starts half a column short of the border, far more than the rounding error.
        while (!is_inside(columns, down)) {
            ++columns;
        }
        return columns;
    }

private:
    // Keeps the products of is_inside below 2^125.
    static constexpr std::int64_t LARGEST = 0x7FFFFFFF;

    // Whether the middle of a column, counted from the edge, is inside.
    bool is_inside(std::int64_t column, std::int64_t down) const {
        const std::int64_t across = m_width - (2 * column + 1);
        if (across <= 0) {
            return true;
        }
        const Int128 a = Int128{across} * m_height;
        const Int128 b = Int128{down} * m_width;
        const Int128 c = Int128{m_width} * m_height;
        return a * a + b * b < c * c;
    }

    Box m_box;
    std::int64_t m_width;
    std::int64_t m_height;
};

}  // namespace

void basalt::platform::fill_outside_rounding(HDC dc, const RECT& rectangle, int diameter, COLORREF colour,
                                             COLORREF key) {
    auto* const context = object_of<Context>(dc);
    const std::optional<PixelShift> shift = context != nullptr ? context->required_shift() : std::nullopt;
    if (!shift) {
        return;
    }
    Surface& surface = context->surface();
    const std::uint32_t value = value_of_colour(surface.depth, colour);
    const Box box = shifted(rectangle, *shift);
    if (box.is_empty() || value == value_of_colour(surface.depth, key)) {
        return;
    }
    const RoundedBox shape(box, diameter, diameter);
    const RECT part = part_on(surface, box);
    for (std::int64_t y = part.top; y < part.bottom; ++y) {
        const std::int64_t inset = shape.inset(y);
        fill_box(surface, {box.left, y, box.left + inset, y + 1}, value);
        fill_box(surface, {box.right - inset, y, box.right, y + 1}, value);
    }
}

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
    fill_pixels(surface.depth, surface.row(place.y), place.x, 1, value_of_colour(surface.depth, colour));
    return colour_at(surface, place.x, place.y);
}

int FillRect(HDC dc, const RECT* rectangle, HBRUSH brush) {
    auto* const context = object_of<Context>(dc);
    if (context == nullptr) {
        return 0;
    }
    if (rectangle == nullptr) {
        return fail_with(ERROR_INVALID_PARAMETER, 0);
    }
    const std::optional<Paint> paint = paint_of(brush);
    const std::optional<PixelShift> shift = paint ? context->required_shift() : std::nullopt;
    if (!shift) {
        return 0;
    }
    if (paint->draws) {
        Surface& surface = context->surface();
        fill_box(surface, shifted(*rectangle, *shift), value_of_colour(surface.depth, paint->colour));
    }
    return 1;
}

BOOL RoundRect(HDC dc, int left, int top, int right, int bottom, int width, int height) {
    auto* const context = object_of<Context>(dc);
    const std::optional<PixelShift> shift = context != nullptr ? context->required_shift() : std::nullopt;
    if (!shift) {
        return 0;
    }
    if (!context->brush.draws) {
        return 1;
    }
    const Box box = shifted(
        {std::min(left, right), std::min(top, bottom), std::max(left, right), std::max(top, bottom)}, *shift);
    const RoundedBox shape(box, std::abs(std::int64_t{width}), std::abs(std::int64_t{height}));
    Surface& surface = context->surface();
    const std::uint32_t value = value_of_colour(surface.depth, context->brush.colour);
    const RECT part = part_on(surface, box);
    for (std::int64_t y = part.top; y < part.bottom; ++y) {
        const std::int64_t inset = shape.inset(y);
        fill_box(surface, {box.left + inset, y, box.right - inset, y + 1}, value);
    }
    return 1;
}
