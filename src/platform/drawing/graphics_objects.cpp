#include "basalt/platform/graphics_objects.h"

#include <cstdlib>
#include <cstring>
#include <new>

#include "basalt/platform/error.h"
#include "src/platform/drawing/graphics_object_kinds.h"

namespace {

using basalt::platform::Bitmap;
using basalt::platform::Brush;
using basalt::platform::GraphicsKind;
using basalt::platform::GraphicsObject;
using basalt::platform::Paint;
using basalt::platform::Pen;

constexpr std::uintptr_t FIRST_STOCK_HANDLE = 0x8000;
constexpr std::uintptr_t STOCK_BITMAP = NULL_PEN + 1;

constexpr Paint STOCK_PAINTS[] = {
    {0xFFFFFF, true}, {0xC0C0C0, true}, {0x808080, true}, {0x404040, true}, {0, true},
    {0, false},       {0xFFFFFF, true}, {0, true},        {0, false},
};

HGDIOBJ stock_handle(std::uintptr_t number) {
    return reinterpret_cast<HGDIOBJ>(FIRST_STOCK_HANDLE + number);  // NOLINT(performance-no-int-to-ptr)
}

// Numbers that are too large for a stock object come out for any other handle.
std::uintptr_t stock_number(const void* handle) {
    return reinterpret_cast<std::uintptr_t>(handle) - FIRST_STOCK_HANDLE;
}

// Whether nothing keeps the object from being deleted; a context is no object in that sense.
DWORD deletion_error(const GraphicsObject& object) {
    switch (object.kind) {
        case GraphicsKind::CONTEXT:
            return ERROR_INVALID_HANDLE;
        case GraphicsKind::BITMAP:
            return static_cast<const Bitmap&>(object).is_selected ? ERROR_BUSY : ERROR_SUCCESS;
        case GraphicsKind::BRUSH:
        case GraphicsKind::PEN:
            return static_cast<const Brush&>(object).selections > 0 ? ERROR_BUSY : ERROR_SUCCESS;
        case GraphicsKind::REGION:
            break;
    }
    return ERROR_SUCCESS;
}

}  // namespace

namespace basalt::platform {

HGDIOBJ stock_bitmap() {
    return stock_handle(STOCK_BITMAP);
}

bool is_stock_object(const void* handle) {
    return stock_number(handle) <= STOCK_BITMAP;
}

std::optional<GraphicsKind> kind_of(const void* handle) {
    if (is_stock_object(handle)) {
        const std::uintptr_t number = stock_number(handle);
        if (number == STOCK_BITMAP) {
            return GraphicsKind::BITMAP;
        }
        return number <= NULL_BRUSH ? GraphicsKind::BRUSH : GraphicsKind::PEN;
    }
    const GraphicsObject* const object = find_graphics_object(handle);
    return object != nullptr ? std::optional(object->kind) : std::nullopt;
}

std::optional<Paint> paint_of(const void* handle, GraphicsKind kind) {
    if (kind_of(handle) != kind) {
        SetLastError(ERROR_INVALID_HANDLE);
        return std::nullopt;
    }
    if (is_stock_object(handle)) {
        return STOCK_PAINTS[stock_number(handle)];
    }
    return static_cast<const Brush*>(find_graphics_object(handle))->paint;
}

}  // namespace basalt::platform

BOOL DeleteObject(HGDIOBJ object) {
    if (basalt::platform::is_stock_object(object)) {
        return 1;
    }
    const GraphicsObject* const found = basalt::platform::find_graphics_object(object);
    const DWORD error = found != nullptr ? deletion_error(*found) : ERROR_INVALID_HANDLE;
    if (error != ERROR_SUCCESS) {
        SetLastError(error);
        return 0;
    }
    return basalt::platform::release_graphics_object(object) != nullptr;
}

int GetObjectW(HGDIOBJ object, int size, void* record) {
    constexpr int RECORD_SIZE = sizeof(BITMAP);
    BITMAP description = {0, 1, 1, 2, 1, 1, nullptr};
    if (object != basalt::platform::stock_bitmap()) {
        const auto* const bitmap = basalt::platform::object_of<Bitmap>(object);
        if (bitmap == nullptr) {
            return 0;
        }
        const basalt::platform::Surface& surface = bitmap->surface;
        description.bmWidth = surface.width;
        description.bmHeight = surface.height;
        description.bmWidthBytes =
            static_cast<LONG>(basalt::platform::bitmap_row_bytes(surface.width, surface.depth));
        description.bmBitsPixel = static_cast<WORD>(surface.depth);
    }
    if (record == nullptr) {
        return RECORD_SIZE;
    }
    if (size < RECORD_SIZE) {
        SetLastError(ERROR_INSUFFICIENT_BUFFER);
        return 0;
    }
    std::memcpy(record, &description, sizeof description);
    return RECORD_SIZE;
}

HGDIOBJ GetStockObject(int number) {
    if (number < WHITE_BRUSH || number > NULL_PEN) {
        SetLastError(ERROR_INVALID_PARAMETER);
        return nullptr;
    }
    return stock_handle(static_cast<std::uintptr_t>(number));
}

HBRUSH CreateSolidBrush(COLORREF colour) {
    return static_cast<HBRUSH>(basalt::platform::keep_graphics_object(
        std::unique_ptr<GraphicsObject>(new (std::nothrow) Brush({colour, true}))));
}

HPEN CreatePen(int style, int /*width*/, COLORREF colour) {
    if (style != PS_SOLID && style != PS_NULL) {
        SetLastError(ERROR_INVALID_PARAMETER);
        return nullptr;
    }
    return static_cast<HPEN>(basalt::platform::keep_graphics_object(
        std::unique_ptr<GraphicsObject>(new (std::nothrow) Pen({colour, style == PS_SOLID}))));
}
