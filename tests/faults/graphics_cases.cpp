// Drawing objects and everything that draws.
#include <fstream>
#include <memory>
#include <vector>

#include "basalt/frame.h"
#include "basalt/graphics.h"
#include "basalt/platform.h"
#include "tests/faults/trial.h"

namespace basalt::faults {

namespace {

// A context with a bitmap of 32 bits in it.
struct Surface {
    CBitmap bitmap;
    CDC dc;

    Surface() : Surface(32) {}
    explicit Surface(UINT depth) {
        bitmap.CreateBitmap(30, 20, 1, depth, nullptr);
        dc.CreateCompatibleDC(nullptr);
        m_before = SelectObject(dc, bitmap);
    }
    ~Surface() { SelectObject(dc, m_before); }
    Surface(const Surface&) = delete;
    Surface& operator=(const Surface&) = delete;

private:
    HGDIOBJ m_before = nullptr;
};

template <class Create>
void check_object(const char* operation, Create create) {
    check(operation, [create](Trial& t) {
        const HGDIOBJ object = t.attempt(create);
        t.expect(object != nullptr || t.struck(), "null only for a failure");
        t.expect(object == nullptr || DeleteObject(object) != 0, "deleted");
        t.expect(DeleteObject(create()) != 0, "made afterwards");
    });
}

void check_objects() {
    check_object("CreateSolidBrush", [] { return CreateSolidBrush(0x102030); });
    check_object("CreateBitmap", [] { return CreateBitmap(100, 100, 1, 24, nullptr); });
    check_object("CreateRectRgn", [] { return CreateRectRgn(1, 2, 3, 4); });
    check("CreateCompatibleDC, CreateCompatibleBitmap", [](Trial& t) {
        const HDC dc = t.attempt([] { return CreateCompatibleDC(nullptr); });
        t.expect(dc != nullptr || t.struck(), "null only for a failure");
        const HBITMAP bitmap = t.attempt([=] { return CreateCompatibleBitmap(dc, 10, 10); });
        t.expect(bitmap != nullptr || t.was_ever_struck(), "null only for a failure");
        DeleteObject(bitmap);
        DeleteDC(dc);
    });
    check("CombineRgn", [](Trial& t) {
        const HRGN a = CreateRectRgn(0, 0, 10, 10);
        const HRGN b = CreateRectRgn(5, 5, 15, 15);
        const HRGN both = CreateRectRgn(0, 0, 0, 0);
        const int kind = t.attempt([=] { return CombineRgn(both, a, b, RGN_XOR); });
        t.expect(kind != RGN_ERROR || t.struck(), "an error only for a failure");
        t.expect(CombineRgn(both, a, b, RGN_XOR) != RGN_ERROR && PtInRegion(both, 7, 7) == 0, "afterwards");
        for (const HRGN region : {a, b, both}) {
            t.expect(DeleteObject(region) != 0, "deleted");
        }
    });
}

void check_drawing() {
    check("FillRect, RoundRect, GradientFill, BitBlt, TransparentBlt", [](Trial& t) {
        const Surface from;
        const Surface to;
        const RECT all = {0, 0, 30, 20};
        const TRIVERTEX corners[] = {{0, 0, 0xFF00, 0, 0, 0}, {30, 20, 0, 0xFF00, 0, 0}};
        const GRADIENT_RECT mesh = {0, 1};
        const auto draw = [&] {
            return FillRect(from.dc, &all, static_cast<HBRUSH>(GetStockObject(WHITE_BRUSH))) != 0 &&
                   RoundRect(from.dc, 2, 2, 28, 18, 9, 7) != 0 &&
                   GradientFill(from.dc, corners, 2, &mesh, 1, GRADIENT_FILL_RECT_H) != 0 &&
                   BitBlt(to.dc, 0, 0, 30, 20, from.dc, 0, 0, SRCCOPY) != 0 &&
                   TransparentBlt(to.dc, 1, 1, 40, 40, from.dc, 0, 0, 30, 20, 0xFFFFFF) != 0;
        };
        t.expect(t.attempt(draw) || t.struck(), "0 only for a failure");
        t.expect(draw(), "drawn afterwards");
    });
    check("BitBlt and TransparentBlt within a surface", [](Trial& t) {
        const Surface surface;
        const XFORM twice = {2, 0, 0, 2, 0, 0};
        SetGraphicsMode(surface.dc, GM_ADVANCED);
        const auto draw = [&] {
            SetPixel(surface.dc, 0, 0, 0xFF);
            return TransparentBlt(surface.dc, 1, 1, 20, 10, surface.dc, 0, 0, 10, 5, 0xFFFFFF) != 0 &&
                   SetWorldTransform(surface.dc, &twice) != 0 &&
                   BitBlt(surface.dc, 5, 5, 5, 5, surface.dc, 0, 0, SRCCOPY) != 0;
        };
        t.expect(t.attempt(draw) || t.struck(), "0 only for a failure");
        ModifyWorldTransform(surface.dc, nullptr, MWT_IDENTITY);
        const bool drawn = draw();
        ModifyWorldTransform(surface.dc, nullptr, MWT_IDENTITY);
        t.expect(drawn && GetPixel(surface.dc, 10, 10) == 0xFF, "drawn afterwards");
    });
    check("_gradientfill, _transparentblt", [](Trial& t) {
        _operatingsystem();
        const Surface from;
        const Surface to;
        const auto draw = [&] {
            _gradientfill(from.dc, 0, 0, 30, 20, 8, 0x0000FF, 0x80FF80, 2.0F, 0);
            return _transparentblt(to.dc, 0, 0, 30, 20, from.dc, 0, 0, 30, 20, 0x0000FF) != 0;
        };
        t.expect(t.attempt(draw) || t.struck(), "0 only for a failure");
        t.expect(draw() && GetPixel(to.dc, 15, 10) != 0, "drawn afterwards");
    });
}

void check_bitmaps() {
    check("mfc::DumpBitmap", [](Trial& t) {
        CBitmap bitmap;
        bitmap.CreateBitmap(200, 100, 1, 24, nullptr);
        const CString name = t.path("picture.bmp");
        t.throws([&] { vex_util::mfc::DumpBitmap(bitmap, name); });
        constexpr std::uintmax_t SIZE = 54 + 200 * 3 * 100;
        const bool there = t.folder().names().contains("picture.bmp");
        t.expect(there || t.struck(), "missing only for a failure");
        const std::uintmax_t size = there ? std::filesystem::file_size(t.folder() / "picture.bmp") : SIZE;
        t.expect(size == SIZE || (t.struck() && !t.fails_memory()),
                 "whole, unless the system refuses to delete it");
        vex_util::mfc::DumpBitmap(bitmap, name);
        t.expect(std::filesystem::file_size(t.folder() / "picture.bmp") == SIZE, "whole afterwards");
    });
    check("mfc::GetDIBits", [](Trial& t) {
        CBitmap bitmap;
        bitmap.CreateBitmap(64, 64, 1, 8, nullptr);
        BITMAPINFOHEADER header = {};
        std::unique_ptr<unsigned char[]> rows;
        const bool threw = t.throws([&] { rows.reset(vex_util::mfc::GetDIBits(bitmap, header)); });
        t.expect(threw || rows != nullptr || t.struck(), "null only for a failure");
        rows.reset(vex_util::mfc::GetDIBits(bitmap, header));
        t.expect(rows != nullptr && header.biHeight == -64, "read afterwards");
    });
    check("mfc::RotateBitmap", [](Trial& t) {
        CBitmap bitmap;
        bitmap.CreateBitmap(64, 64, 1, 32, std::vector<int>(64 * 64, 0x00FF00).data());
        CDC dc;
        dc.CreateCompatibleDC(nullptr);
        const bool turned = t.attempt([&] { return vex_util::mfc::RotateBitmap(&dc, &bitmap, 45.0F); });
        t.expect(turned || t.struck(), "false only for a failure");
        const HDC check = CreateCompatibleDC(nullptr);
        const HGDIOBJ before = SelectObject(check, bitmap);
        t.expect(before != nullptr && GetPixel(check, 32, 32) == 0x00FF00,
                 "its middle stays, and it is free");
        t.expect((GetPixel(check, 0, 0) == 0x00FF00) == !turned, "turned, or as it was");
        SelectObject(check, before);
        DeleteDC(check);
        t.expect(vex_util::mfc::RotateBitmap(&dc, &bitmap, 45.0F), "turned afterwards");
    });
    check("mfc::RegionFromBitmap", [](Trial& t) {
        std::vector<int> pixels(64 * 64);
        for (std::size_t i = 0; i < pixels.size(); i += 3) {
            pixels[i] = 0xFFFFFF;
        }
        CBitmap bitmap;
        bitmap.CreateBitmap(64, 64, 1, 32, pixels.data());
        CRgn region;
        bool made = false;
        const bool threw = t.throws([&] { made = vex_util::mfc::RegionFromBitmap(region, bitmap, 0); });
        t.expect(made || threw || t.struck(), "false only for a failure");
        t.expect(made == (region.GetSafeHandle() != nullptr), "a region with true alone");
        t.expect(made || vex_util::mfc::RegionFromBitmap(region, bitmap, 0), "made afterwards");
        t.expect(PtInRegion(static_cast<HRGN>(region.GetSafeHandle()), 3, 0) != 0, "the pixels");
    });
}

}  // namespace

void check_graphics() {
    check_objects();
    check_drawing();
    check_bitmaps();
}

}  // namespace basalt::faults
