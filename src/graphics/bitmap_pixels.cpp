#include <cstddef>
#include <memory>

#include "basalt/graphics/bitmap_functions.h"
#include "basalt/platform/device_context.h"
#include "src/platform/raster_extras.h"

namespace vex_util::mfc {

unsigned char* GetDIBits(CBitmap& bitmap, BITMAPINFOHEADER& header) {
    BITMAP record = {};
    const bool is_bitmap = bitmap.GetBitmap(&record) != 0;
    // The platform writes a table of colours behind the header.
    struct {
        BITMAPINFOHEADER header;
        RGBQUAD colours[256];
    } info = {};
    info.header.biSize = sizeof info.header;
    info.header.biWidth = record.bmWidth;
    info.header.biHeight = -record.bmHeight;
    info.header.biPlanes = record.bmPlanes;
    info.header.biBitCount = record.bmBitsPixel;
    info.header.biCompression = BI_RGB;
    std::unique_ptr<unsigned char[]> pixels;
    if (is_bitmap) {
        const std::int64_t bytes =
            record.bmHeight * basalt::platform::image_row_bytes(record.bmWidth, record.bmBitsPixel);
        pixels.reset(new unsigned char[static_cast<std::size_t>(bytes)]);  // every byte is written below
        HDC const screen = GetDC(nullptr);
        const int copied = ::GetDIBits(screen, bitmap, 0, static_cast<UINT>(record.bmHeight), pixels.get(),
                                       reinterpret_cast<BITMAPINFO*>(&info), DIB_RGB_COLORS);
        ReleaseDC(nullptr, screen);
        if (copied != record.bmHeight) {
            pixels.reset();
        }
    }
    header = info.header;
    return pixels.release();
}

}  // namespace vex_util::mfc
