// What stands behind the handles: contexts, bitmaps, brushes, pens.
#ifndef BASALT_SRC_PLATFORM_DRAWING_GRAPHICS_OBJECT_KINDS_H
#define BASALT_SRC_PLATFORM_DRAWING_GRAPHICS_OBJECT_KINDS_H

#include <atomic>
#include <optional>

#include "basalt/platform/bitmap.h"
#include "basalt/platform/device_context.h"
#include "src/platform/drawing/graphics_handles.h"
#include "src/platform/pixels/affine.h"
#include "src/platform/pixels/surface.h"

namespace basalt::platform {

// What a brush fills or a pen outlines with.
struct Paint {
    COLORREF colour;
    bool draws;
};

// The stock bitmap's handle: in each context it stands for a pixel of the context's own.
HGDIOBJ stock_bitmap();
bool is_stock_object(const void* handle);

// The kind of an object or stock object; nothing for another handle.
std::optional<GraphicsKind> kind_of(const void* handle);

// What a brush or a pen, as the kind says, paints with; nothing, and ERROR_INVALID_HANDLE, for another
// handle.
std::optional<Paint> paint_of(const void* handle, GraphicsKind kind);

struct Brush : GraphicsObject {
    static constexpr GraphicsKind KIND = GraphicsKind::BRUSH;
    explicit Brush(Paint its_paint, GraphicsKind its_kind = KIND)
        : GraphicsObject(its_kind), paint(its_paint) {}

    const Paint paint;
    std::atomic<int> selections{0};  // contexts it is selected into
};

struct Pen : Brush {
    static constexpr GraphicsKind KIND = GraphicsKind::PEN;
    explicit Pen(Paint its_paint) : Brush(its_paint, KIND) {}
};

struct Bitmap : GraphicsObject {
    static constexpr GraphicsKind KIND = GraphicsKind::BITMAP;
    Bitmap() : GraphicsObject(KIND) {}
    ~Bitmap() override { lent.Detach(); }

    Surface surface;
    bool is_selected = false;
    CBitmap lent;  // what CBitmap::FromHandle lends
};

struct Context : GraphicsObject {
    static constexpr GraphicsKind KIND = GraphicsKind::CONTEXT;
    Context() : GraphicsObject(KIND) {}
    ~Context() override;

    Surface& surface() { return bitmap != nullptr ? bitmap->surface : own; }
    const Surface& surface() const { return bitmap != nullptr ? bitmap->surface : own; }

    bool is_screen = false;
    Surface own;               // the stock bitmap's pixel here; nothing for the screen
    Bitmap* bitmap = nullptr;  // null while that is selected
    HGDIOBJ bitmap_handle = stock_bitmap();
    HGDIOBJ brush_handle = GetStockObject(WHITE_BRUSH);
    HGDIOBJ pen_handle = GetStockObject(BLACK_PEN);
    Paint brush = {0xFFFFFF, true};
    Paint pen = {0, true};
    COLORREF text = 0;
    COLORREF background = 0xFFFFFF;
    int graphics_mode = GM_COMPATIBLE;
    int map_mode = MM_TEXT;
    Affine world;  // from the context's own coordinates to pixels
    CDC lent;      // what CDC::FromHandle lends
};

}  // namespace basalt::platform

#endif
