// Bitmaps of any size, depth and contents against the picture model: as a file, as a region, rotated, and
// drawn on by the family's functions.
#include <sys/mman.h>
#include <unistd.h>

#include <cmath>
#include <cstdint>
#include <memory>
#include <string>

#include "basalt/graphics.h"
#include "fuzz/input.h"
#include "tests/graphics/stored_os_code.h"
#include "tests/support/drawing.h"

namespace {

using basalt::fuzz::Input;
using basalt::fuzz::require;
using namespace drawing;

// Few values, so that colours meet.
Picture drawn_picture(Input& in) {
    const std::uint32_t values[] = {0, ~0U, in.word(), in.word() & 0xFFFFFF};
    const auto next = [&] { return values[in.byte() % 4]; };
    const int width = 1 + in.byte() % 70, height = 1 + in.byte() % 40;
    return random_picture(width, height, DEPTHS[in.byte() % 6], next);
}

// Memory holds the picture, top row first; the file bottom row first, without the unused byte.
void check_rows(Canvas& canvas, const Picture& picture) {
    static const int file = memfd_create("picture", MFD_CLOEXEC);
    const int width = picture.width, height = picture.height, depth = picture.depth;
    const Bytes rows = packed(picture, 32);
    DibHeader expected(width, -height, depth);
    expected.header.biSizeImage = static_cast<DWORD>(rows.size());  // the platform's addition
    BITMAPINFOHEADER header;
    const std::unique_ptr<unsigned char[]> pixels(vex_util::mfc::GetDIBits(canvas.bitmap(), header));
    require(std::memcmp(&header, &expected.header, sizeof header) == 0);
    require(unpacked(pixels.get(), width, height, depth, 32) == picture);
    vex_util::mfc::DumpBitmap(canvas.bitmap(), CString(("/proc/self/fd/" + std::to_string(file)).c_str()));
    const std::size_t start = 54 + (depth <= 8 ? std::size_t{4} << depth : 0), size = start + rows.size();
    Bytes bytes(size + 1);
    require(pread(file, bytes.data(), size + 1, 0) == static_cast<ssize_t>(size) && bytes[0] == 'B');
    Picture stored = unpacked(&bytes[start], width, height, depth, 32);
    on(stored, {0, 0, width, height}, [&](int x, int y, std::uint32_t value) {
        require(value == (picture.at(x, height - 1 - y) & (depth == 32 ? 0xFFFFFF : ~0U)));
    });
}

void check_region(Canvas& canvas, const Picture& picture, COLORREF key) {
    CRgn region;
    require(vex_util::mfc::RegionFromBitmap(region, canvas.bitmap(), key));
    const int depth = picture.depth == 16 ? 16 : 32;
    require(holds(region, picture.depth == depth ? picture : canvas.picture(32), value_of(depth, key)));
}

void check_rotation(Canvas& canvas, const Picture& picture, float angle) {
    CDC dc;
    dc.CreateCompatibleDC(nullptr);
    const bool is_turned = std::isfinite(angle) && angle != 0;
    require(vex_util::mfc::RotateBitmap(&dc, &canvas.bitmap(), angle) == is_turned);
    if (!is_turned) {
        return require(canvas.picture() == picture);
    }
    Settings turned;
    turned.world = turn_about(static_cast<double>(angle), picture.width / 2, picture.height / 2);
    const Picture ground(picture.width, picture.height, picture.depth, value_of(picture.depth, 0x008080));
    const Picture result = canvas.picture();
    const Stretch all = {0, 0, picture.width, picture.height, 0, 0};
    // In single precision a turn of thousands of degrees is another one.
    require(std::fabs(angle) > 3600 ||
            result == copied(ground, all, picture, SRCCOPY, turned, 0, &result, 1e-3));
}

// Both functions under a system of either kind; the copy by masks is left to the tests.
void check_drawing(Input& in) {
    const int code = in.byte() % 4 == 0 ? 1 : 5;
    const StoredOsCode os(code);
    Picture to = drawn_picture(in);
    const Picture from = drawn_picture(in);
    Canvas canvas(to), source(from);
    const RECT r = {in.coordinate(), in.coordinate(), in.coordinate(), in.coordinate()};
    const int diameter = in.coordinate();
    const COLORREF corner = in.byte() % 4 == 0 ? 0x808080 : in.word(), start = in.word();
    const auto channel = [start](int shift) { return static_cast<WORD>((start >> shift & 0xFF) << 8); };
    const TRIVERTEX a = {r.left, r.top, channel(0), channel(8), channel(16), 0};
    const TRIVERTEX b = {r.right, r.bottom, WORD(a.Red / 2), WORD(a.Green / 2), WORD(a.Blue / 2), 0};
    const bool is_across = in.byte() % 2 == 0;
    HGDIOBJ const brush = SelectObject(canvas, GetStockObject(GRAY_BRUSH));
    _gradientfill(canvas, r.left, r.top, r.right, r.bottom, diameter, corner, start, 2.0F, is_across ? 0 : 1);
    require(SelectObject(canvas, brush) == GetStockObject(GRAY_BRUSH));
    if (code == 5) {
        gradient(to, a, b, is_across);
    }
    const std::uint32_t value = value_of(to.depth, corner);
    if (code == 5 && diameter > 0 && value != value_of(to.depth, 0x808080)) {
        on(to, r, [&](int x, int y, std::uint32_t& pixel) {
            pixel = is_in_rounded(r, diameter, diameter, x, y) ? pixel : value;
        });
    }
    require(canvas.picture() == to);
    const Stretch s = {in.coordinate(), in.coordinate(), in.byte(), in.byte(),
                       in.coordinate(), in.coordinate(), in.byte(), in.byte()};
    require(_transparentblt(canvas, s.x, s.y, s.width, s.height, source, s.source_x, s.source_y,
                            s.source_width, s.source_height, start) == 1);
    const Stretch all = {s.x, s.y, s.width, s.height, 0, 0};
    require(canvas.picture() == (code == 5 ? keyed(to, s, from, start) : copied(to, all, from, SRCAND)));
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    Input in(data, size);
    check_drawing(in);
    const float angle = in.factor() * 90;
    const COLORREF key = in.word();
    const Picture picture = drawn_picture(in);
    Canvas canvas(picture);
    canvas.deselect();
    check_rows(canvas, picture);
    check_region(canvas, picture, key);
    check_region(canvas, picture, colour_of(picture.depth, picture.pixels[0]));
    check_rotation(canvas, picture, angle);
    canvas.select();
    return 0;
}
