#include "src/platform/drawing/block_copy.h"

#include <optional>

#include "basalt/platform/drawing.h"
#include "basalt/platform/error.h"
#include "src/platform/drawing/drawing_target.h"
#include "src/platform/pixels/pixel_rows.h"

namespace basalt::platform {

RowWriter::RowWriter(const Context& destination, const Context* source, RasterOperation operation)
    : m_depth(destination.surface().depth),
      m_operation(operation),
      m_is_plain_copy(operation.is_copy() && source != nullptr && source->surface().depth == m_depth),
      m_brush(value_of_colour(m_depth, destination.brush.colour)),
      m_converter(source != nullptr ? source->surface().depth : m_depth, m_depth, destination.text,
                  destination.background, source != nullptr ? source->background : 0) {}

void RowWriter::write(std::byte* row, int x, std::span<std::uint32_t> values) const {
    m_converter.convert(values);
    if (!m_operation.is_copy()) {
        std::uint32_t present[PIECE];
        read_pixels(m_depth, row, x, std::span(present, values.size()));
        m_operation.combine(values, present, m_brush);
    }
    write_pixels(m_depth, row, x, values);
}

namespace {

// A copy between surfaces by a shift of whole pixels.
struct ShiftedCopy {
    Surface& to;
    const Surface& from;
    RECT part;           // of the destination
    std::int64_t add_x;  // from a column of the destination to one of the source
    std::int64_t add_y;
    const RowWriter& writer;

    // On one surface, a row or pixel is read before another is written over it.
    void run() const {
        const bool from_below = &to == &from && add_y < 0;
        for (int i = 0; i < part.bottom - part.top; ++i) {
            copy_row(from_below ? part.bottom - 1 - i : part.top + i);
        }
    }

    void copy_row(int y) const {
        std::byte* const row = to.row(y);
        const std::byte* const source_row = from.row(static_cast<int>(y + add_y));
        const int count = part.right - part.left;
        const auto source_x = static_cast<int>(part.left + add_x);
        if (writer.is_plain_copy()) {
            copy_pixels(to.depth, row, part.left, source_row, source_x, count);
            return;
        }
        in_pieces(count, row == source_row && add_x < 0, [&](int offset, int size) {
            std::uint32_t values[PIECE];
            const std::span<std::uint32_t> piece(values, static_cast<std::size_t>(size));
            read_pixels(from.depth, source_row, source_x + offset, piece);
            writer.write(row, part.left + offset, piece);
        });
    }
};

void write_without_source(Surface& to, const RECT& part, const RowWriter& writer) {
    for (int y = part.top; y < part.bottom; ++y) {
        in_pieces(part.right - part.left, false, [&](int offset, int size) {
            std::uint32_t values[PIECE] = {};
            writer.write(to.row(y), part.left + offset, std::span(values, static_cast<std::size_t>(size)));
        });
    }
}

// The part of a box whose source pixels exist.
Box with_source(const Box& box, const Surface& from, std::int64_t add_x, std::int64_t add_y) {
    return common_part(box, {-add_x, -add_y, from.width - add_x, from.height - add_y});
}

}  // namespace

}  // namespace basalt::platform

BOOL BitBlt(HDC dc, int x, int y, int width, int height, HDC source, int source_x, int source_y, DWORD rop) {
    using namespace basalt::platform;
    const RasterOperation operation(rop);
    auto* const to = object_of<Context>(dc);
    if (to == nullptr) {
        return 0;
    }
    Context* from = nullptr;
    if (operation.needs_source()) {
        from = object_of<Context>(source);
        if (from == nullptr) {
            return 0;
        }
    }
    if (operation.needs_brush() && !to->brush.draws) {
        return 1;
    }
    const RowWriter writer(*to, from, operation);
    const std::optional<PixelShift> shift = whole_pixel_shift(*to);
    const std::optional<PixelShift> source_shift =
        from != nullptr ? whole_pixel_shift(*from) : PixelShift{0, 0};
    const Box target = box_at(x, y, width, height);
    if (!shift || !source_shift) {
        return copy_transformed(*to, target, from, source_x, source_y, writer) ? 1 : 0;
    }
    const Box pixels = box_at(x + shift->x, y + shift->y, width, height);
    Surface& surface = to->surface();
    if (from == nullptr) {
        write_without_source(surface, part_on(surface, pixels), writer);
        return 1;
    }
    const std::int64_t add_x = source_x + source_shift->x - pixels.left;
    const std::int64_t add_y = source_y + source_shift->y - pixels.top;
    const Surface& source_surface = from->surface();
    const RECT part = part_on(surface, with_source(pixels, source_surface, add_x, add_y));
    ShiftedCopy{surface, source_surface, part, add_x, add_y, writer}.run();
    return 1;
}
