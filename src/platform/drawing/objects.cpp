#include "src/platform/drawing/objects.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <new>

#include "src/platform/system/failure.h"
#include "src/platform/system/no_destructor.h"

namespace {

using namespace basalt::platform;

constexpr std::uintptr_t FIRST_STOCK_HANDLE = 0x8000;
constexpr std::uintptr_t STOCK_BITMAP = NULL_PEN + 1;

constexpr Paint STOCK_PAINTS[] = {{0xFFFFFF, true}, {0xC0C0C0, true}, {0x808080, true},
                                  {0x404040, true}, {0, true},        {0, false}};

HGDIOBJ stock_handle(std::uintptr_t number) {
    return reinterpret_cast<HGDIOBJ>(FIRST_STOCK_HANDLE + number);  // NOLINT(performance-no-int-to-ptr)
}

// Larger than any stock object's for another handle.
std::uintptr_t stock_number(const void* handle) {
    return reinterpret_cast<std::uintptr_t>(handle) - FIRST_STOCK_HANDLE;
}

// Why DeleteObject fails, or ERROR_SUCCESS. Contexts are deleted by other calls.
DWORD deletion_error(const GraphicsObject& object) {
    switch (object.kind) {
        case GraphicsKind::CONTEXT:
            return ERROR_INVALID_HANDLE;
        case GraphicsKind::BITMAP:
            return static_cast<const Bitmap&>(object).is_selected ? ERROR_BUSY : ERROR_SUCCESS;
        case GraphicsKind::BRUSH:
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

bool is_stock_pen(const void* handle) {
    return stock_number(handle) >= WHITE_PEN && stock_number(handle) <= NULL_PEN;
}

bool is_brush(const void* handle) {
    const GraphicsObject* const object = find_graphics_object(handle);
    return stock_number(handle) <= NULL_BRUSH || (object != nullptr && object->kind == GraphicsKind::BRUSH);
}

std::optional<Paint> paint_of(const void* brush) {
    if (stock_number(brush) <= NULL_BRUSH) {
        return STOCK_PAINTS[stock_number(brush)];
    }
    const auto* const object = object_of<Brush>(brush);
    return object != nullptr ? std::optional(object->paint) : std::nullopt;
}

std::optional<PixelShift> Context::pixel_shift() const {
    if (world != Affine::shift(std::trunc(world.dx), std::trunc(world.dy))) {
        return std::nullopt;
    }
    // Beyond this nothing is on a surface, and sums with coordinates stay far from overflow.
    constexpr double FARTHEST = 0x1p40;
    return PixelShift{static_cast<std::int64_t>(std::clamp(world.dx, -FARTHEST, FARTHEST)),
                      static_cast<std::int64_t>(std::clamp(world.dy, -FARTHEST, FARTHEST))};
}

std::optional<PixelShift> Context::required_shift() const {
    const std::optional<PixelShift> shift = pixel_shift();
    if (!shift) {
        SetLastError(ERROR_NOT_SUPPORTED);
    }
    return shift;
}

}  // namespace basalt::platform

BOOL DeleteObject(HGDIOBJ object) {
    if (is_stock_object(object)) {
        return 1;
    }
    const GraphicsObject* const found = find_graphics_object(object);
    const DWORD error = found != nullptr ? deletion_error(*found) : ERROR_INVALID_HANDLE;
    if (error != ERROR_SUCCESS) {
        return fail_with(error, 0);
    }
    return release_graphics_object(object) != nullptr;
}

int GetObjectW(HGDIOBJ object, int size, void* record) {
    constexpr int RECORD_SIZE = sizeof(BITMAP);
    BITMAP description = {0, 1, 1, 2, 1, 1, nullptr};
    if (object != stock_bitmap()) {
        const auto* const bitmap = object_of<Bitmap>(object);
        if (bitmap == nullptr) {
            return 0;
        }
        const Surface& surface = bitmap->surface;
        description.bmWidth = surface.width;
        description.bmHeight = surface.height;
        description.bmWidthBytes = static_cast<LONG>(bitmap_row_bytes(surface.width, surface.depth));
        description.bmBitsPixel = static_cast<WORD>(surface.depth);
    }
    if (record == nullptr) {
        return RECORD_SIZE;
    }
    if (size < RECORD_SIZE) {
        return fail_with(ERROR_INSUFFICIENT_BUFFER, 0);
    }
    std::memcpy(record, &description, sizeof description);
    return RECORD_SIZE;
}

HGDIOBJ GetStockObject(int number) {
    if (number < WHITE_BRUSH || number > NULL_PEN) {
        return fail_with(ERROR_INVALID_PARAMETER, nullptr);
    }
    return stock_handle(static_cast<std::uintptr_t>(number));
}

HBRUSH CreateSolidBrush(COLORREF colour) {
    return static_cast<HBRUSH>(
        keep_graphics_object(std::unique_ptr<GraphicsObject>(new (std::nothrow) Brush(colour))));
}

CBrush* CBrush::FromHandle(HBRUSH brush) {
    if (stock_number(brush) <= NULL_BRUSH) {
        // Never destroyed: a host's static objects may still use one while the library unloads.
        struct Wrappers {
            CBrush lent[NULL_BRUSH + 1];
            Wrappers() {
                for (int i = 0; i <= NULL_BRUSH; ++i) {
                    lent[i].Attach(GetStockObject(i));
                }
            }
        };
        static NoDestructor<Wrappers> wrappers;
        return lend(wrappers->lent[stock_number(brush)], brush);
    }
    auto* const object = object_of<Brush>(brush);
    return object != nullptr ? lend(object->lent, brush) : nullptr;
}
