#include <algorithm>
#include <cstdint>

#include "basalt/frame.h"
#include "basalt/graphics/drawing.h"
#include "basalt/platform/drawing.h"
#include "src/frame/environment_state.h"
#include "src/graphics/memory_surface.h"
#include "src/graphics/os_codes.h"
#include "src/graphics/solid_brush.h"

namespace basalt::graphics {

namespace {

/// Stands for the rounded inside on the corners' surface, and is left out when they are copied.
constexpr COLORREF INSIDE = 0x808080;

/// A channel as 8.8.
WORD level(BYTE channel) {
    return static_cast<WORD>(channel << 8);
}

/// A level divided and cut, within what 16 bits hold.
WORD darkened(WORD start, float darkening) {
    const float end = static_cast<float>(start) / darkening;
    constexpr float LARGEST = 0xFFFF;
    if (!(end > 0.0F)) {  // catches 0 / 0 too
        return 0;
    }
    return static_cast<WORD>(std::min(end, LARGEST));
}

void fill_gradient(HDC dc, const RECT& rectangle, COLORREF colour, float darkening, DWORD mode) {
    const WORD red = level(GetRValue(colour));
    const WORD green = level(GetGValue(colour));
    const WORD blue = level(GetBValue(colour));
    const TRIVERTEX vertices[] = {
        {rectangle.left, rectangle.top, red, green, blue, 0},
        {rectangle.right, rectangle.bottom, darkened(red, darkening), darkened(green, darkening),
         darkened(blue, darkening), 0},
    };
    constexpr GRADIENT_RECT JOINED = {0, 1};
    GradientFill(dc, vertices, 2, &JOINED, 1, mode);
}

/// Paints what of a block lies outside its rounding with a colour, the rest with INSIDE.
bool paint_corners(HDC dc, int width, int height, int diameter, COLORREF colour) {
    const SolidBrush outside(colour);
    const SolidBrush inside(INSIDE);
    if (!outside.is_ready() || !inside.is_ready()) {
        return false;
    }
    const RECT all = {0, 0, width, height};
    FillRect(dc, &all, outside.get());
    HGDIOBJ const brush = SelectObject(dc, inside.get());
    HGDIOBJ const pen = SelectObject(dc, GetStockObject(NULL_PEN));
    const bool painted = RoundRect(dc, 0, 0, width, height, diameter, diameter) != 0;
    SelectObject(dc, pen);
    SelectObject(dc, brush);
    return painted;
}

/// Paints the corners in the rectangle's own place. Beyond the diameter from its sides there is nothing to
/// paint, so the surface in memory has room for the four corners pushed together, and no more.
void round_corners(HDC dc, const RECT& rectangle, int diameter, COLORREF colour) {
    const std::int64_t width = std::int64_t{rectangle.right} - rectangle.left;
    const std::int64_t height = std::int64_t{rectangle.bottom} - rectangle.top;
    if (width <= 0 || height <= 0) {
        return;
    }
    const int block_width = static_cast<int>(std::min<std::int64_t>(width, diameter));
    const int block_height = static_cast<int>(std::min<std::int64_t>(height, diameter));
    const MemorySurface block(dc, CreateCompatibleBitmap(dc, block_width, block_height));
    if (!block.is_ready() || !paint_corners(block.dc(), block_width, block_height, diameter, colour)) {
        return;
    }
    // Of an odd block the middle line is all inside.
    const int corner_width = block_width / 2;
    const int corner_height = block_height / 2;
    for (const bool at_right : {false, true}) {
        for (const bool at_bottom : {false, true}) {
            const int x = at_right ? block_width - corner_width : 0;
            const int y = at_bottom ? block_height - corner_height : 0;
            _transparentblt(dc, at_right ? rectangle.right - corner_width : rectangle.left,
                            at_bottom ? rectangle.bottom - corner_height : rectangle.top, corner_width,
                            corner_height, block.dc(), x, y, corner_width, corner_height, INSIDE);
        }
    }
}

}  // namespace

}  // namespace basalt::graphics

void _gradientfill(HDC hdc, int left, int top, int right, int bottom, int cornerRadius,
                   std::uint32_t cornerColour, std::uint32_t colour, float darkening, std::uint32_t mode) {
    using namespace basalt::graphics;
    if (basalt::frame::environment.os_code.load() < OS_WITH_GRADIENTS) {
        return;
    }
    const RECT rectangle = {left, top, right, bottom};
    fill_gradient(hdc, rectangle, colour, darkening, mode);
    if (cornerRadius > 0) {
        round_corners(hdc, rectangle, cornerRadius, cornerColour);
    }
}
