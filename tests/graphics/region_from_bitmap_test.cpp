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

// Each in the tables of 4 and 8 bits, and 5-5-5 in all channels.
const std::vector<COLORREF> STORABLE = {0, 0xFFFFFF, 0x0000FF, 0xFF0000};

void expect_region_of(TestSurface& surface, COLORREF key) {
    CRgn region;
    ASSERT_TRUE(RegionFromBitmap(region, surface.free_bitmap(), key));
    drawing::expect_region(region, surface.picture(), key);
}

TEST(RegionFromBitmap, HoldsThePixelsNotOfTheColour) {
    std::mt19937 random(101);
    SCOPED_TRACE("seed 101");
    for (int width = 1; width <= 200; width += width < 70 ? 1 : 29) {
        for (const int depth : drawing::DEPTHS) {
            SCOPED_TRACE(testing::Message() << depth << " bits, width " << width);
            const COLORREF key = STORABLE[random() % STORABLE.size()];
            const bool few = random() % 2 == 0;
            Picture picture = random_picture(
                random, width, 7,
                few ? std::vector<COLORREF>{key, key, key, key, key, ~key & 0xFFFFFF} : STORABLE);
            for (int x = 0; x < width; ++x) {  // rows that are alike, and rows of one colour
                picture.at(x, 3) = picture.at(x, 2);
                picture.at(x, 5) = width % 2 == 0 ? key : 0xFFFFFF;
            }
            TestSurface surface(picture, depth);
            expect_region_of(surface, key);
        }
    }
}

TEST(RegionFromBitmap, ReadsLargeBitmapsInPieces) {
    std::mt19937 random(102);
    SCOPED_TRACE("seed 102");
    for (const auto& [width, height] : {std::pair(3, 9000), std::pair(20000, 3)}) {
        TestSurface surface(random_picture(random, width, height, {TRANSPARENT, TRANSPARENT, 0}));
        expect_region_of(surface, TRANSPARENT);
    }
}

TEST(RegionFromBitmap, ComparesTheWholeWordOfAPixel) {
    const std::uint32_t words[] = {0x00804020, 0x01804020, 0xFF804020, 0x00804021};
    constexpr std::uint16_t CODE = 0x10 << 10 | 0x08 << 5 | 0x04;
    const std::uint16_t codes[] = {CODE, 0x8000 | CODE, CODE + 1, 0};
    const struct {
        UINT depth;
        const void* pixels;
        unsigned long key;
    } facts[] = {{32, words, 0xAA204080},              // the colour's own high byte plays no part
                 {16, codes, RGB(0x87, 0x40, 0x1F)}};  // brought to five bits
    for (const auto& fact : facts) {
        CBitmap bitmap;
        bitmap.CreateBitmap(4, 1, 1, fact.depth, fact.pixels);
        CRgn region;
        ASSERT_TRUE(RegionFromBitmap(region, bitmap, fact.key));
        for (int x = 0; x < 4; ++x) {
            EXPECT_EQ(region.PtInRegion(x, 0), x != 0) << fact.depth << " bits";
        }
    }
}

TEST(RegionFromBitmap, LeavesOutTheGroundDrawnInTheColour) {
    for (const int depth : {16, 24, 32}) {
        for (int level = 0; level < 256; ++level) {
            const COLORREF colour = RGB(level, 255 - level, level / 2);
            TestSurface surface(Picture(3, 2, colour), depth);
            CRgn region;
            ASSERT_TRUE(RegionFromBitmap(region, surface.free_bitmap(), colour));
            RECT box;
            EXPECT_EQ(region.GetRgnBox(&box), NULLREGION) << depth << " bits, level " << level;
        }
    }
}

TEST(RegionFromBitmap, LeavesTheRegionAloneOnFailure) {
    TestSurface surface(Picture(5, 1, 0));
    CRgn region;
    EXPECT_FALSE(RegionFromBitmap(region, surface.free_bitmap(), 0x100000000));
    CBitmap none;
    EXPECT_FALSE(RegionFromBitmap(region, none, 0));
    EXPECT_EQ(region.GetSafeHandle(), nullptr);
    region.CreateRectRgn(1, 2, 3, 4);
    HGDIOBJ const held = region.GetSafeHandle();
    EXPECT_FALSE(RegionFromBitmap(region, surface.free_bitmap(), 0));
    EXPECT_EQ(region.GetSafeHandle(), held);
    EXPECT_NE(region.PtInRegion(2, 3), 0);
}

TEST(RegionFromBitmap, ThrowsOrFailsWithoutMemory) {
    Picture picture(100, 4, TRANSPARENT);
    for (int x = 0; x < 100; x += 2) {
        picture.at(x, x % 4) = 0;
    }
    TestSurface surface(picture);
    CBitmap& bitmap = surface.free_bitmap();
    bool made = false;
    CRgn region;
    int thrown = 0;
    with_failing_allocations(
        [&] {
            made = false;
            try {
                made = RegionFromBitmap(region, bitmap, TRANSPARENT);
            } catch (const std::bad_alloc&) {
                ++thrown;
            }
        },
        [&](bool fired) {
            EXPECT_NE(made, fired);
            EXPECT_EQ(region.GetSafeHandle() != nullptr, made);
            region.DeleteObject();
        });
    EXPECT_GT(thrown, 0);
}

}  // namespace
