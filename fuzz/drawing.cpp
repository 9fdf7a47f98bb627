// Drawing: sequences of calls on a few objects, good and bad handles, and coordinates of every size. Whatever
// the calls answer, nothing outside a surface may be touched, everything can be deleted afterwards, and what
// two calls say about the same pixel agrees.
#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <vector>

#include "basalt/platform.h"
#include "fuzz/input.h"
#include "src/platform/region_rectangles.h"

namespace {

using basalt::fuzz::Input;
using basalt::fuzz::require;

constexpr int SLOTS = 4;
constexpr int DEPTHS[] = {1, 4, 8, 16, 24, 32};

struct World {
    HDC contexts[SLOTS] = {};
    HGDIOBJ objects[SLOTS * 2] = {};
    Input& input;

    explicit World(Input& its_input) : input(its_input) {}
    World(const World&) = delete;
    World& operator=(const World&) = delete;
    ~World() {
        for (HDC const dc : contexts) {
            require(DeleteDC(dc) != 0 || ReleaseDC(nullptr, dc) != 0 || dc == nullptr);
        }
        for (HGDIOBJ const object : objects) {
            require(DeleteObject(object) != 0 || object == nullptr);
            require(DeleteObject(object) == 0);
        }
    }

    HDC& context() { return contexts[input.byte() % SLOTS]; }
    HGDIOBJ& object() { return objects[input.byte() % (SLOTS * 2)]; }
    HRGN region() { return static_cast<HRGN>(object()); }
    RECT rectangle() {
        return {input.coordinate(), input.coordinate(), input.coordinate(), input.coordinate()};
    }

    void make_context() {
        HDC& dc = context();
        if (DeleteDC(dc) != 0 || ReleaseDC(nullptr, dc) != 0 || dc == nullptr) {
            dc = input.byte() % 8 == 0 ? GetDC(nullptr) : CreateCompatibleDC(nullptr);
            require(dc != nullptr);
        }
    }

    void make_object() {
        HGDIOBJ& place = object();
        if (place != nullptr && DeleteObject(place) == 0) {
            return;  // it is selected
        }
        place = new_object();
    }

    HGDIOBJ new_object() {
        switch (input.byte() % 6) {
            case 0:
                return CreateSolidBrush(input.word());
            case 1:
                return CreatePen(input.byte() % 8, input.coordinate(), input.word());
            case 2:
                return CreateRectRgn(input.coordinate(), input.coordinate(), input.coordinate(),
                                     input.coordinate());
            case 3:
                return new_bitmap();
            case 4:
                return CreateCompatibleBitmap(context(), input.byte(), input.byte());
            default: {
                std::vector<RECT> rectangles(input.byte() % 16);
                for (RECT& r : rectangles) {
                    r = rectangle();
                }
                return basalt::platform::create_region(rectangles);
            }
        }
    }

    HGDIOBJ new_bitmap() {
        const int width = input.byte() % 64;
        const int height = input.byte() % 32;
        const int depth = DEPTHS[input.byte() % 6];
        // Exactly what the call may read.
        std::vector<std::uint8_t> bits(static_cast<std::size_t>((width * depth + 15) / 16 * 2 * height));
        for (std::uint8_t& byte : bits) {
            byte = input.byte();
        }
        return CreateBitmap(width, height, 1, static_cast<UINT>(depth), bits.empty() ? nullptr : bits.data());
    }

    void set_pixel() {
        HDC const dc = context();
        const int x = input.coordinate();
        const int y = input.coordinate();
        const COLORREF before = GetPixel(dc, x, y);
        const COLORREF stored = SetPixel(dc, x, y, input.word());
        require((before == CLR_INVALID) == (stored == CLR_INVALID));
        require(GetPixel(dc, x, y) == stored);
    }

    void read_rows() {
        HGDIOBJ const bitmap = object();
        struct {
            BITMAPINFOHEADER header;
            RGBQUAD table[256];
        } dib = {};
        BITMAP record = {};
        if (GetObjectW(bitmap, sizeof record, &record) == 0) {
            return;
        }
        const int depth = DEPTHS[input.byte() % 6];
        dib.header.biSize = 40;
        dib.header.biWidth = record.bmWidth;
        dib.header.biHeight = input.byte() % 2 == 0 ? record.bmHeight : -record.bmHeight;
        dib.header.biPlanes = 1;
        dib.header.biBitCount = static_cast<WORD>(depth);
        const UINT first = input.byte() % 64;
        const UINT count = input.byte();
        const auto height = static_cast<UINT>(record.bmHeight);
        const UINT rows = first < height ? std::min(count, height - first) : 0;
        const auto row_bytes = static_cast<std::size_t>((record.bmWidth * depth + 31) / 32 * 4);
        std::vector<std::uint8_t> bits(std::max<std::size_t>(rows * row_bytes, 1));
        require(GetDIBits(context(), static_cast<HBITMAP>(bitmap), first, count, bits.data(),
                          reinterpret_cast<BITMAPINFO*>(&dib), DIB_RGB_COLORS) <= static_cast<int>(rows));
    }

    void transform() {
        HDC const dc = context();
        SetGraphicsMode(dc, GM_ADVANCED);
        const XFORM t = {input.factor(), input.factor(),      input.factor(),
                         input.factor(), input.factor() * 16, input.factor() * 16};
        ModifyWorldTransform(dc, &t, input.byte() % 4);
        POINT point = {input.coordinate(), input.coordinate()};
        DPtoLP(dc, &point, 1);
    }

    void combine() {
        HRGN const a = region();
        HRGN const b = region();
        HRGN const result = region();
        const int x = input.coordinate();
        const int y = input.coordinate();
        const bool in_either = PtInRegion(a, x, y) != 0 || PtInRegion(b, x, y) != 0;
        const int mode = input.byte() % 7;
        if (CombineRgn(result, a, b, mode) != RGN_ERROR && mode == RGN_OR) {
            require(in_either == (PtInRegion(result, x, y) != 0));
            RECT box = {};
            require(GetRgnBox(result, &box) != RGN_ERROR && EqualRgn(result, result) == 1);
        }
    }

    void gradient() {
        TRIVERTEX corners[3] = {};
        for (TRIVERTEX& corner : corners) {
            corner = {input.coordinate(),
                      input.coordinate(),
                      static_cast<WORD>(input.byte() << 8),
                      static_cast<WORD>(input.word()),
                      static_cast<WORD>(input.word()),
                      0};
        }
        const GRADIENT_RECT mesh[2] = {{input.byte() % 4U, input.byte() % 4U}, {input.byte() % 4U, 0}};
        GradientFill(context(), corners, 3, mesh, 1 + input.byte() % 2U, input.byte() % 3U);
    }

    void step() {
        Input& in = input;
        switch (in.byte() % 16) {
            case 0:
                make_context();
                break;
            case 1:
            case 2:
                make_object();
                break;
            case 3:
            case 4: {
                HGDIOBJ const stock = GetStockObject(in.byte() % 12);
                SelectObject(context(), in.byte() % 4 == 0 ? stock : object());
                break;
            }
            case 5:
                set_pixel();
                break;
            case 6: {
                const RECT r = rectangle();
                FillRect(context(), &r, static_cast<HBRUSH>(object()));
                break;
            }
            case 7: {
                const RECT r = rectangle();
                RoundRect(context(), r.left, r.top, r.right, r.bottom, in.coordinate(), in.coordinate());
                break;
            }
            case 8:
                gradient();
                break;
            case 9:
            case 10: {
                const RECT r = rectangle();
                BitBlt(context(), r.left, r.top, r.right, r.bottom, context(), in.coordinate(),
                       in.coordinate(), static_cast<DWORD>(in.byte()) << 16);
                break;
            }
            case 11: {
                const RECT r = rectangle();
                const RECT s = rectangle();
                TransparentBlt(context(), r.left, r.top, r.right, r.bottom, context(), s.left, s.top, s.right,
                               s.bottom, in.word());
                break;
            }
            case 12:
                read_rows();
                break;
            case 13:
                transform();
                break;
            case 14:
                combine();
                break;
            default: {
                HDC const dc = context();
                SetBkColor(dc, in.word());
                SetTextColor(dc, in.word());
                if (in.byte() % 2 == 0) {
                    ModifyWorldTransform(dc, nullptr, MWT_IDENTITY);
                }
                break;
            }
        }
    }
};

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    Input input(data, size);
    World world(input);
    for (int steps = 0; !input.is_over() && steps < 200; ++steps) {
        world.step();
    }
    return 0;
}
