// A rectangle of pixels in memory.
#ifndef BASALT_SRC_PLATFORM_PIXELS_SURFACE_H
#define BASALT_SRC_PLATFORM_PIXELS_SURFACE_H

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <memory>

#include "basalt/platform/graphics_types.h"

namespace basalt::platform {

// Bytes of a row as CreateBitmap takes it, padded to 16 bits.
constexpr std::int64_t bitmap_row_bytes(std::int64_t width, int depth) {
    return (width * depth + 15) / 16 * 2;
}

struct Surface {
    // Makes all pixels 0. False, with an empty surface and the last error set, when out of memory or the rows
    // take 2^31 bytes or more. Rows are padded to 32 bits, as in a device-independent image.
    bool create(int new_width, int new_height, int new_depth);
    // Makes an equal surface; false as create.
    bool copy(const Surface& other);

    // A constant surface has constant rows.
    // NOLINTNEXTLINE(readability-make-member-function-const)
    std::byte* row(int y) { return bits.get() + static_cast<std::size_t>(y) * row_bytes; }
    const std::byte* row(int y) const { return bits.get() + static_cast<std::size_t>(y) * row_bytes; }
    bool contains(std::int64_t x, std::int64_t y) const {
        return x >= 0 && x < width && y >= 0 && y < height;
    }

    struct Free {
        void operator()(std::byte* block) const { std::free(block); }
    };

    int width = 0;
    int height = 0;
    int depth = 1;
    std::size_t row_bytes = 0;
    std::unique_ptr<std::byte, Free> bits;
};

// A rectangle in 64 bits: sums of two 32-bit coordinates do not overflow.
struct Box {
    std::int64_t left;
    std::int64_t top;
    std::int64_t right;
    std::int64_t bottom;

    bool is_empty() const { return left >= right || top >= bottom; }
};

inline Box box_at(std::int64_t x, std::int64_t y, std::int64_t width, std::int64_t height) {
    return {x, y, x + width, y + height};
}

Box common_part(const Box& a, const Box& b);

// The part of a box that lies on a surface, as columns and rows.
RECT part_on(const Surface& surface, const Box& box);

}  // namespace basalt::platform

#endif
