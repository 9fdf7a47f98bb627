// Rectangles filled with a gradient.
#include <algorithm>
#include <optional>
#include <span>
#include <utility>

#include "basalt/platform/drawing.h"
#include "src/platform/drawing/objects.h"
#include "src/platform/pixels/pixel_format.h"
#include "src/platform/pixels/pixel_rows.h"
#include "src/platform/system/failure.h"

namespace {

using namespace basalt::platform;

// One channel along a line: (end (p - begin) + start (size - (p - begin))) / size, exact at every step and
// without a division per step.
class Ramp {
public:
    Ramp(WORD start, WORD end, std::int64_t size, std::int64_t first) : m_size(size) {
        const std::int64_t change = std::int64_t{end} - start;
        const std::int64_t sum = std::int64_t{start} * size + change * first;  // below 2^49
        m_value = sum / size;
        m_rest = sum % size;
        m_step = change / size;
        m_rest_step = change % size;
        if (m_rest_step < 0) {
            --m_step;
            m_rest_step += size;
        }
    }

    std::uint32_t level() const { return static_cast<std::uint32_t>(m_value) >> 8; }

    void advance() {
        m_value += m_step;
        m_rest += m_rest_step;
        // Branchless: the branch would be unpredictable.
        const std::int64_t carry = m_rest >= m_size ? 1 : 0;
        m_value += carry;
        m_rest -= carry * m_size;
    }

private:
    std::int64_t m_size;
    std::int64_t m_value;
    std::int64_t m_rest;
    std::int64_t m_step;
    std::int64_t m_rest_step;
};

class Gradient {
public:
    Gradient(const TRIVERTEX& start, const TRIVERTEX& end, std::int64_t size, std::int64_t first)
        : m_red(start.Red, end.Red, size, first),
          m_green(start.Green, end.Green, size, first),
          m_blue(start.Blue, end.Blue, size, first) {}

    // The next pixel, as a depth stores it.
    std::uint32_t next(int depth) {
        const std::uint32_t word = m_red.level() << 16 | m_green.level() << 8 | m_blue.level();
        m_red.advance();
        m_green.advance();
        m_blue.advance();
        if (depth > 16) {
            return word;
        }
        return depth == 16 ? truncated_555(word) : value_of_word(depth, word);
    }

private:
    Ramp m_red;
    Ramp m_green;
    Ramp m_blue;
};

void fill_from_left(Surface& surface, const RECT& part, Gradient gradient) {
    const int columns = part.right - part.left;
    std::byte* const first_row = surface.row(part.top);
    in_pieces(columns, false, [&](int offset, int size) {
        std::uint32_t values[PIECE];
        std::generate_n(values, size, [&] { return gradient.next(surface.depth); });
        write_pixels(surface.depth, first_row, part.left + offset,
                     std::span<const std::uint32_t>(values, static_cast<std::size_t>(size)));
    });
    for (int y = part.top + 1; y < part.bottom; ++y) {
        copy_pixels(surface.depth, surface.row(y), part.left, first_row, part.left, columns);
    }
}

void fill_from_top(Surface& surface, const RECT& part, Gradient gradient) {
    for (int y = part.top; y < part.bottom; ++y) {
        fill_pixels(surface.depth, surface.row(y), part.left, part.right - part.left,
                    gradient.next(surface.depth));
    }
}

void fill(Surface& surface, const PixelShift& shift, TRIVERTEX start, TRIVERTEX end, bool from_left) {
    if (from_left ? end.x < start.x : end.y < start.y) {
        std::swap(start, end);
    }
    const auto [left, right] = std::minmax(start.x, end.x);
    const auto [top, bottom] = std::minmax(start.y, end.y);
    const Box box = shifted({left, top, right, bottom}, shift);
    const RECT part = part_on(surface, box);
    if (part.left == part.right) {
        return;
    }
    // The ramp runs over the whole rectangle, not only the part on the surface.
    if (from_left) {
        fill_from_left(surface, part, Gradient(start, end, box.right - box.left, part.left - box.left));
    } else {
        fill_from_top(surface, part, Gradient(start, end, box.bottom - box.top, part.top - box.top));
    }
}

}  // namespace

BOOL GradientFill(HDC dc, const TRIVERTEX* vertices, DWORD vertex_count, const void* mesh, DWORD mesh_count,
                  DWORD mode) {
    auto* const context = object_of<Context>(dc);
    if (context == nullptr) {
        return 0;
    }
    const auto* const rectangles = static_cast<const GRADIENT_RECT*>(mesh);
    const auto is_drawable = [vertex_count](const GRADIENT_RECT& rectangle) {
        return rectangle.UpperLeft < vertex_count && rectangle.LowerRight < vertex_count;
    };
    if (vertices == nullptr || mesh == nullptr || mode > GRADIENT_FILL_RECT_V ||
        !std::all_of(rectangles, rectangles + mesh_count, is_drawable)) {
        return fail_with(ERROR_INVALID_PARAMETER, 0);
    }
    const std::optional<PixelShift> shift = context->required_shift();
    if (!shift) {
        return 0;
    }
    for (DWORD i = 0; i < mesh_count; ++i) {
        fill(context->surface(), *shift, vertices[rectangles[i].UpperLeft],
             vertices[rectangles[i].LowerRight], mode == GRADIENT_FILL_RECT_H);
    }
    return 1;
}
