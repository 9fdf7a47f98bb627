// How a copy writes pieces of a row into a destination.
#ifndef BASALT_SRC_PLATFORM_DRAWING_BLOCK_COPY_H
#define BASALT_SRC_PLATFORM_DRAWING_BLOCK_COPY_H

#include <cstdint>
#include <span>

#include "src/platform/drawing/objects.h"
#include "src/platform/pixels/pixel_format.h"

namespace basalt::platform {

// Converts source values to the destination's depth, combines them with what is there, and writes them.
class RowWriter {
public:
    // operation: one of the codes of basalt/platform/drawing.h.
    RowWriter(const Context& destination, const Context& source, DWORD operation);

    // Writes values at column x of a row of the destination; changes them on the way.
    void write(std::byte* row, int x, std::span<std::uint32_t> values) const;

    // Whether source pixels are written as they are stored.
    bool is_plain_copy() const { return m_is_plain_copy; }

private:
    int m_depth;
    DWORD m_operation;
    bool m_is_plain_copy;
    ValueConverter m_converter;
};

// A copy through transforms that are more than shifts by whole pixels. False, with the last error set, for a
// source that is turned or sheared, steps too large to be followed, and out of memory.
bool copy_transformed(Context& destination, const Box& target, const Context& source, std::int64_t source_x,
                      std::int64_t source_y, const RowWriter& writer);

}  // namespace basalt::platform

#endif
