// What the graphics family uses beyond the Win32 drawing calls.
#ifndef BASALT_SRC_PLATFORM_RASTER_EXTRAS_H
#define BASALT_SRC_PLATFORM_RASTER_EXTRAS_H

#include <cstddef>
#include <cstdint>
#include <span>
#include <utility>
#include <vector>

#include "basalt/platform/graphics_types.h"

namespace basalt::platform {

// Bytes of a row of a device-independent image, padded to 32 bits.
constexpr std::int64_t image_row_bytes(std::int64_t width, int depth) {
    return (width * depth + 31) / 32 * 4;
}

// Reads pixels of a bitmap's row from a column on: at 16 and 32 bits the stored values, at other depths the
// colours as words 0x00RRGGBB. The pixels must exist. False (ERROR_INVALID_HANDLE) for a handle that is no
// bitmap.
bool read_row(HBITMAP bitmap, int row, int column, std::span<std::uint32_t> pixels);
// What read_row returns for a pixel that was drawn in a colour.
std::uint32_t row_value(int depth, COLORREF colour);

// Builds the rectangles of a region band by band, top to bottom. They come out in the one form that a set of
// pixels has: the runs of a band do not touch, and bands that touch differ.
class BandBuilder {
public:
    // Begins a band of rows, below all before it.
    void begin(LONG top, LONG bottom) {
        m_top = top;
        m_bottom = bottom;
        m_first = m_rectangles.size();
    }
    // Adds a run to the band, right of the one before and not touching it. May throw std::bad_alloc.
    void add(LONG left, LONG right) { m_rectangles.push_back({left, m_top, right, m_bottom}); }
    // Ends the band; one with the same runs right above it is extended instead.
    void end();

    std::vector<RECT> take() { return std::move(m_rectangles); }

private:
    std::vector<RECT> m_rectangles;
    std::size_t m_above = 0;  // index of the first rectangle of the band above
    std::size_t m_first = 0;  // of this band
    LONG m_top = 0;
    LONG m_bottom = 0;
};

// A new region of the rectangles that a BandBuilder made; null, with the last error set, on failure.
HRGN create_region(std::vector<RECT> rectangles);

// Fills the part of a rectangle that RoundRect with an ellipse of this diameter leaves out. Draws nothing
// where the surface stores the colour as it stores the key, or where the context's transform is more than a
// shift by whole pixels. Time: by the rows on the surface.
void fill_outside_rounding(HDC dc, const RECT& rectangle, int diameter, COLORREF colour, COLORREF key);

}  // namespace basalt::platform

#endif
