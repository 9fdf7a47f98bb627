#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <limits>
#include <span>
#include <vector>

#include "basalt/graphics/bitmap.h"
#include "src/graphics/dib_rows.h"
#include "src/graphics/opaque_runs.h"
#include "src/graphics/screen_context.h"
#include "src/platform/pixel_format.h"
#include "src/platform/region_rectangles.h"

namespace basalt::graphics {

namespace {

/// Bytes of rows read at a time: they stay in the cache, and a large bitmap needs no copy as large.
constexpr std::size_t STRIP_BYTES = 65536;

std::uint32_t key_of(COLORREF colour, std::uint32_t) {
    return platform::word_of_colour(colour);
}

/// The code that drawing in the colour stores: a background filled with it is of it.
std::uint16_t key_of(COLORREF colour, std::uint16_t) {
    return static_cast<std::uint16_t>(platform::value_of_colour(16, colour));
}

/// Appends the runs of all rows; neighbouring rows that are alike give one rectangle a run.
/// @return false when the bitmap cannot be read
template <class Pixel>
bool gather_runs(HBITMAP bitmap, const BITMAP& record, COLORREF transparent, std::vector<RECT>& rectangles) {
    constexpr WORD DEPTH = 8 * sizeof(Pixel);
    const auto key = key_of(transparent, Pixel());
    const auto width = static_cast<std::size_t>(record.bmWidth);
    const std::size_t stride = row_bytes(record.bmWidth, DEPTH) / sizeof(Pixel);
    const int strip_rows = static_cast<int>(std::clamp<std::size_t>(
        STRIP_BYTES / sizeof(Pixel) / stride, 1, static_cast<std::size_t>(record.bmHeight)));
    std::vector<Pixel> strip(stride * static_cast<std::size_t>(strip_rows));
    std::vector<std::uint64_t> mask(mask_words(width));
    std::vector<std::uint64_t> band(mask_words(width));  // the rows from band_top on; none opaque at first
    int band_top = 0;
    BITMAPINFO info = {top_down_header(record, DEPTH), {}};
    const ScreenContext screen;
    for (int row = 0; row < record.bmHeight; ++row) {
        const int in_strip = row % strip_rows;
        if (in_strip == 0) {
            const int rows = std::min(strip_rows, record.bmHeight - row);
            if (::GetDIBits(screen.dc(), bitmap, static_cast<UINT>(row), static_cast<UINT>(rows),
                            strip.data(), &info, DIB_RGB_COLORS) != rows) {
                return false;
            }
        }
        mask_opaque(std::span<const Pixel>(strip.data() + stride * static_cast<std::size_t>(in_strip), width),
                    key, mask.data());
        if (mask != band) {
            append_runs(band, band_top, row, rectangles);
            band.swap(mask);
            band_top = row;
        }
    }
    append_runs(band, band_top, record.bmHeight, rectangles);
    return true;
}

}  // namespace

}  // namespace basalt::graphics

namespace vex_util::mfc {

bool RegionFromBitmap(CRgn& region, CBitmap& bitmap, unsigned long transparentColour) {
    using namespace basalt::graphics;
    BITMAP record = {};
    if (region.GetSafeHandle() != nullptr || transparentColour > std::numeric_limits<COLORREF>::max() ||
        bitmap.GetBitmap(&record) == 0) {
        return false;
    }
    const auto transparent = static_cast<COLORREF>(transparentColour);
    std::vector<RECT> rectangles;
    const bool is_read = record.bmBitsPixel == 16
                             ? gather_runs<std::uint16_t>(bitmap, record, transparent, rectangles)
                             : gather_runs<std::uint32_t>(bitmap, record, transparent, rectangles);
    return is_read && region.Attach(basalt::platform::create_region(rectangles)) != 0;
}

}  // namespace vex_util::mfc
