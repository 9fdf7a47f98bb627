// Bitmaps of any size, depth and contents: written to a file, read as rows, turned, as a region, and drawn on
// with any numbers. What several calls say about the same pixels agrees.
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cmath>
#include <cstdint>
#include <cstring>
#include <memory>
#include <string>
#include <vector>

#include "basalt/frame.h"
#include "basalt/graphics.h"
#include "basalt/platform.h"
#include "fuzz/input.h"

namespace {

using basalt::fuzz::Input;
using basalt::fuzz::require;

constexpr unsigned DEPTHS[] = {1, 4, 8, 16, 24, 32};

struct Picture {
    int width;
    int height;
    unsigned depth;
    CBitmap bitmap;

    explicit Picture(Input& input)
        : width(1 + input.byte() % 70), height(1 + input.byte() % 40), depth(DEPTHS[input.byte() % 6]) {
        const auto row = (static_cast<std::size_t>(width) * depth + 15) / 16 * 2;
        std::vector<std::uint8_t> bits(row * static_cast<std::size_t>(height));  // exactly what may be read
        // Few values, so that colours meet; some of any kind.
        const std::uint8_t values[] = {0, 0xFF, input.byte(), input.byte()};
        for (std::uint8_t& byte : bits) {
            const std::uint8_t next = input.byte();
            byte = next < 250 ? values[next % 4] : next;
        }
        require(bitmap.CreateBitmap(width, height, 1, depth, bits.data()) != 0);
    }
    std::size_t dib_row() const { return (static_cast<std::size_t>(width) * depth + 31) / 32 * 4; }
};

// The file has the rows that reading the bitmap gives, bottom row first, but for bits that mean nothing.
void check_file(Picture& picture) {
    static const int file = memfd_create("picture", MFD_CLOEXEC);
    static const std::string path = "/proc/self/fd/" + std::to_string(file);
    vex_util::mfc::DumpBitmap(picture.bitmap, CString(path.c_str()));
    const std::size_t table = picture.depth <= 8 ? std::size_t{4} << picture.depth : 0;
    const std::size_t size = 54 + table + picture.dib_row() * static_cast<std::size_t>(picture.height);
    struct stat status = {};
    require(fstat(file, &status) == 0 && static_cast<std::size_t>(status.st_size) == size);
    std::vector<std::uint8_t> bytes(size);
    require(pread(file, bytes.data(), size, 0) == static_cast<ssize_t>(size) && bytes[0] == 'B');

    BITMAPINFOHEADER header = {};
    const std::unique_ptr<unsigned char[]> rows(vex_util::mfc::GetDIBits(picture.bitmap, header));
    require(rows != nullptr && header.biWidth == picture.width && header.biHeight == -picture.height &&
            header.biBitCount == picture.depth);
    if (picture.depth == 8 || picture.depth == 24) {
        const std::size_t row = picture.dib_row();
        for (std::size_t y = 0; y < static_cast<std::size_t>(picture.height); ++y) {
            const std::uint8_t* const stored = bytes.data() + size - (y + 1) * row;
            require(std::memcmp(stored, rows.get() + y * row,
                                static_cast<std::size_t>(picture.width) * picture.depth / 8) == 0);
        }
    }
}

void check_region(Picture& picture, Input& input) {
    CDC dc;
    require(dc.CreateCompatibleDC(nullptr) != 0);
    const int x = input.byte() % picture.width;
    const int y = input.byte() % picture.height;
    HGDIOBJ const before = SelectObject(dc, picture.bitmap);
    const COLORREF colour = GetPixel(dc, x, y);
    SelectObject(dc, before);
    CRgn region;
    require(vex_util::mfc::RegionFromBitmap(region, picture.bitmap, colour));
    // A pixel whose unused bits are set is of no colour; elsewhere it is not in the region of its own.
    if (picture.depth != 16 && picture.depth != 32) {
        require(PtInRegion(static_cast<HRGN>(region.GetSafeHandle()), x, y) == 0);
    }
    CRgn other;
    static_cast<void>(vex_util::mfc::RegionFromBitmap(other, picture.bitmap, input.word()));
    RECT box = {};
    GetRgnBox(static_cast<HRGN>(region.GetSafeHandle()), &box);
    require(box.left >= 0 && box.top >= 0 && box.right <= picture.width && box.bottom <= picture.height);
}

void check_turn(Picture& picture, Input& input) {
    CDC dc;
    require(dc.CreateCompatibleDC(nullptr) != 0);
    const float angle = input.factor() * 90;
    const bool turned = vex_util::mfc::RotateBitmap(&dc, &picture.bitmap, angle);
    require(turned == (std::isfinite(angle) && angle != 0));
    BITMAP record = {};
    require(GetObjectW(picture.bitmap, sizeof record, &record) != 0);
    require(record.bmWidth == picture.width && record.bmHeight == picture.height);
}

void draw(Picture& to, Picture& from, Input& input) {
    CDC target;
    CDC source;
    require(target.CreateCompatibleDC(nullptr) != 0 && source.CreateCompatibleDC(nullptr) != 0);
    HGDIOBJ const target_before = SelectObject(target, to.bitmap);
    HGDIOBJ const source_before = SelectObject(source, from.bitmap);
    for (int i = 0; i < 6 && !input.is_over(); ++i) {
        const int left = input.coordinate(), top = input.coordinate();
        const int right = input.coordinate(), bottom = input.coordinate();
        if (input.byte() % 2 == 0) {
            _gradientfill(target, left, top, right, bottom, input.coordinate(), input.word(), input.word(),
                          input.factor(), input.byte() % 3);
        } else {
            _transparentblt(target, left, top, right, bottom, source, input.coordinate(), input.coordinate(),
                            input.coordinate(), input.coordinate(), input.word());
        }
    }
    SelectObject(source, source_before);
    SelectObject(target, target_before);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    _operatingsystem();
    Input input(data, size);
    Picture picture(input);
    Picture other(input);
    draw(picture, other, input);
    check_region(picture, input);
    check_file(picture);
    check_turn(picture, input);
    ColorPalette palette;
    const std::uint32_t colour = input.word();
    const std::uint32_t known = palette[input.byte()];
    require(palette[palette.FindClosestColor(known)] == known);
    static_cast<void>(palette.FindClosestColor(colour) + _complementarycolor(colour));
    return 0;
}
