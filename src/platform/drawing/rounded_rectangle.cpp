#include "src/platform/rounded_rectangle.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <optional>

#include "basalt/platform/drawing.h"
#include "src/platform/drawing/drawing_target.h"
#include "src/platform/pixel_format.h"
#include "src/platform/pixels/pixel_rows.h"

namespace {

using namespace basalt::platform;

// A rectangle whose corners are quarters of an ellipse.
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
        // Cut down to a whole number from half a column short of the border, which rounding is far less than.
        while (!is_inside(columns, down)) {
            ++columns;
        }
        return columns;
    }

private:
    // Twice the ellipse's coordinates, squared and multiplied by its sizes', stay below 2^125.
    static constexpr std::int64_t LARGEST = 0x7FFFFFFF;

    // Whether the middle of a column, counted from the edge, is inside; all are from the ellipse's middle on.
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

void fill_row(Surface& surface, std::int64_t y, std::int64_t begin, std::int64_t end, std::uint32_t value) {
    const RECT part = part_on(surface, {begin, y, end, y + 1});
    if (part.left < part.right) {
        fill_pixels(surface.depth, surface.row(part.top), part.left, part.right - part.left, value);
    }
}

struct Painter {
    Surface& surface;
    Paint brush;
    Paint pen;

    void paint(const Paint& paint, std::int64_t y, std::int64_t begin, std::int64_t end) const {
        if (paint.draws) {
            fill_row(surface, y, begin, end, value_of_colour(surface.depth, paint.colour));
        }
    }
};

}  // namespace

void basalt::platform::fill_outside_rounding(HDC dc, const RECT& rectangle, int diameter, COLORREF colour,
                                             COLORREF key) {
    auto* const context = object_of<Context>(dc);
    const std::optional<PixelShift> shift = context != nullptr ? required_shift(*context) : std::nullopt;
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
        fill_row(surface, y, box.left, box.left + inset, value);
        fill_row(surface, y, box.right - inset, box.right, value);
    }
}

BOOL RoundRect(HDC dc, int left, int top, int right, int bottom, int width, int height) {
    auto* const context = object_of<Context>(dc);
    if (context == nullptr) {
        return 0;
    }
    const std::optional<PixelShift> shift = required_shift(*context);
    if (!shift) {
        return 0;
    }
    const Box box = shifted(
        {std::min(left, right), std::min(top, bottom), std::max(left, right), std::max(top, bottom)}, *shift);
    const RoundedBox shape(box, std::abs(std::int64_t{width}), std::abs(std::int64_t{height}));
    const Painter painter = {context->surface(), context->brush, context->pen};
    const RECT part = part_on(painter.surface, box);
    for (std::int64_t y = part.top; y < part.bottom; ++y) {
        const std::int64_t inset = shape.inset(y);
        const std::int64_t begin = box.left + inset;
        const std::int64_t end = box.right - inset;
        if (!context->pen.draws) {
            painter.paint(context->brush, y, begin, end);
            continue;
        }
        // The border is what the row further out does not cover, and at least one pixel.
        const bool is_outermost = y == box.top || y == box.bottom - 1;
        const bool is_upper = y - box.top < box.bottom - 1 - y;
        const std::int64_t outer =
            is_outermost ? (end - begin + 1) / 2 : shape.inset(is_upper ? y - 1 : y + 1) - inset;
        const std::int64_t border = std::min(std::max<std::int64_t>(outer, 1), end - begin);
        painter.paint(context->brush, y, begin + border, end - border);
        painter.paint(context->pen, y, begin, begin + border);
        painter.paint(context->pen, y, end - border, end);
    }
    return 1;
}
