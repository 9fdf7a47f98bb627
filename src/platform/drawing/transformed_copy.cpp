// Copies through a transform: the middle of each destination pixel is mapped back into the source.
#include <algorithm>
#include <cstddef>
#include <optional>

#include "src/platform/drawing/block_copy.h"
#include "src/platform/pixels/pixel_rows.h"
#include "src/platform/system/failure.h"

namespace basalt::platform {

namespace {

constexpr int PLACE_BITS = AffineRows::PLACE_BITS;

void copy_words(const Surface& from, const AffineRows& rows, const AffineRows::Run& run, std::byte* row) {
    auto* const to = reinterpret_cast<std::uint32_t*>(row);
    const auto* const words = reinterpret_cast<const std::uint32_t*>(from.bits.get());
    const std::size_t row_words = from.row_bytes / sizeof(std::uint32_t);
    std::uint64_t x = run.x;
    std::uint64_t y = run.y;
    for (int i = run.begin; i < run.end; ++i) {
        to[i] = words[(y >> PLACE_BITS) * row_words + (x >> PLACE_BITS)];
        x += rows.step_x();
        y += rows.step_y();
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
    const bool words = writer.is_plain_copy() && surface.depth == 32;
    for (int y = 0; y < surface.height; ++y) {
        const AffineRows::Run run = rows->row(y, surface.width);
        if (run.begin >= run.end) {
            continue;
        }
        if (words) {
            copy_words(*from, *rows, run, surface.row(y));
        } else {
            copy_run(*from, *rows, run, surface.row(y), writer);
        }
    }
    return true;
}

}  // namespace basalt::platform
