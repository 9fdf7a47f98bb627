#include "basalt/platform/bitmap.h"

#include <algorithm>
#include <cstddef>
#include <cstdlib>
#include <cstring>
#include <new>

#include "src/platform/drawing/objects.h"
#include "src/platform/pixels/pixel_format.h"
#include "src/platform/pixels/pixel_rows.h"
#include "src/platform/raster_extras.h"
#include "src/platform/system/failure.h"
#include "src/platform/system/no_destructor.h"

namespace {

using namespace basalt::platform;

std::unique_ptr<Bitmap> make_bitmap(int width, int height, int depth) {
    const bool has_pixels = width != 0 && height != 0;
    std::unique_ptr<Bitmap> bitmap(new (std::nothrow) Bitmap);
    if (bitmap == nullptr) {
        SetLastError(ERROR_NOT_ENOUGH_MEMORY);
    } else if (!bitmap->surface.create(has_pixels ? width : 1, has_pixels ? height : 1,
                                       has_pixels ? depth : 1)) {
        bitmap = nullptr;
    }
    return bitmap;
}

HBITMAP keep_bitmap(std::unique_ptr<Bitmap> bitmap) {
    return bitmap != nullptr ? static_cast<HBITMAP>(keep_graphics_object(std::move(bitmap))) : nullptr;
}

void take_rows(Surface& surface, const void* bits) {
    const auto* from = static_cast<const std::byte*>(bits);
    const auto row_bytes = static_cast<std::size_t>(bitmap_row_bytes(surface.width, surface.depth));
    for (int y = 0; y < surface.height; ++y, from += row_bytes) {
        copy_pixels(surface.depth, surface.row(y), 0, from, 0, surface.width);
    }
}

bool fits(const BITMAPINFOHEADER& header, const Surface& surface) {
    return header.biPlanes == 1 && is_depth(header.biBitCount) && header.biCompression == BI_RGB &&
           header.biWidth == surface.width && std::abs(std::int64_t{header.biHeight}) == surface.height;
}

void write_table(BITMAPINFO* info, int depth) {
    // The entries lie behind the record's end, so they are reached from the record's own address.
    auto* entry = reinterpret_cast<std::byte*>(info) + offsetof(BITMAPINFO, bmiColors);
    for (const std::uint32_t word : colour_table(depth)) {
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
    std::memset(to + row_bytes - 4, 0, 4);  // the row's padding
    in_pieces(surface.width, false, [&](int offset, int size) {
        std::uint32_t values[PIECE];
        const std::span<std::uint32_t> piece(values, static_cast<std::size_t>(size));
        read_pixels(surface.depth, surface.row(y), offset, piece);
        converter.convert(piece);
        write_pixels(depth, to, offset, piece);
    });
}

}  // namespace

HBITMAP CreateCompatibleBitmap(HDC dc, int width, int height) {
    auto* const context = object_of<Context>(dc);
    return context != nullptr ? keep_bitmap(make_bitmap(width, height, context->surface().depth)) : nullptr;
}

HBITMAP CreateBitmap(int width, int height, UINT planes, UINT bits_per_pixel, const void* bits) {
    if (planes != 1 || !is_depth(bits_per_pixel)) {
        return fail_with(ERROR_INVALID_PARAMETER, nullptr);
    }
    std::unique_ptr<Bitmap> bitmap = make_bitmap(width, height, static_cast<int>(bits_per_pixel));
    if (bitmap != nullptr && bits != nullptr && width != 0 && height != 0) {
        take_rows(bitmap->surface, bits);
    }
    return keep_bitmap(std::move(bitmap));
}

int GetDIBits(HDC dc, HBITMAP bitmap, UINT first, UINT count, void* bits, BITMAPINFO* info, UINT usage) {
    const auto* const source = object_of<Context>(dc) != nullptr ? object_of<Bitmap>(bitmap) : nullptr;
    if (source == nullptr) {
        return 0;
    }
    if (info == nullptr || usage != DIB_RGB_COLORS || info->bmiHeader.biSize != sizeof(BITMAPINFOHEADER)) {
        return fail_with(ERROR_INVALID_PARAMETER, 0);
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
        return fail_with(ERROR_INVALID_PARAMETER, 0);
    }
    const int depth = header.biBitCount;
    const std::int64_t row_bytes = image_row_bytes(surface.width, depth);
    const bool query = bits == nullptr;
    const std::int64_t last =
        query ? surface.height : std::min<std::int64_t>(surface.height, std::int64_t{first} + count);
    const std::int64_t rows = query ? last : std::max<std::int64_t>(last - first, 0);
    if (rows * row_bytes > UINT32_MAX || rows == 0) {
        return fail_with(ERROR_INVALID_PARAMETER, 0);
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

bool basalt::platform::read_row(HBITMAP bitmap, int row, int column, std::span<std::uint32_t> pixels) {
    const auto* const source = object_of<Bitmap>(bitmap);
    if (source == nullptr) {
        return false;
    }
    const Surface& surface = source->surface;
    read_pixels(surface.depth, surface.row(row), column, pixels);
    if (surface.depth != 16) {
        ValueConverter(surface.depth, 32).convert(pixels);
    }
    return true;
}

std::uint32_t basalt::platform::row_value(int depth, COLORREF colour) {
    return value_of_colour(depth == 16 ? 16 : 32, colour);
}

CBitmap* CBitmap::FromHandle(HBITMAP bitmap) {
    if (bitmap == stock_bitmap()) {
        // Never destroyed: a host's static objects may still use it while the library unloads.
        struct Wrapper {
            CBitmap lent;
            Wrapper() { lent.Attach(stock_bitmap()); }
        };
        static NoDestructor<Wrapper> wrapper;
        return lend(wrapper->lent, bitmap);
    }
    auto* const object = object_of<Bitmap>(bitmap);
    return object != nullptr ? lend(object->lent, bitmap) : nullptr;
}
