// A copy, stretched where the sizes differ, that leaves out the pixels of one colour.
#include <optional>
#include <span>

#include "basalt/platform/drawing.h"
#include "src/platform/drawing/objects.h"
#include "src/platform/pixels/keyed_copy.h"
#include "src/platform/pixels/pixel_format.h"
#include "src/platform/pixels/pixel_rows.h"
#include "src/platform/system/failure.h"

namespace {

using namespace basalt::platform;

// One direction of the copy: which source column (or row) a destination column takes.
struct Samples {
    std::int64_t target;  // first column of the destination's rectangle
    std::int64_t size;
    std::int64_t source;  // first column of the source's
    std::int64_t source_size;

    // The middle of the destination's column, scaled; 64 bits hold the product of two sizes doubled.
    std::int64_t of(std::int64_t column) const {
        return source + (2 * (column - target) + 1) * source_size / (2 * size);
    }

    // Narrows columns of the destination to those whose source columns exist; `of` never falls.
    void narrow(LONG& begin, LONG& end, std::int64_t existing) const {
        begin = first_with(begin, end, 0);
        end = first_with(begin, end, existing);
    }

private:
    LONG first_with(LONG begin, LONG end, std::int64_t least) const {
        while (begin < end) {
            const auto middle = static_cast<LONG>(begin + (std::int64_t{end} - begin) / 2);
            if (of(middle) < least) {
                begin = middle + 1;
            } else {
                end = middle;
            }
        }
        return begin;
    }
};

struct TransparentCopy {
    Surface& to;
    const Surface& from;
    RECT part;
    Samples columns;
    Samples rows;
    ValueConverter converter;
    std::uint32_t key;  // as the source stores it

    void run() const {
        const bool words = to.depth == 32 && from.depth == 32 && columns.size == columns.source_size;
        for (int y = part.top; y < part.bottom; ++y) {
            const std::byte* const source_row = from.row(static_cast<int>(rows.of(y)));
            if (words) {
                copy_words_but_key(reinterpret_cast<std::uint32_t*>(to.row(y)) + part.left,
                                   reinterpret_cast<const std::uint32_t*>(source_row) + columns.of(part.left),
                                   static_cast<std::size_t>(part.right - part.left), key);
            } else {
                copy_row(source_row, to.row(y));
            }
        }
    }

    void copy_row(const std::byte* source_row, std::byte* row) const {
        const std::uint32_t colour_mask = colour_bits(from.depth);
        in_pieces(part.right - part.left, false, [&](int offset, int size) {
            std::uint32_t values[PIECE];
            std::uint32_t mixed[PIECE];
            const auto count = static_cast<std::size_t>(size);
            const int x = part.left + offset;
            bool kept[PIECE];
            for (int i = 0; i < size; ++i) {
                values[i] = read_pixel(from.depth, source_row, static_cast<int>(columns.of(x + i)));
                kept[i] = (values[i] & colour_mask) == key;
            }
            converter.convert(std::span(values, count));
            read_pixels(to.depth, row, x, std::span(mixed, count));
            for (int i = 0; i < size; ++i) {
                mixed[i] = kept[i] ? mixed[i] : values[i];
            }
            write_pixels(to.depth, row, x, std::span<const std::uint32_t>(mixed, count));
        });
    }
};

}  // namespace

BOOL TransparentBlt(HDC dc, int x, int y, int width, int height, HDC source, int source_x, int source_y,
                    int source_width, int source_height, UINT key) {
    auto* const to = object_of<Context>(dc);
    auto* const from = to != nullptr ? object_of<Context>(source) : nullptr;
    if (from == nullptr) {
        return 0;
    }
    if (width < 0 || height < 0 || source_width < 0 || source_height < 0) {
        return fail_with(ERROR_INVALID_PARAMETER, 0);
    }
    const std::optional<PixelShift> shift = to->required_shift();
    const std::optional<PixelShift> source_shift = from->required_shift();
    if (!shift || !source_shift) {
        return 0;
    }
    if (width == 0 || height == 0 || source_width == 0 || source_height == 0) {
        return 1;
    }
    Surface& surface = to->surface();
    const Surface* source_surface = &from->surface();
    Surface picture;
    if (source_surface == &surface) {
        if (!picture.copy(surface)) {
            return 0;
        }
        source_surface = &picture;
    }
    const Samples columns = {x + shift->x, width, source_x + source_shift->x, source_width};
    const Samples rows = {y + shift->y, height, source_y + source_shift->y, source_height};
    RECT part = part_on(surface, box_at(columns.target, rows.target, width, height));
    columns.narrow(part.left, part.right, source_surface->width);
    rows.narrow(part.top, part.bottom, source_surface->height);
    const int depth = source_surface->depth;
    TransparentCopy{surface,
                    *source_surface,
                    part,
                    columns,
                    rows,
                    ValueConverter(depth, surface.depth, to->text, to->background, from->background),
                    value_of_colour(depth, key)}
        .run();
    return 1;
}
