/// @file
/// How a bitmap's rows lie in a device-independent image.
#ifndef BASALT_SRC_GRAPHICS_DIB_ROWS_H
#define BASALT_SRC_GRAPHICS_DIB_ROWS_H

#include <cstddef>

#include "basalt/platform/bitmap.h"

namespace basalt::graphics {

/// Bytes of a row, padded to 32 bits.
constexpr std::size_t row_bytes(int width, int bits_per_pixel) {
    return (static_cast<std::size_t>(width) * static_cast<std::size_t>(bits_per_pixel) + 31) / 32 * 4;
}

/// Header of a bitmap's rows in some depth, top row first.
constexpr BITMAPINFOHEADER top_down_header(const BITMAP& bitmap, WORD bits_per_pixel) {
    BITMAPINFOHEADER header = {};
    header.biSize = sizeof header;
    header.biWidth = bitmap.bmWidth;
    header.biHeight = -bitmap.bmHeight;
    header.biPlanes = bitmap.bmPlanes;
    header.biBitCount = bits_per_pixel;
    header.biCompression = BI_RGB;
    return header;
}

}  // namespace basalt::graphics

#endif
