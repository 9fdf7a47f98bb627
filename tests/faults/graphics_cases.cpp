// Drawing objects and everything that draws.
#include <memory>

#include "basalt/graphics.h"
#include "tests/faults/trial.h"
#include "tests/graphics/stored_os_code.h"
#include "tests/support/drawing.h"

namespace basalt::faults {

namespace {

using namespace drawing;
using namespace vex_util::mfc;

struct Objects {
    bool act() noexcept {
        CBrush brush(0x102030);
        CBitmap bitmap, compatible;
        CRgn region;
        CDC dc;
        return brush.m_hObject != nullptr && bitmap.CreateBitmap(100, 100, 1, 24, nullptr) != 0 &&
               region.CreateRectRgn(1, 2, 3, 4) != 0 && dc.CreateCompatibleDC(nullptr) != 0 &&
               compatible.CreateCompatibleBitmap(&dc, 10, 10) != 0;
    }
    bool holds(bool) const { return true; }
};

struct Combination {
    CRgn a, b, both;
    Combination() {
        a.CreateRectRgn(0, 0, 10, 10);
        b.CreateRectRgn(5, 5, 15, 15);
        both.CreateRectRgn(7, 7, 8, 8);
    }
    bool act() noexcept { return both.CombineRgn(&a, &b, RGN_XOR) != RGN_ERROR; }
    bool holds(bool done) const {
        return (both.PtInRegion(7, 7) == 0) == done && both.PtInRegion(1, 1) == done;
    }
};

// Each changes a canvas as a whole or not at all.
struct Drawing {
    Picture before = Picture(30, 20, 32, 0x112233);
    Canvas canvas{before}, other{Picture(30, 20, 32, 0x445566)};
    bool holds(bool done) const { return (canvas.picture() == before) != done; }
};

struct TransparentCopyOntoItself : Drawing {
    TransparentCopyOntoItself() { SetPixel(canvas, 0, 0, 0xFF), before = canvas.picture(); }
    bool act() noexcept { return TransparentBlt(canvas, 1, 1, 20, 10, canvas, 0, 0, 10, 5, 0xFFFFFF) != 0; }
};

struct ScaledCopyOntoItself : TransparentCopyOntoItself {
    bool act() noexcept {
        const XFORM twice = {2, 0, 0, 2, 0, 0};
        SetGraphicsMode(canvas, GM_ADVANCED);
        return SetWorldTransform(canvas, &twice) != 0 &&
               BitBlt(canvas, 5, 5, 5, 5, canvas, 0, 0, SRCCOPY) != 0;
    }
};

struct MaskCopy : Drawing {
    StoredOsCode os{2};
    bool act() noexcept {
        _transparentblt(canvas, 0, 0, 0, 0, other, 0, 0, 12, 12, 0xFFFFFF);
        return GetPixel(canvas, 5, 5) == 0x665544;
    }
};

struct Rotation : Drawing {
    CDC dc;
    Rotation() { dc.CreateCompatibleDC(nullptr), canvas.deselect(); }
    ~Rotation() { canvas.select(); }
    Rotation(const Rotation&) = delete;
    Rotation& operator=(const Rotation&) = delete;
    bool act() noexcept { return RotateBitmap(&dc, &canvas.bitmap(), 45.0F); }
};

struct RegionOfBitmap : Drawing {
    CRgn region;
    RegionOfBitmap() { SetPixel(canvas, 3, 4, 0), before = canvas.picture(); }
    bool act() { return RegionFromBitmap(region, canvas.bitmap(), 0); }
    bool holds(bool done) const {
        return done ? drawing::holds(region, before) : region.m_hObject == nullptr;
    }
};

struct Rows : Drawing {
    BITMAPINFOHEADER header;
    bool act() { return std::unique_ptr<unsigned char[]>(GetDIBits(canvas.bitmap(), header)) != nullptr; }
    bool holds(bool done) const { return !done || header.biHeight == -20; }
};

}  // namespace

void check_graphics() {
    run<Objects>("CreateSolidBrush, CreateBitmap, CreateRectRgn, CreateCompatibleDC", Handles::FAIL);
    run<Combination>("CombineRgn");
    run<TransparentCopyOntoItself>("TransparentBlt within a surface", Handles::FAIL);
    run<ScaledCopyOntoItself>("BitBlt within a surface", Handles::FAIL);
    run<MaskCopy>("_transparentblt by masks", Handles::FAIL);
    run<Rotation>("mfc::RotateBitmap", Handles::FAIL);
    run<RegionOfBitmap>("mfc::RegionFromBitmap", Handles::FAIL);
    run<Rows>("mfc::GetDIBits", Handles::FAIL);
    check("mfc::DumpBitmap", [](Trial& t) {
        Canvas canvas(Picture(200, 100, 24));
        const auto size = [&] {
            const auto path = t.folder() / "picture.bmp";
            return std::filesystem::exists(path) ? static_cast<long>(std::filesystem::file_size(path)) : -1;
        };
        const CString name = t.path("picture.bmp");
        t.attempt([&] { DumpBitmap(canvas.bitmap(), name); });
        t.expect(size() == 54 + 60000 || (t.struck() && (size() == -1 || !t.fails_memory())),
                 "whole or missing, unless the system refuses to delete it");
        DumpBitmap(canvas.bitmap(), name);
        t.expect(size() == 54 + 60000, "whole afterwards");
    });
}

}  // namespace basalt::faults
