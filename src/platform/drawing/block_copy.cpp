#include "src/platform/drawing/block_copy.h"

#include <cstddef>
#include <optional>

#include "basalt/platform/drawing.h"
#include "src/platform/pixels/pixel_rows.h"
#include "src/platform/system/failure.h"

namespace basalt::platform {

namespace {

// The truth table of an operation on source and destination; the other bits of a code do not matter.
constexpr DWORD TABLE = 0x00FF0000;
constexpr DWORD OPERATIONS[] = {SRCCOPY, NOTSRCCOPY, SRCAND, SRCPAINT, SRCINVERT};

std::optional<DWORD> operation_of(DWORD rop) {
    for (const DWORD operation : OPERATIONS) {
        if ((rop & TABLE) == (operation & TABLE)) {
            return operation;
        }
    }
    return fail_with(ERROR_INVALID_PARAMETER, std::nullopt);
}

// Replaces source values by their combination with those present.
void combine(std::span<std::uint32_t> source, const std::uint32_t* present, DWORD operation) {
    const auto each = [&](auto combined) {
        for (std::size_t i = 0; i < source.size(); ++i) {
            source[i] = combined(source[i], present[i]);
        }
    };
    switch (operation) {
        case SRCAND:
            return each([](std::uint32_t s, std::uint32_t d) { return s & d; });
        case SRCPAINT:
            return each([](std::uint32_t s, std::uint32_t d) { return s | d; });
        default:
            return each([](std::uint32_t s, std::uint32_t d) { return s ^ d; });
    }
}

// A copy between surfaces by a shift of whole pixels.
struct ShiftedCopy {
    Surface& to;
    const Surface& from;
    RECT part;           // of the destination
    std::int64_t add_x;  // from a column of the destination to one of the source
    std::int64_t add_y;
    const RowWriter& writer;

    // On one surface, rows and pixels are read before they are overwritten.
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

// The part of a box whose source pixels exist.
Box with_source(const Box& box, const Surface& from, std::int64_t add_x, std::int64_t add_y) {
    return common_part(box, {-add_x, -add_y, from.width - add_x, from.height - add_y});
}

}  // namespace

RowWriter::RowWriter(const Context& destination, const Context& source, DWORD operation)
    : m_depth(destination.surface().depth),
      m_operation(operation),
      m_is_plain_copy(operation == SRCCOPY && source.surface().depth == m_depth),
      m_converter(source.surface().depth, m_depth, destination.text, destination.background,
                  source.background) {}

void RowWriter::write(std::byte* row, int x, std::span<std::uint32_t> values) const {
    m_converter.convert(values);
    if (m_operation == NOTSRCCOPY) {
        for (std::uint32_t& value : values) {
            value = ~value;
        }
    } else if (m_operation != SRCCOPY) {
        std::uint32_t present[PIECE];
        read_pixels(m_depth, row, x, std::span(present, values.size()));
        combine(values, present, m_operation);
    }
    write_pixels(m_depth, row, x, values);
}

}  // namespace basalt::platform

BOOL BitBlt(HDC dc, int x, int y, int width, int height, HDC source, int source_x, int source_y, DWORD rop) {
    using namespace basalt::platform;
    auto* const to = object_of<Context>(dc);
    const auto* const from = to != nullptr ? object_of<Context>(source) : nullptr;
    const std::optional<DWORD> operation = from != nullptr ? operation_of(rop) : std::nullopt;
    if (!operation) {
        return 0;
    }
    const RowWriter writer(*to, *from, *operation);
    const std::optional<PixelShift> shift = to->pixel_shift();
    const std::optional<PixelShift> source_shift = from->pixel_shift();
    if (!shift || !source_shift) {
        return copy_transformed(*to, box_at(x, y, width, height), *from, source_x, source_y, writer) ? 1 : 0;
    }
    const Box pixels = box_at(x + shift->x, y + shift->y, width, height);
    const std::int64_t add_x = source_x + source_shift->x - pixels.left;
    const std::int64_t add_y = source_y + source_shift->y - pixels.top;
    const Surface& source_surface = from->surface();
    const RECT part = part_on(to->surface(), with_source(pixels, source_surface, add_x, add_y));
    ShiftedCopy{to->surface(), source_surface, part, add_x, add_y, writer}.run();
    return 1;
}
