// How a copy brings pieces of rows from one surface to another.
#ifndef BASALT_SRC_PLATFORM_DRAWING_BLOCK_COPY_H
#define BASALT_SRC_PLATFORM_DRAWING_BLOCK_COPY_H

#include <cstdint>
#include <span>

#include "src/platform/drawing/graphics_object_kinds.h"
#include "src/platform/pixel_format.h"
#include "src/platform/pixels/raster_operation.h"

namespace basalt::platform {

// What is made of the source's values on their way into a destination: brought to its depth, combined with
// what is there, and written.
class RowWriter {
public:
    // source: null for an operation that needs none.
    RowWriter(const Context& destination, const Context* source, RasterOperation operation);

    // Values at column x of the destination's row; they are changed on the way.
    void write(std::byte* row, int x, std::span<std::uint32_t> values) const;

    // Whether source pixels arrive as they are stored.
    bool is_plain_copy() const { return m_is_plain_copy; }

private:
    int m_depth;
    RasterOperation m_operation;
    bool m_is_plain_copy;
    std::uint32_t m_brush;
    ValueConverter m_converter;
};

// A copy through transforms that are more than shifts by whole pixels. source: null for an operation that
// needs none. False, with the last error set, for a source that is turned or sheared, steps too large to be
// followed, and a lack of memory.
bool copy_transformed(Context& destination, const Box& target, Context* source, std::int64_t source_x,
                      std::int64_t source_y, const RowWriter& writer);

}  // namespace basalt::platform

#endif
