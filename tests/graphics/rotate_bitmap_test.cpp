#include <gtest/gtest.h>

#include <limits>
#include <random>

#include "tests/graphics/test_surface.h"

namespace {

using namespace basalt::test;
using vex_util::mfc::RotateBitmap;

constexpr COLORREF UNCOVERED = 0x008080;  // red and green
const std::vector<COLORREF> COLOURS = {0x0000FF, 0x00FF00, 0xFF0000, 0xFFFFFF, 0, 0x102030};

// Against the turn in doubles, but where what single precision leaves open decides; of quarters, nothing is
// open.
TEST(RotateBitmap, TurnsByAnyAngleToThePixel) {
    std::mt19937 random(91);
    SCOPED_TRACE("seed 91");
    CDC screen_like;
    screen_like.CreateCompatibleDC(nullptr);
    const int sizes[][2] = {{1, 1},   {2, 2},   {8, 8},   {64, 64}, {63, 63}, {40, 24}, {24, 40},
                            {41, 24}, {24, 41}, {33, 57}, {2, 200}, {200, 1}, {61, 40}};
    int compared = 0;
    int open = 0;
    for (const auto& [width, height] : sizes) {
        const Picture picture = random_picture(random, width, height, COLOURS);
        for (const float angle : {90.0F, 180.0F, 270.0F, 360.0F, 450.0F, -90.0F, -180.0F, -270.0F, -360.0F,
                                  3600.0F, 3690.0F, 0.5F, 12.5F, 45.0F, 117.25F, -63.4F, 359.0F}) {
            SCOPED_TRACE(testing::Message() << width << " x " << height << " by " << angle);
            TestSurface surface(picture);
            EXPECT_TRUE(RotateBitmap(&screen_like, &surface.free_bitmap(), angle));
            const Picture turned = surface.picture();
            const XFORM turn = drawing::turn_about(static_cast<double>(angle), width / 2, height / 2);
            for (int y = 0; y < height; ++y) {
                for (int x = 0; x < width; ++x) {
                    const drawing::Origin from = drawing::origin(turn, x, y);
                    if (from.margin < 1e-3) {
                        ++open;
                        continue;
                    }
                    ASSERT_EQ(turned.at(x, y),
                              picture.has(from.x, from.y) ? picture.at(from.x, from.y) : UNCOVERED)
                        << x << ' ' << y;
                    ++compared;
                }
            }
        }
    }
    EXPECT_LT(open, compared / 100);
}

TEST(RotateBitmap, ChangesNothingOnFailure) {
    Picture picture(6, 4, 0);
    picture.at(1, 1) = 0x123456;
    TestSurface surface(picture);
    CDC dc;
    dc.CreateCompatibleDC(nullptr);
    for (const float angle :
         {0.0F, -0.0F, std::numeric_limits<float>::quiet_NaN(), std::numeric_limits<float>::infinity()}) {
        EXPECT_FALSE(RotateBitmap(&dc, &surface.free_bitmap(), angle));
    }
    EXPECT_FALSE(RotateBitmap(nullptr, &surface.free_bitmap(), 90.0F));
    EXPECT_FALSE(RotateBitmap(&dc, nullptr, 90.0F));
    CBitmap& bitmap = surface.free_bitmap();
    surface.select();
    EXPECT_FALSE(RotateBitmap(&dc, &bitmap, 90.0F)) << "selected elsewhere";
    CBitmap none;
    EXPECT_FALSE(RotateBitmap(&dc, &none, 90.0F));
    expect_same(surface.picture(), picture);

    Picture half_turned(6, 4, 0);
    half_turned.at(4, 2) = 0x123456;
    bool turned = false;
    surface.free_bitmap();
    with_failing_allocations([&] { turned = RotateBitmap(&dc, &bitmap, 180.0F); },
                             [&](bool fired) {
                                 EXPECT_NE(turned, fired);
                                 expect_same(surface.picture(), turned ? half_turned : picture);
                                 surface.put(picture);
                                 surface.free_bitmap();
                             });
}

}  // namespace
