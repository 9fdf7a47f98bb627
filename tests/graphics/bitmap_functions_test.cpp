// fuzz/graphics compares rows, files, regions and rotations with the picture model.
#include "basalt/graphics/bitmap_functions.h"

#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cmath>
#include <filesystem>
#include <fstream>
#include <memory>
#include <random>

#include "tests/support/drawing.h"
#include "tests/support/scratch_folder.h"

namespace {

using namespace drawing;
using namespace vex_util::mfc;
namespace fs = std::filesystem;

TEST(BitmapPixels, are_of_bitmaps_alone) {
    CBitmap none;
    for (HGDIOBJ const object : {HGDIOBJ(nullptr), HGDIOBJ(CreateSolidBrush(0))}) {
        BITMAPINFOHEADER header;
        none.Attach(object);
        EXPECT_EQ(GetDIBits(none, header), nullptr);
        EXPECT_TRUE(header.biSize == 40 && header.biWidth == 0);
    }
}

TEST(DumpBitmap, replaces_a_file_or_leaves_none) {
    const basalt::test::ScratchFolder folder;
    const auto file = [&](const char* name) { return folder / name; };
    // The size of the file afterwards, -1 when there is none.
    const auto dump = [&](HGDIOBJ bitmap, const char* name) {
        DumpBitmap(static_cast<HBITMAP>(bitmap), CString(file(name).c_str()));
        return fs::exists(file(name)) ? static_cast<long>(fs::file_size(file(name))) : -1;
    };
    CBitmap bitmap, small;
    bitmap.CreateBitmap(100, 100, 1, 32, nullptr);
    small.CreateBitmap(2, 1, 1, 4, nullptr);
    EXPECT_EQ(dump(bitmap, "\xC3\xAE.png"), 54 + 40000);
    EXPECT_EQ(dump(small, "\xC3\xAE.png"), 54 + 64 + 4) << "in place of a longer file";
    EXPECT_EQ(dump(nullptr, "a.bmp") & dump(CBrush(0).m_hObject, "a.bmp") & dump(bitmap, "none/a.bmp"), -1);
    ASSERT_EQ(mkfifo(file("pipe").c_str(), 0600), 0);
    alarm(20);
    DumpBitmap(bitmap, CString(file("pipe").c_str()));  // no process reads it
    alarm(0);
    EXPECT_TRUE(fs::is_fifo(file("pipe"))) << "not deleted";

    std::ofstream(file("target.bmp")) << "what was there before";
    fs::create_hard_link(file("target.bmp"), file("other name.bmp"));
    fs::create_symlink("target.bmp", file("link.bmp"));
    rlimit limit = {};
    ASSERT_EQ(getrlimit(RLIMIT_FSIZE, &limit), 0);
    const rlimit low = {1000, limit.rlim_max};
    setrlimit(RLIMIT_FSIZE, &low);
    EXPECT_EQ(dump(bitmap, "link.bmp"), -1);
    setrlimit(RLIMIT_FSIZE, &limit);
    EXPECT_TRUE(fs::is_symlink(file("link.bmp")) && !fs::exists(file("target.bmp")) &&
                fs::is_empty(file("other name.bmp")))
        << "no part of a picture by any name";
    EXPECT_TRUE(dump(bitmap, "link.bmp") == 54 + 40000 && fs::exists(file("target.bmp")));
}

TEST(RegionFromBitmap, compares_whole_values_and_needs_an_empty_region) {
    const struct {
        int depth;
        std::vector<std::uint32_t> values;
        unsigned long key;
    } facts[] = {{32, {0x00804020, 0x01804020, 0xFF804020, 0x00804021}, 0xAA204080},
                 {16, {0x4104, 0xC104, 0x4105, 0}, RGB(0x87, 0x40, 0x1F)},  // rounded to five bits
                 {24, {0x804020, 0x804021, 0, 0xFFFFFF}, 0x204080}};
    for (const auto& fact : facts) {
        Picture picture(4, 1, fact.depth);
        picture.pixels = fact.values;
        Canvas canvas(picture);
        CRgn region, empty;
        CBitmap none;
        EXPECT_FALSE(RegionFromBitmap(region, canvas.bitmap(), fact.key | 0x100000000));
        ASSERT_TRUE(RegionFromBitmap(region, canvas.bitmap(), fact.key));
        EXPECT_TRUE(holds(region, picture, fact.values[0])) << fact.depth << " bits";
        EXPECT_FALSE(RegionFromBitmap(region, canvas.bitmap(), 0)) << "one is held already";
        EXPECT_TRUE(!RegionFromBitmap(empty, none, 0) && empty.m_hObject == nullptr);
    }
}

// A row took four bytes a pixel: 4 GiB for one of 10^9.
TEST(RegionFromBitmap, reads_long_rows_in_pieces) {
    constexpr int WIDTH = 100000000;
    CBitmap bitmap;
    ASSERT_TRUE(bitmap.CreateBitmap(WIDTH, 1, 1, 1, nullptr));
    rusage before = {}, after = {};
    getrusage(RUSAGE_SELF, &before);
    CRgn region, pieces;
    EXPECT_TRUE(RegionFromBitmap(region, bitmap, 0xFFFFFF));
    getrusage(RUSAGE_SELF, &after);
    EXPECT_LT(after.ru_maxrss - before.ru_maxrss, 100000) << "KiB";
    CRect box;
    EXPECT_TRUE(region.GetRgnBox(box) == SIMPLEREGION && box == CRect(0, 0, WIDTH, 1));
    std::mt19937 random(102);
    const Picture wide = random_picture(20000, 3, 1, random);
    Canvas canvas(wide);
    EXPECT_TRUE(RegionFromBitmap(pieces, canvas.bitmap(), 0) && holds(pieces, wide));
}

TEST(RotateBitmap, turns_by_quarters_exactly_and_else_changes_nothing) {
    Picture picture(6, 4, 32), expected(6, 4, 32, 0x808000);
    picture.at(1, 1) = 0x123456;
    Canvas canvas(picture);
    CDC dc;
    CBitmap none;
    dc.CreateCompatibleDC(nullptr);
    EXPECT_FALSE(RotateBitmap(&dc, &canvas.bitmap(), 90)) << "selected elsewhere";
    canvas.deselect();
    EXPECT_TRUE(refused(RotateBitmap(&dc, &canvas.bitmap(), -0.0F), RotateBitmap(&dc, &canvas.bitmap(), NAN),
                        RotateBitmap(nullptr, &canvas.bitmap(), 90), RotateBitmap(&dc, nullptr, 90),
                        RotateBitmap(&dc, &none, 90)));
    EXPECT_EQ(canvas.picture(), picture);
    for (const float angle : {90.0F, -180.0F, 450.0F, 3600.0F}) {
        EXPECT_TRUE(RotateBitmap(&dc, &canvas.bitmap(), angle));
    }
    // The sum is a whole turn; the corners are lost.
    on(expected, {1, 0, 5, 4}, [](int, int, std::uint32_t& value) { value = 0; });
    expected.at(1, 1) = 0x123456;
    EXPECT_EQ(canvas.picture(), expected);
    canvas.select();
}

}  // namespace
