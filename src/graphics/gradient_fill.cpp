#include <algorithm>
#include <cstdint>

#include "basalt/frame.h"
#include "basalt/graphics/drawing.h"
#include "basalt/platform/drawing.h"
#include "src/frame/environment_state.h"
#include "src/graphics/os_codes.h"
#include "src/platform/rounded_rectangle.h"

namespace basalt::graphics {

namespace {

/// Corners of this colour show the gradient: it is the one that stands for the rounded inside, which is left
/// out.
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
        basalt::platform::fill_outside_rounding(hdc, rectangle, cornerRadius, cornerColour, INSIDE);
    }
}
