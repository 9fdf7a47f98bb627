// Threads that draw on their own objects with one shared brush, read one palette, and write files at the same
// time.
#include <filesystem>

#include "basalt/frame.h"
#include "basalt/graphics.h"
#include "basalt/platform.h"
#include "tests/stress/stress.h"
#include "tests/support/scratch_folder.h"

namespace basalt::stress {

namespace {

constexpr int THREADS = 6;
constexpr int WIDTH = 40, HEIGHT = 30;

void draw_and_write(HBRUSH brush, const ColorPalette& palette, const std::string& path, Random& random) {
    const auto depth = static_cast<UINT>(random() % 2 == 0 ? 24 : 32);
    CBitmap bitmap;
    CDC dc;
    require(bitmap.CreateBitmap(WIDTH, HEIGHT, 1, depth, nullptr) && dc.CreateCompatibleDC(nullptr), "made");
    const HGDIOBJ before = SelectObject(dc, bitmap);
    const RECT all = {0, 0, WIDTH, HEIGHT};
    require(FillRect(dc, &all, brush) != 0 && GetPixel(dc, 3, 3) == 0x0000FF, "filled");
    _gradientfill(dc, 5, 5, 35, 25, 6, 0x00FF00, palette[static_cast<unsigned char>(random())], 2.0F, 1);
    require(palette.FindClosestColor(palette[100]) <= 100, "the first of its colour");
    SelectObject(dc, before);
    CRgn region;
    require(vex_util::mfc::RotateBitmap(&dc, &bitmap, 90.0F), "rotated");
    require(vex_util::mfc::RegionFromBitmap(region, bitmap, 0x0000FF), "a region");
    vex_util::mfc::DumpBitmap(bitmap, CString(path.c_str()));
    require(std::filesystem::file_size(path) == 54 + WIDTH * HEIGHT * depth / 8, "a whole file");
    std::filesystem::remove(path);
}

}  // namespace

long stress_graphics(double seconds) {
    _operatingsystem();
    const test::ScratchFolder folder;
    const HBRUSH brush = CreateSolidBrush(0x0000FF);
    const ColorPalette palette;
    const long rounds = run_threads(THREADS, seconds, [&](int thread, Random& random) {
        draw_and_write(brush, palette, folder / std::to_string(thread) + ".bmp", random);
    });
    require(DeleteObject(brush) != 0, "no context holds the brush");
    return rounds;
}

}  // namespace basalt::stress
