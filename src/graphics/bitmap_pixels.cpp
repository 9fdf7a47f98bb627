#include <cstddef>
#include <memory>

#include "basalt/graphics/bitmap.h"
#include "src/graphics/dib_rows.h"
#include "src/graphics/screen_context.h"

namespace vex_util::mfc {

unsigned char* GetDIBits(CBitmap& bitmap, BITMAPINFOHEADER& header) {
    using namespace basalt::graphics;
    BITMAP record = {};
    const bool is_bitmap = bitmap.GetBitmap(&record) != 0;
    // The platform writes a table of colours behind the header.
    struct {
        BITMAPINFOHEADER header;
        RGBQUAD colours[256];
    } info = {top_down_header(record, record.bmBitsPixel), {}};
    std::unique_ptr<unsigned char[]> pixels;
    if (is_bitmap) {
        const ScreenContext screen;
        const auto rows = static_cast<std::size_t>(record.bmHeight);
        // Not cleared: every byte is about to be written.
        pixels.reset(new unsigned char[rows * row_bytes(record.bmWidth, record.bmBitsPixel)]);
        const int copied = ::GetDIBits(screen.dc(), bitmap, 0, static_cast<UINT>(record.bmHeight),
                                       pixels.get(), reinterpret_cast<BITMAPINFO*>(&info), DIB_RGB_COLORS);
        if (copied != record.bmHeight) {
            pixels.reset();
        }
    }
    header = info.header;
    return pixels.release();
}

}  // namespace vex_util::mfc
