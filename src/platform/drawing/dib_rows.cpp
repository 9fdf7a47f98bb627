// A bitmap's rows in the format of a header.
#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <cstring>

#include "basalt/platform/bitmap.h"
#include "basalt/platform/error.h"
#include "src/platform/drawing/graphics_object_kinds.h"
#include "src/platform/pixel_format.h"
#include "src/platform/pixels/pixel_rows.h"

namespace {

using basalt::platform::Bitmap;
using basalt::platform::Context;
using basalt::platform::image_row_bytes;
using basalt::platform::object_of;
using basalt::platform::PIECE;
using basalt::platform::Surface;
using basalt::platform::ValueConverter;

int refuse() {
    SetLastError(ERROR_INVALID_PARAMETER);
    return 0;
}

bool fits(const BITMAPINFOHEADER& header, const Surface& surface) {
    return header.biPlanes == 1 && basalt::platform::is_depth(header.biBitCount) &&
           header.biCompression == BI_RGB && header.biWidth == surface.width &&
           std::abs(std::int64_t{header.biHeight}) == surface.height;
}

void write_table(BITMAPINFO* info, int depth) {
    // The entries lie behind the record's end, so they are reached from the record's own address.
    auto* entry = reinterpret_cast<std::byte*>(info) + offsetof(BITMAPINFO, bmiColors);
    for (const std::uint32_t word : basalt::platform::colour_table(depth)) {
        const RGBQUAD colour = {static_cast<BYTE>(word & 0xFF), static_cast<BYTE>(word >> 8 & 0xFF),
                                static_cast<BYTE>(word >> 16 & 0xFF), 0};
        std::memcpy(entry, &colour, sizeof colour);
        entry += sizeof colour;
    }
}

void copy_row(const Surface& surface, int y, int depth, const ValueConverter& converter, std::byte* to) {
    if (depth == surface.depth) {
        std::memcpy(to, surface.row(y), surface.row_bytes);
        return;
    }
    const auto row_bytes = static_cast<std::size_t>(image_row_bytes(surface.width, depth));
    std::memset(to + row_bytes - 4, 0, 4);  // what pads the row
    basalt::platform::in_pieces(surface.width, false, [&](int offset, int size) {
        std::uint32_t values[PIECE];
        const std::span<std::uint32_t> piece(values, static_cast<std::size_t>(size));
        basalt::platform::read_pixels(surface.depth, surface.row(y), offset, piece);
        converter.convert(piece);
        basalt::platform::write_pixels(depth, to, offset, piece);
    });
}

}  // namespace

int GetDIBits(HDC dc, HBITMAP bitmap, UINT first, UINT count, void* bits, BITMAPINFO* info, UINT usage) {
    const auto* const source = object_of<Context>(dc) != nullptr ? object_of<Bitmap>(bitmap) : nullptr;
    if (source == nullptr) {
        return 0;
    }
    if (info == nullptr || usage != DIB_RGB_COLORS || info->bmiHeader.biSize != sizeof(BITMAPINFOHEADER)) {
        return refuse();
    }
    const Surface& surface = source->surface;
    BITMAPINFOHEADER& header = info->bmiHeader;
    if (bits == nullptr && header.biBitCount == 0) {
        header.biWidth = surface.width;
        header.biHeight = surface.height;
        header.biPlanes = 1;
        header.biBitCount = static_cast<WORD>(surface.depth);
        header.biCompression = BI_RGB;
        header.biSizeImage = static_cast<DWORD>(surface.row_bytes) * static_cast<DWORD>(surface.height);
        return 1;
    }
    if (!fits(header, surface)) {
        return refuse();
    }
    const int depth = header.biBitCount;
    const std::int64_t row_bytes = image_row_bytes(surface.width, depth);
    const bool query = bits == nullptr;
    const std::int64_t last =
        query ? surface.height : std::min<std::int64_t>(surface.height, std::int64_t{first} + count);
    const std::int64_t rows = query ? last : std::max<std::int64_t>(last - first, 0);
    if (rows * row_bytes > UINT32_MAX || rows == 0) {
        return refuse();
    }
    header.biSizeImage = static_cast<DWORD>(rows * row_bytes);
    write_table(info, depth);
    if (query) {
        return 1;
    }
    const ValueConverter converter(surface.depth, depth);
    auto* to = static_cast<std::byte*>(bits);
    for (std::int64_t row = first; row < last; ++row, to += row_bytes) {
        const auto y = static_cast<int>(header.biHeight < 0 ? row : surface.height - 1 - row);
        copy_row(surface, y, depth, converter, to);
    }
    return static_cast<int>(rows);
}
