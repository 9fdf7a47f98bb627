#include <cmath>

#include "basalt/geo/units.h"
#include "basalt/graphics/bitmap_functions.h"
#include "basalt/platform/drawing.h"
#include "src/geo/elementary/elementary.h"
#include "src/graphics/owned_objects.h"

namespace basalt::graphics {

namespace {

/// Where no source pixel comes: red 128, green 128, blue 0.
constexpr COLORREF UNCOVERED = 0x008080;

bool fill(HDC dc, int width, int height, COLORREF colour) {
    const CBrush brush(colour);
    const RECT all = {0, 0, width, height};
    return FillRect(dc, &all, brush) != 0;
}

/// Copies a picture turned clockwise about the middle, to a context in GM_ADVANCED.
bool copy_turned(HDC to, HDC from, int width, int height, float degrees) {
    const int middle_column = width / 2;
    const int middle_row = height / 2;
    const auto x = static_cast<float>(middle_column);
    const auto y = static_cast<float>(middle_row);
    const geo::elementary::SineCosine turn =
        geo::elementary::sin_cos(_degtorad(static_cast<double>(degrees)));
    const auto cosine = static_cast<float>(turn.cosine);
    const auto sine = static_cast<float>(turn.sine);
    const XFORM to_middle = {1.0F, 0.0F, 0.0F, 1.0F, x, y};
    const XFORM rotation = {cosine, sine, -sine, cosine, 0.0F, 0.0F};
    const XFORM from_middle = {1.0F, 0.0F, 0.0F, 1.0F, -x, -y};
    // Each is multiplied from the left, so the last one is applied to a point first.
    return SetWorldTransform(to, &to_middle) != 0 &&
           ModifyWorldTransform(to, &rotation, MWT_LEFTMULTIPLY) != 0 &&
           ModifyWorldTransform(to, &from_middle, MWT_LEFTMULTIPLY) != 0 &&
           BitBlt(to, 0, 0, width, height, from, 0, 0, SRCCOPY) != 0;
}

}  // namespace

}  // namespace basalt::graphics

namespace vex_util::mfc {

bool RotateBitmap(CDC* dc, CBitmap* bitmap, float angle) {
    using namespace basalt::graphics;
    if (angle == 0.0F || !std::isfinite(angle) || dc == nullptr || bitmap == nullptr) {
        return false;
    }
    BITMAP record = {};
    if (bitmap->GetBitmap(&record) == 0) {
        return false;
    }
    const int width = record.bmWidth;
    const int height = record.bmHeight;
    const MemoryContext source(*dc, *bitmap);
    if (!source.is_ready()) {
        return false;
    }
    const MemorySurface work(source.dc(), CreateCompatibleBitmap(source.dc(), width, height));
    if (!work.is_ready() || !fill(work.dc(), width, height, UNCOVERED)) {
        return false;
    }
    const int mode = SetGraphicsMode(work.dc(), GM_ADVANCED);
    if (mode == 0) {
        return false;
    }
    const bool turned = copy_turned(work.dc(), source.dc(), width, height, angle);
    ModifyWorldTransform(work.dc(), nullptr, MWT_IDENTITY);
    SetGraphicsMode(work.dc(), mode);
    return turned && BitBlt(source.dc(), 0, 0, width, height, work.dc(), 0, 0, SRCCOPY) != 0;
}

}  // namespace vex_util::mfc
