#include "basalt/platform/device_context.h"

#include <new>
#include <optional>
#include <utility>

#include "basalt/platform/error.h"
#include "src/platform/drawing/graphics_object_kinds.h"

namespace {

using basalt::platform::Bitmap;
using basalt::platform::Brush;
using basalt::platform::Context;
using basalt::platform::GraphicsKind;
using basalt::platform::object_of;
using basalt::platform::Paint;

HDC keep_context(bool is_screen) {
    std::unique_ptr<Context> context(new (std::nothrow) Context);
    if (context != nullptr) {
        context->is_screen = is_screen;
        const int side = is_screen ? 0 : 1;
        if (!context->own.create(side, side, is_screen ? 32 : 1)) {
            return nullptr;
        }
    }
    return static_cast<HDC>(basalt::platform::keep_graphics_object(std::move(context)));
}

void count_selection(HGDIOBJ brush_or_pen, int change) {
    if (!basalt::platform::is_stock_object(brush_or_pen)) {
        // Nobody can delete what is counted, so a handle that was selected is still valid.
        static_cast<Brush*>(basalt::platform::find_graphics_object(brush_or_pen))->selections += change;
    }
}

HGDIOBJ exchange_paint(HGDIOBJ& current, Paint& paint, HGDIOBJ next, GraphicsKind kind) {
    paint = *basalt::platform::paint_of(next, kind);
    count_selection(next, 1);
    count_selection(current, -1);
    return std::exchange(current, next);
}

HGDIOBJ exchange_bitmap(Context& context, HGDIOBJ next) {
    const bool to_stock = next == basalt::platform::stock_bitmap();
    auto* const bitmap = to_stock ? nullptr : object_of<Bitmap>(next);
    if (!to_stock && bitmap == nullptr) {
        return nullptr;
    }
    if (context.is_screen) {
        SetLastError(ERROR_INVALID_PARAMETER);
        return nullptr;
    }
    if (bitmap != nullptr && bitmap != context.bitmap && bitmap->is_selected) {
        SetLastError(ERROR_BUSY);
        return nullptr;
    }
    if (context.bitmap != nullptr) {
        context.bitmap->is_selected = false;
    }
    if (bitmap != nullptr) {
        bitmap->is_selected = true;
    }
    context.bitmap = bitmap;
    return std::exchange(context.bitmap_handle, next);
}

// Takes the context out if it is of the kind asked for.
BOOL end_context(HDC dc, bool is_screen) {
    const auto* const context = object_of<Context>(dc);
    if (context == nullptr) {
        return 0;
    }
    if (context->is_screen != is_screen) {
        SetLastError(ERROR_INVALID_HANDLE);
        return 0;
    }
    return basalt::platform::release_graphics_object(dc) != nullptr;
}

COLORREF exchange_colour(HDC dc, COLORREF Context::*member, COLORREF colour) {
    auto* const context = object_of<Context>(dc);
    return context != nullptr ? std::exchange(context->*member, colour) : CLR_INVALID;
}

COLORREF colour_of(HDC dc, COLORREF Context::*member) {
    const auto* const context = object_of<Context>(dc);
    return context != nullptr ? context->*member : CLR_INVALID;
}

}  // namespace

basalt::platform::Context::~Context() {
    if (bitmap != nullptr) {
        bitmap->is_selected = false;
    }
    count_selection(brush_handle, -1);
    count_selection(pen_handle, -1);
    lent.Detach();
}

HDC CreateCompatibleDC(HDC dc) {
    if (dc != nullptr && object_of<Context>(dc) == nullptr) {
        return nullptr;
    }
    return keep_context(false);
}

BOOL DeleteDC(HDC dc) {
    return end_context(dc, false);
}

HDC GetDC(HWND window) {
    if (window != nullptr) {
        SetLastError(ERROR_INVALID_HANDLE);
        return nullptr;
    }
    return keep_context(true);
}

int ReleaseDC(HWND window, HDC dc) {
    if (window != nullptr) {
        SetLastError(ERROR_INVALID_HANDLE);
        return 0;
    }
    return end_context(dc, true);
}

HGDIOBJ SelectObject(HDC dc, HGDIOBJ object) {
    auto* const context = object_of<Context>(dc);
    if (context == nullptr) {
        return nullptr;
    }
    const std::optional<GraphicsKind> kind = basalt::platform::kind_of(object);
    if (kind == GraphicsKind::BRUSH) {
        return exchange_paint(context->brush_handle, context->brush, object, *kind);
    }
    if (kind == GraphicsKind::PEN) {
        return exchange_paint(context->pen_handle, context->pen, object, *kind);
    }
    return exchange_bitmap(*context, object);
}

COLORREF SetBkColor(HDC dc, COLORREF colour) {
    return exchange_colour(dc, &Context::background, colour);
}

COLORREF GetBkColor(HDC dc) {
    return colour_of(dc, &Context::background);
}

COLORREF SetTextColor(HDC dc, COLORREF colour) {
    return exchange_colour(dc, &Context::text, colour);
}

COLORREF GetTextColor(HDC dc) {
    return colour_of(dc, &Context::text);
}

CDC* CDC::FromHandle(HDC dc) {
    auto* const context = object_of<Context>(dc);
    if (context == nullptr) {
        return nullptr;
    }
    context->lent.m_hDC = dc;
    return &context->lent;
}
