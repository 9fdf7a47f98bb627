#include "basalt/graphics/drawing_functions.h"

#include <algorithm>
#include <cstdint>

#include "basalt/frame.h"
#include "basalt/platform/drawing.h"
#include "src/frame/environment_state.h"
#include "src/graphics/owned_objects.h"
#include "src/platform/raster_extras.h"

namespace basalt::graphics {

namespace {

constexpr basalt_os OS_WITH_MASKS = 2;      // contexts copy between depths
constexpr basalt_os OS_WITH_GRADIENTS = 5;  // gradients and transparent copies are calls of the platform

/// Stands for the rounded interior, which is left out; corners of this colour show the gradient.
constexpr COLORREF INSIDE = 0x808080;

/// A channel as 8.8.
WORD level(BYTE channel) {
    return static_cast<WORD>(channel << 8);
}

/// A level divided and truncated, clamped to 16 bits.
WORD darkened(WORD start, float darkening) {
    const float end = static_cast<float>(start) / darkening;
    constexpr float LARGEST = 0xFFFF;
    if (!(end > 0.0F)) {  // also 0 / 0
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

struct Place {
    HDC dc;
    int x, y;
};

/// The copy by masks, for a platform without a transparent copy. Surfaces: s the source, k its copy, r the
/// result, m the mask (1: transparent), i the inverse mask.
void copy_by_masks(Place dest, Place src, int width, int height, COLORREF transparent) {
    const HDC like = dest.dc;
    const MemorySurface s(like, CreateCompatibleBitmap(like, width, height));
    if (BitBlt(s.dc(), 0, 0, width, height, src.dc, src.x, src.y, SRCCOPY) == 0) {
        return;  // the surfaces' contents would spoil the destination; also below
    }
    POINT size = {width, height};
    DPtoLP(src.dc, &size, 1);

    const MemorySurface k(like, CreateCompatibleBitmap(like, size.x, size.y));
    const MemorySurface r(like, CreateCompatibleBitmap(like, size.x, size.y));
    const MemorySurface m(like, CreateBitmap(size.x, size.y, 1, 1, nullptr));
    const MemorySurface i(like, CreateBitmap(size.x, size.y, 1, 1, nullptr));
    for (const MemorySurface* surface : {&s, &k, &r, &m, &i}) {
        if (!surface->is_ready()) {
            return;
        }
    }
    const auto combine = [size](const MemorySurface& to, const MemorySurface& from, DWORD rop) {
        BitBlt(to.dc(), 0, 0, size.x, size.y, from.dc(), 0, 0, rop);
    };
    SetMapMode(s.dc(), GetMapMode(like));
    combine(k, s, SRCCOPY);
    // To one bit, pixels of the source's background colour become 1.
    const COLORREF background = SetBkColor(s.dc(), transparent);
    combine(m, s, SRCCOPY);
    SetBkColor(s.dc(), background);
    combine(i, m, NOTSRCCOPY);
    if (BitBlt(r.dc(), 0, 0, size.x, size.y, dest.dc, dest.x, dest.y, SRCCOPY) == 0) {
        return;
    }
    combine(r, m, SRCAND);
    combine(s, i, SRCAND);
    combine(r, s, SRCPAINT);
    BitBlt(dest.dc, dest.x, dest.y, size.x, size.y, r.dc(), 0, 0, SRCCOPY);
    combine(s, k, SRCCOPY);
}

}  // namespace

}  // namespace basalt::graphics

int _transparentblt(HDC dest, int xDest, int yDest, int wDest, int hDest, HDC src, int xSrc, int ySrc,
                    int wSrc, int hSrc, unsigned int transparentColour) {
    using namespace basalt::graphics;
    const basalt_os code = basalt::frame::environment.os_code.load();
    if (code >= OS_WITH_GRADIENTS) {
        return TransparentBlt(dest, xDest, yDest, wDest, hDest, src, xSrc, ySrc, wSrc, hSrc,
                              transparentColour);
    }
    if (code >= OS_WITH_MASKS) {
        copy_by_masks({dest, xDest, yDest}, {src, xSrc, ySrc}, wSrc, hSrc, transparentColour);
        return 0;
    }
    return BitBlt(dest, xDest, yDest, wDest, hDest, src, 0, 0, SRCAND);
}

void _gradientfill(HDC hdc, int left, int top, int right, int bottom, int cornerRadius,
                   std::uint32_t cornerColour, std::uint32_t colour, float darkening, std::uint32_t mode) {
    using namespace basalt::graphics;
    if (basalt::frame::environment.os_code.load() < OS_WITH_GRADIENTS) {
        return;
    }
    const RECT rectangle = {left, top, right, bottom};
    fill_gradient(hdc, rectangle, colour, darkening, mode);
    if (cornerRadius > 0) {
        basalt::platform::fill_outside_rounding(hdc, rectangle, cornerRadius, cornerColour, INSIDE);
    }
}
