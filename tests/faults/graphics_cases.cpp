// Drawing objects and everything that draws: each call does all of its work or nothing.
#include <memory>
#include <tuple>
#include <utility>

#include "basalt/graphics.h"
#include "tests/faults/trial.h"
#include "tests/graphics/stored_os_code.h"
#include "tests/support/drawing.h"

namespace basalt::faults {

namespace {

using namespace drawing;
using namespace vex_util::mfc;

struct World {
    StoredOsCode os{2};  // copies by masks
    Canvas canvas{Picture(30, 20, 32, 0x112233)}, other{Picture(30, 20, 32, 0x445566)};
    CRgn square, combined, empty;
    CDC dc;

    World() {
        SetPixel(canvas, 3, 4, 0);
        square.CreateRectRgn(0, 0, 10, 10), combined.CreateRectRgn(5, 5, 15, 15),
            dc.CreateCompatibleDC(nullptr);
    }
    auto state() const {
        Bytes bytes(200);
        const auto size = GetRegionData(combined, 200, reinterpret_cast<RGNDATA*>(bytes.data()));
        return std::tuple(canvas.picture(), size, bytes,
                          empty.m_hObject != nullptr && holds(empty, canvas.picture()));
    }

    bool create() noexcept {
        CBrush brush(0x102030);
        CBitmap bitmap, compatible;
        CRgn region;
        CDC another;
        return brush.m_hObject != nullptr && bitmap.CreateBitmap(100, 100, 1, 24, nullptr) != 0 &&
               region.CreateRectRgn(1, 2, 3, 4) != 0 && another.CreateCompatibleDC(nullptr) != 0 &&
               compatible.CreateCompatibleBitmap(&another, 10, 10) != 0;
    }
    bool combine() noexcept { return combined.CombineRgn(&square, &combined, RGN_XOR) != RGN_ERROR; }
    bool keyed_copy() noexcept {
        return TransparentBlt(canvas, 1, 1, 20, 10, canvas, 0, 0, 10, 5, 0xFFFFFF) != 0;
    }
    bool scaled_copy() noexcept {
        const XFORM twice = {2, 0, 0, 2, 0, 0};
        SetGraphicsMode(canvas, GM_ADVANCED);
        return SetWorldTransform(canvas, &twice) != 0 &&
               BitBlt(canvas, 5, 5, 5, 5, canvas, 0, 0, SRCCOPY) != 0;
    }
    bool mask_copy() noexcept {
        _transparentblt(canvas, 0, 0, 0, 0, other, 0, 0, 12, 12, 0xFFFFFF);
        return GetPixel(canvas, 5, 5) == 0x665544;
    }
    bool rotate() noexcept {
        canvas.deselect();
        const bool is_rotated = RotateBitmap(&dc, &canvas.bitmap(), 45.0F);
        return canvas.select(), is_rotated;
    }
    bool find_region() { return RegionFromBitmap(empty, canvas.bitmap(), 0); }
    bool read_rows() {
        BITMAPINFOHEADER header;
        const std::unique_ptr<unsigned char[]> pixels(GetDIBits(canvas.bitmap(), header));
        return pixels != nullptr && header.biHeight == -20;
    }
};

}  // namespace

void check_graphics() {
    constexpr std::pair<const char*, bool (World::*)()> ROWS[] = {
        {"objects' creation", &World::create},
        {"CombineRgn", &World::combine},
        {"TransparentBlt within a surface", &World::keyed_copy},
        {"BitBlt within a surface", &World::scaled_copy},
        {"_transparentblt by masks", &World::mask_copy},
        {"mfc::RotateBitmap", &World::rotate},
        {"mfc::RegionFromBitmap", &World::find_region},
        {"mfc::GetDIBits", &World::read_rows}};
    for (const auto& [operation, act] : ROWS) {
        check(operation, [act = act](Trial& t) {
            World world, finished;
            const auto before = world.state();
            const bool done = t.succeeds([&] { return (world.*act)(); });
            t.expect((finished.*act)() && (done || t.struck()), "fails only for a reason");
            t.expect(world.state() == (done ? finished.state() : before), "done as a whole or not at all");
            t.expect(done || ((world.*act)() && world.state() == finished.state()), "done afterwards");
        });
    }
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
