#include "src/platform/pixels/surface.h"

#include <algorithm>
#include <cstring>
#include <limits>

#include "basalt/platform/error.h"
#include "src/platform/raster_extras.h"

namespace basalt::platform {

namespace {

// Image headers hold the bytes of all rows in 32 bits.
constexpr std::int64_t MOST_BYTES = std::numeric_limits<std::int32_t>::max();

}  // namespace

bool Surface::create(int new_width, int new_height, int new_depth) {
    *this = {};
    const std::int64_t new_row_bytes = image_row_bytes(new_width, new_depth);
    if (new_width < 0 || new_height < 0 || (new_height > 0 && new_row_bytes > MOST_BYTES / new_height)) {
        SetLastError(ERROR_INVALID_PARAMETER);
        return false;
    }
    const auto size = static_cast<std::size_t>(new_row_bytes * new_height);
    bits.reset(static_cast<std::byte*>(std::calloc(std::max<std::size_t>(size, 1), 1)));
    if (bits == nullptr) {
        SetLastError(ERROR_NOT_ENOUGH_MEMORY);
        return false;
    }
    width = new_width;
    height = new_height;
    depth = new_depth;
    row_bytes = static_cast<std::size_t>(new_row_bytes);
    return true;
}

bool Surface::copy(const Surface& other) {
    if (!create(other.width, other.height, other.depth)) {
        return false;
    }
    std::memcpy(bits.get(), other.bits.get(), row_bytes * static_cast<std::size_t>(height));
    return true;
}

Box common_part(const Box& a, const Box& b) {
    return {std::max(a.left, b.left), std::max(a.top, b.top), std::min(a.right, b.right),
            std::min(a.bottom, b.bottom)};
}

RECT part_on(const Surface& surface, const Box& box) {
    const Box part = common_part(box, {0, 0, surface.width, surface.height});
    if (part.is_empty()) {
        return {0, 0, 0, 0};
    }
    return {static_cast<LONG>(part.left), static_cast<LONG>(part.top), static_cast<LONG>(part.right),
            static_cast<LONG>(part.bottom)};
}

}  // namespace basalt::platform
