// Copies through a transform: the middle of each destination pixel is mapped back into the source.
#include <algorithm>
#include <cstddef>
#include <cstdlib>
#include <optional>

#include "src/platform/drawing/block_copy.h"
#include "src/platform/pixels/mapped_words.h"
#include "src/platform/pixels/pixel_rows.h"
#include "src/platform/system/failure.h"

namespace basalt::platform {

namespace {

constexpr int PLACE_BITS = AffineRows::PLACE_BITS;

// Rows of a tile, and the rows of the source that its columns cross: together they stay in the caches.
constexpr int TILE_ROWS = 64;
constexpr std::int64_t TILE_SOURCE_ROWS = 64;
constexpr std::int64_t LEAST_COLUMNS = 16;

std::int64_t tile_columns(const AffineRows& rows) {
    const std::int64_t step = std::abs(static_cast<std::int64_t>(rows.step_y()));
    return std::max((TILE_SOURCE_ROWS << PLACE_BITS) / std::max<std::int64_t>(step, 1), LEAST_COLUMNS);
}

// Calls copy(run, row) for parts that make up all rows, in tiles of a number of columns.
template <typename Copy>
void in_tiles(const AffineRows& rows, std::int64_t columns, Surface& to, const Copy& copy) {
    for (int top = 0; top < to.height; top += TILE_ROWS) {
        AffineRows::Run runs[TILE_ROWS];
        const int count = std::min(TILE_ROWS, to.height - top);
        for (int i = 0; i < count; ++i) {
            runs[i] = rows.row(top + i, to.width);
        }
        for (std::int64_t left = 0; left < to.width; left += columns) {
            for (int i = 0; i < count; ++i) {
                AffineRows::Run part = runs[i];
                part.end = static_cast<int>(std::min<std::int64_t>(part.end, left + columns));
                if (part.begin < part.end) {
                    copy(part, to.row(top + i));
                    rows.advance(runs[i], part.end - part.begin);
                }
            }
        }
    }
}

void copy_run(const Surface& from, const AffineRows& rows, const AffineRows::Run& run, std::byte* row,
              const RowWriter& writer) {
    std::uint64_t x = run.x;
    std::uint64_t y = run.y;
    in_pieces(run.end - run.begin, false, [&](int offset, int size) {
        std::uint32_t values[PIECE];
        const std::span<std::uint32_t> piece(values, static_cast<std::size_t>(size));
        for (std::uint32_t& value : piece) {
            value = read_pixel(from.depth, from.row(static_cast<int>(y >> PLACE_BITS)),
                               static_cast<int>(x >> PLACE_BITS));
            x += rows.step_x();
            y += rows.step_y();
        }
        writer.write(row, run.begin + offset, piece);
    });
}

}  // namespace

bool copy_transformed(Context& destination, const Box& target, const Context& source, std::int64_t source_x,
                      std::int64_t source_y, const RowWriter& writer) {
    const Affine& world = source.world;
    if (world.m12 != 0 || world.m21 != 0) {
        return fail_with(ERROR_INVALID_PARAMETER, false);
    }
    if (target.is_empty()) {
        return true;
    }
    const auto left = static_cast<double>(source_x);
    const auto top = static_cast<double>(source_y);
    const Affine map = destination.world.inverse()
                           ->then(Affine::shift(left - static_cast<double>(target.left),
                                                top - static_cast<double>(target.top)))
                           .then(world);
    // The rectangle's corners in the source's pixels; a negative scale exchanges them.
    const auto [x_least, x_limit] = std::minmax(
        {world.x_of(left, 0), world.x_of(left + static_cast<double>(target.right - target.left), 0)});
    const auto [y_least, y_limit] = std::minmax(
        {world.y_of(0, top), world.y_of(0, top + static_cast<double>(target.bottom - target.top))});
    Surface& surface = destination.surface();
    const Surface* from = &source.surface();
    Surface picture;
    if (from == &surface) {
        // Pixels would be overwritten before they are read.
        if (!picture.copy(surface)) {
            return false;
        }
        from = &picture;
    }
    const std::optional<AffineRows> rows =
        AffineRows::create(map, std::max(x_least, 0.0), std::max(y_least, 0.0),
                           std::min(x_limit, static_cast<double>(from->width)),
                           std::min(y_limit, static_cast<double>(from->height)));
    if (!rows) {
        return fail_with(ERROR_ARITHMETIC_OVERFLOW, false);
    }
    if (writer.is_plain_copy() && surface.depth == 32) {
        const std::int64_t columns = can_gather_words() ? tile_columns(*rows) : surface.width;
        in_tiles(*rows, columns, surface, [&](const AffineRows::Run& run, std::byte* row) {
            copy_mapped_words(*from, *rows, run, reinterpret_cast<std::uint32_t*>(row));
        });
    } else {
        in_tiles(*rows, surface.width, surface, [&](const AffineRows::Run& run, std::byte* row) {
            copy_run(*from, *rows, run, row, writer);
        });
    }
    return true;
}

}  // namespace basalt::platform
