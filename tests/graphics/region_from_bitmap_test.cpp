#include <gtest/gtest.h>

#include <cstdint>
#include <new>
#include <random>
#include <vector>

#include "tests/graphics/test_surface.h"

namespace {

using namespace basalt::test;
using vex_util::mfc::RegionFromBitmap;

constexpr COLORREF TRANSPARENT = 0xC08040;

void expect_region(CBitmap& bitmap, const Picture& picture, COLORREF key) {
    CRgn region;
    ASSERT_TRUE(RegionFromBitmap(region, bitmap, key));
    for (int y = -1; y <= picture.height; ++y) {
        for (int x = -1; x <= picture.width; ++x) {
            ASSERT_EQ(region.PtInRegion(x, y) != 0, picture.has(x, y) && picture.at(x, y) != key)
                << x << ", " << y;
        }
    }
}

TEST(RegionFromBitmap, HoldsThePixelsNotOfTheColour) {
    std::mt19937 random(101);
    SCOPED_TRACE("seed 101");
    const std::vector<std::vector<COLORREF>> mixes = {
        {TRANSPARENT, 0xFFFFFF},
        {TRANSPARENT, TRANSPARENT, TRANSPARENT, TRANSPARENT, TRANSPARENT, TRANSPARENT, 0x102030},
        {0xFFFFFF, 0xC08041, 0x408040, TRANSPARENT}};
    for (int width = 1; width <= 200; width += width < 70 ? 1 : 29) {
        SCOPED_TRACE(width);
        Picture picture = random_picture(random, width, 7, mixes[random() % mixes.size()]);
        for (int x = 0; x < width; ++x) {  // rows that are alike, and rows of one colour
            picture.at(x, 3) = picture.at(x, 2);
            picture.at(x, 5) = width % 2 == 0 ? TRANSPARENT : 0xFFFFFF;
        }
        TestSurface surface(picture);
        expect_region(surface.bitmap(), picture, TRANSPARENT);
    }
}

TEST(RegionFromBitmap, ReadsLargeBitmapsInPieces) {
    std::mt19937 random(102);
    SCOPED_TRACE("seed 102");
    for (const auto& [width, height] : {std::pair(3, 9000), std::pair(20000, 3)}) {
        Picture picture(width, height, TRANSPARENT);
        for (int i = 0; i < 300; ++i) {
            picture.pixels[random() % picture.pixels.size()] = 0;
        }
        TestSurface surface(picture);
        expect_region(surface.bitmap(), picture, TRANSPARENT);
    }
}

TEST(RegionFromBitmap, ComparesAtEveryDepth) {
    std::mt19937 random(103);
    SCOPED_TRACE("seed 103");
    // Each in the tables of 4 and 8 bits, and 5-5-5 in all channels.
    const std::vector<COLORREF> colours = {0, 0xFFFFFF, 0x0000FF, 0xFF0000};
    for (const int depth : {1, 4, 8, 16, 24, 32}) {
        SCOPED_TRACE(depth);
        for (const COLORREF key : colours) {
            TestSurface surface(random_picture(random, 101, 9, colours), depth);
            const Picture stored = surface.picture();
            expect_region(surface.bitmap(), stored, key);
        }
    }
}

TEST(RegionFromBitmap, ComparesTheWholeWordOfAPixel) {
    const std::uint32_t words[] = {0x00804020, 0x01804020, 0xFF804020, 0x00804021};
    CBitmap bitmap;
    bitmap.CreateBitmap(4, 1, 1, 32, words);
    CRgn region;
    ASSERT_TRUE(RegionFromBitmap(region, bitmap, 0xAA204080));  // the colour's own high byte plays no part
    for (int x = 0; x < 4; ++x) {
        EXPECT_EQ(region.PtInRegion(x, 0), x != 0);
    }

    const std::uint16_t five_five_five[] = {0x10 << 10 | 0x08 << 5 | 0x04,
                                            0x8000 | 0x10 << 10 | 0x08 << 5 | 0x04,
                                            0x10 << 10 | 0x08 << 5 | 0x05, 0};
    CBitmap narrow;
    narrow.CreateBitmap(4, 1, 1, 16, five_five_five);
    CRgn narrow_region;
    ASSERT_TRUE(RegionFromBitmap(narrow_region, narrow, RGB(0x87, 0x40, 0x1F)));  // brought to five bits
    for (int x = 0; x < 4; ++x) {
        EXPECT_EQ(narrow_region.PtInRegion(x, 0), x != 0);
    }
}

TEST(RegionFromBitmap, LeavesOutTheGroundDrawnInTheColour) {
    for (const int depth : {16, 24, 32}) {
        for (int level = 0; level < 256; ++level) {
            const COLORREF colour = RGB(level, 255 - level, level / 2);
            TestSurface surface(Picture(3, 2, colour), depth);
            CRgn region;
            ASSERT_TRUE(RegionFromBitmap(region, surface.bitmap(), colour));
            RECT box;
            EXPECT_EQ(region.GetRgnBox(&box), NULLREGION) << depth << " bits, level " << level;
        }
    }
}

TEST(RegionFromBitmap, LeavesTheRegionAloneOnFailure) {
    TestSurface surface(Picture(5, 1, 0));
    CRgn region;
    EXPECT_FALSE(RegionFromBitmap(region, surface.bitmap(), 0x100000000));
    CBitmap none;
    EXPECT_FALSE(RegionFromBitmap(region, none, 0));
    EXPECT_EQ(region.GetSafeHandle(), nullptr);
    region.CreateRectRgn(1, 2, 3, 4);
    HGDIOBJ const held = region.GetSafeHandle();
    EXPECT_FALSE(RegionFromBitmap(region, surface.bitmap(), 0));
    EXPECT_EQ(region.GetSafeHandle(), held);
    EXPECT_NE(region.PtInRegion(2, 3), 0);
}

TEST(RegionFromBitmap, ThrowsOrFailsWithoutMemory) {
    Picture picture(100, 4, TRANSPARENT);
    for (int x = 0; x < 100; x += 2) {
        picture.at(x, x % 4) = 0;
    }
    TestSurface surface(picture);
    CBitmap& bitmap = surface.bitmap();
    bool made = false;
    bool holds_one = false;
    int thrown = 0;
    with_failing_allocations(
        [&] {
            CRgn region;
            made = false;
            try {
                made = RegionFromBitmap(region, bitmap, TRANSPARENT);
            } catch (const std::bad_alloc&) {
                ++thrown;
            }
            holds_one = region.GetSafeHandle() != nullptr;
        },
        [&](bool fired) {
            EXPECT_NE(made, fired);
            EXPECT_EQ(holds_one, made);
        });
    EXPECT_GT(thrown, 0);
}

}  // namespace
