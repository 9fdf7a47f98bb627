#include "basalt/platform/device_context.h"

#include <new>
#include <utility>

#include "src/platform/drawing/objects.h"
#include "src/platform/system/failure.h"

namespace {

using namespace basalt::platform;

HDC keep_context(bool is_screen) {
    std::unique_ptr<Context> context(new (std::nothrow) Context);
    if (context != nullptr) {
        context->is_screen = is_screen;
        const int side = is_screen ? 0 : 1;
        if (!context->own.create(side, side, is_screen ? 32 : 1)) {
            return nullptr;
        }
    }
    return static_cast<HDC>(keep_graphics_object(std::move(context)));
}

void count_selection(HGDIOBJ brush, int change) {
    if (!is_stock_object(brush)) {
        // A counted brush cannot be deleted, so a handle that was selected is still valid.
        static_cast<Brush*>(find_graphics_object(brush))->selections += change;
    }
}

HGDIOBJ exchange_brush(Context& context, HGDIOBJ next) {
    context.brush = *paint_of(next);
    count_selection(next, 1);
    count_selection(context.brush_handle, -1);
    return std::exchange(context.brush_handle, next);
}

HGDIOBJ exchange_bitmap(Context& context, HGDIOBJ next) {
    const bool to_stock = next == stock_bitmap();
    auto* const bitmap = to_stock ? nullptr : object_of<Bitmap>(next);
    if (!to_stock && bitmap == nullptr) {
        return nullptr;
    }
    if (context.is_screen) {
        return fail_with(ERROR_INVALID_PARAMETER, nullptr);
    }
    if (bitmap != nullptr && bitmap != context.bitmap && bitmap->is_selected) {
        return fail_with(ERROR_BUSY, nullptr);
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

// Deletes a context of the kind that the call is for.
BOOL end_context(HDC dc, bool is_screen) {
    const auto* const context = object_of<Context>(dc);
    if (context == nullptr) {
        return 0;
    }
    if (context->is_screen != is_screen) {
        return fail_with(ERROR_INVALID_HANDLE, 0);
    }
    return release_graphics_object(dc) != nullptr;
}

COLORREF exchange_colour(HDC dc, COLORREF Context::*member, COLORREF colour) {
    auto* const context = object_of<Context>(dc);
    return context != nullptr ? std::exchange(context->*member, colour) : CLR_INVALID;
}

}  // namespace

basalt::platform::Context::~Context() {
    if (bitmap != nullptr) {
        bitmap->is_selected = false;
    }
    count_selection(brush_handle, -1);
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
        return fail_with(ERROR_INVALID_HANDLE, nullptr);
    }
    return keep_context(true);
}

int ReleaseDC(HWND window, HDC dc) {
    if (window != nullptr) {
        return fail_with(ERROR_INVALID_HANDLE, 0);
    }
    return end_context(dc, true);
}

HGDIOBJ SelectObject(HDC dc, HGDIOBJ object) {
    auto* const context = object_of<Context>(dc);
    if (context == nullptr) {
        return nullptr;
    }
    if (is_brush(object)) {
        return exchange_brush(*context, object);
    }
    if (is_stock_pen(object)) {
        return std::exchange(context->pen_handle, object);
    }
    return exchange_bitmap(*context, object);
}

COLORREF SetBkColor(HDC dc, COLORREF colour) {
    return exchange_colour(dc, &Context::background, colour);
}

COLORREF SetTextColor(HDC dc, COLORREF colour) {
    return exchange_colour(dc, &Context::text, colour);
}

CDC* CDC::FromHandle(HDC dc) {
    auto* const context = object_of<Context>(dc);
    if (context == nullptr) {
        return nullptr;
    }
    context->lent.m_hDC = dc;
    return &context->lent;
}
