// A set of pixels as sorted, banded rectangles: bands of rows from top to bottom, in each runs from left to
// right. Runs do not touch and touching bands differ, so equal sets are equal lists.
#ifndef BASALT_SRC_PLATFORM_PIXELS_BANDS_H
#define BASALT_SRC_PLATFORM_PIXELS_BANDS_H

#include <cstdint>
#include <vector>

#include "basalt/platform/graphics_types.h"

namespace basalt::platform {

class Bands {
public:
    Bands() = default;
    // rectangles: as a BandBuilder makes them.
    explicit Bands(std::vector<RECT> rectangles);

    const std::vector<RECT>& rectangles() const { return m_rectangles; }
    // The smallest rectangle around the set; all zero when it is empty.
    const RECT& box() const { return m_box; }
    bool contains(LONG x, LONG y) const;
    bool operator==(const Bands& other) const;

    // Moves the set. False, and nothing changes, when coordinates would not fit.
    bool shift(LONG x, LONG y);

private:
    std::vector<RECT> m_rectangles;
    RECT m_box = {0, 0, 0, 0};
};

// Which pixels a combination of two sets keeps: bit 1 those of the second alone, bit 2 those of the first
// alone, bit 3 those of both.
enum class Keep : std::uint8_t { AND = 0x8, OR = 0xE, XOR = 0x6, DIFF = 0x4 };

// May throw std::bad_alloc. Time: by the rectangles of both.
Bands combined(const Bands& a, const Bands& b, Keep keep);

}  // namespace basalt::platform

#endif
