#include "basalt/frame.h"
#include "basalt/graphics/drawing.h"
#include "basalt/platform/drawing.h"
#include "src/frame/environment_state.h"
#include "src/graphics/memory_surface.h"
#include "src/graphics/os_codes.h"

namespace basalt::graphics {

namespace {

struct Place {
    HDC dc;
    int x, y;
};

/// The copy by masks, for a platform without one of its own. The letters are those of the surfaces: S source,
/// K its copy, R result, M mask (1: transparent), I inverse mask.
void copy_by_masks(Place dest, Place src, int width, int height, COLORREF transparent) {
    const HDC like = dest.dc;
    const MemorySurface s(like, CreateCompatibleBitmap(like, width, height));
    if (BitBlt(s.dc(), 0, 0, width, height, src.dc, src.x, src.y, SRCCOPY) == 0) {
        return;  // what the surfaces hold otherwise would spoil the destination; so below
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
    // Going to one bit, what has the source's background colour becomes 1.
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
