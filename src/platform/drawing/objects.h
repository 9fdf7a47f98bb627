// The objects behind the handles: contexts, bitmaps, brushes.
#ifndef BASALT_SRC_PLATFORM_DRAWING_OBJECTS_H
#define BASALT_SRC_PLATFORM_DRAWING_OBJECTS_H

#include <atomic>
#include <cstdint>
#include <optional>

#include "basalt/platform/bitmap.h"
#include "basalt/platform/device_context.h"
#include "src/platform/drawing/handles.h"
#include "src/platform/pixels/affine.h"
#include "src/platform/pixels/surface.h"

namespace basalt::platform {

// What a brush fills with.
struct Paint {
    COLORREF colour;
    bool draws;
};

// The stock bitmap's handle: in each context it stands for a pixel of the context's own.
HGDIOBJ stock_bitmap();
bool is_stock_object(const void* handle);
bool is_stock_pen(const void* handle);

// The wrapper that FromHandle returns. Its DeleteObject takes the handle out; written only after that, since
// threads share the wrappers of brushes and stock objects.
template <typename Wrapper>
Wrapper* lend(Wrapper& wrapper, HGDIOBJ handle) {
    if (wrapper.m_hObject != handle) {
        wrapper.m_hObject = handle;
    }
    return &wrapper;
}

// The paint of a brush; nothing, and ERROR_INVALID_HANDLE, for another handle.
std::optional<Paint> paint_of(const void* brush);
bool is_brush(const void* handle);

struct Brush : GraphicsObject {
    static constexpr GraphicsKind KIND = GraphicsKind::BRUSH;
    explicit Brush(COLORREF colour) : GraphicsObject(KIND), paint{colour, true} {}

    ~Brush() override { lent.Detach(); }

    const Paint paint;
    std::atomic<int> selections{0};  // contexts it is selected into
    CBrush lent;                     // what CBrush::FromHandle lends
};

struct Bitmap : GraphicsObject {
    static constexpr GraphicsKind KIND = GraphicsKind::BITMAP;
    Bitmap() : GraphicsObject(KIND) {}
    ~Bitmap() override { lent.Detach(); }

    Surface surface;
    bool is_selected = false;
    CBitmap lent;  // what CBitmap::FromHandle lends
};

struct PixelShift {
    std::int64_t x;
    std::int64_t y;
};

inline Box shifted(const RECT& rectangle, const PixelShift& shift) {
    return {rectangle.left + shift.x, rectangle.top + shift.y, rectangle.right + shift.x,
            rectangle.bottom + shift.y};
}

struct Context : GraphicsObject {
    static constexpr GraphicsKind KIND = GraphicsKind::CONTEXT;
    Context() : GraphicsObject(KIND) {}
    ~Context() override;

    Surface& surface() { return bitmap != nullptr ? bitmap->surface : own; }
    const Surface& surface() const { return bitmap != nullptr ? bitmap->surface : own; }

    // The shift by whole pixels that the transform is; nothing for another transform.
    std::optional<PixelShift> pixel_shift() const;
    // The same, with ERROR_NOT_SUPPORTED for another transform.
    std::optional<PixelShift> required_shift() const;

    bool is_screen = false;
    Surface own;               // the stock bitmap's pixel here; empty for the screen
    Bitmap* bitmap = nullptr;  // null while the stock bitmap is selected
    HGDIOBJ bitmap_handle = stock_bitmap();
    HGDIOBJ brush_handle = GetStockObject(WHITE_BRUSH);
    HGDIOBJ pen_handle = GetStockObject(BLACK_PEN);
    Paint brush = {0xFFFFFF, true};
    COLORREF text = 0;
    COLORREF background = 0xFFFFFF;
    int graphics_mode = GM_COMPATIBLE;
    int map_mode = MM_TEXT;
    Affine world;  // from the context's own coordinates to pixels
    CDC lent;      // what CDC::FromHandle lends
};

}  // namespace basalt::platform

#endif
