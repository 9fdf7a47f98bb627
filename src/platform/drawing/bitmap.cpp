#include "basalt/platform/bitmap.h"

#include <new>

#include "basalt/platform/error.h"
#include "src/platform/drawing/graphics_object_kinds.h"
#include "src/platform/pixel_format.h"
#include "src/platform/pixels/pixel_rows.h"

namespace {

using basalt::platform::Bitmap;
using basalt::platform::Context;
using basalt::platform::object_of;
using basalt::platform::Surface;

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
    return bitmap != nullptr ? static_cast<HBITMAP>(basalt::platform::keep_graphics_object(std::move(bitmap)))
                             : nullptr;
}

void take_rows(Surface& surface, const void* bits) {
    const auto* from = static_cast<const std::byte*>(bits);
    const auto row_bytes =
        static_cast<std::size_t>(basalt::platform::bitmap_row_bytes(surface.width, surface.depth));
    for (int y = 0; y < surface.height; ++y, from += row_bytes) {
        basalt::platform::copy_pixels(surface.depth, surface.row(y), 0, from, 0, surface.width);
    }
}

}  // namespace

HBITMAP CreateCompatibleBitmap(HDC dc, int width, int height) {
    auto* const context = object_of<Context>(dc);
    return context != nullptr ? keep_bitmap(make_bitmap(width, height, context->surface().depth)) : nullptr;
}

HBITMAP CreateBitmap(int width, int height, UINT planes, UINT bits_per_pixel, const void* bits) {
    if (planes != 1 || !basalt::platform::is_depth(bits_per_pixel)) {
        SetLastError(ERROR_INVALID_PARAMETER);
        return nullptr;
    }
    std::unique_ptr<Bitmap> bitmap = make_bitmap(width, height, static_cast<int>(bits_per_pixel));
    if (bitmap != nullptr && bits != nullptr && width != 0 && height != 0) {
        take_rows(bitmap->surface, bits);
    }
    return keep_bitmap(std::move(bitmap));
}

CBitmap* CBitmap::FromHandle(HBITMAP bitmap) {
    if (bitmap == basalt::platform::stock_bitmap()) {
        // Never destroyed, so that nothing waits for the library's unload.
        alignas(CBitmap) static unsigned char storage[sizeof(CBitmap)];
        static CBitmap* const lent = [bitmap] {
            auto* const wrapper = new (storage) CBitmap;
            wrapper->Attach(bitmap);
            return wrapper;
        }();
        // DeleteObject of the wrapper lets go of the handle. Written only then: threads share the wrapper.
        if (lent->m_hObject != bitmap) {
            lent->m_hObject = bitmap;
        }
        return lent;
    }
    auto* const object = object_of<Bitmap>(bitmap);
    if (object == nullptr) {
        return nullptr;
    }
    object->lent.m_hObject = bitmap;
    return &object->lent;
}
