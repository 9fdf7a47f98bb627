#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <numbers>
#include <random>

#include "tests/graphics/test_surface.h"

namespace {

using namespace basalt::test;
using vex_util::mfc::RotateBitmap;

constexpr COLORREF UNCOVERED = 0x008080;  // red and green
const std::vector<COLORREF> COLOURS = {0x0000FF, 0x00FF00, 0xFF0000, 0xFFFFFF, 0, 0x102030};

Picture rotated(const Picture& picture, float angle, int depth = 32) {
    TestSurface surface(picture, depth);
    CDC screen_like;
    screen_like.CreateCompatibleDC(nullptr);
    EXPECT_TRUE(RotateBitmap(&screen_like, &surface.bitmap(), angle));
    return surface.picture();
}

// A quarter turn, as often as given, about the corner that four pixels share in the middle.
Picture turned_by_quarters(const Picture& from, int quarters) {
    Picture to(from.width, from.height, UNCOVERED);
    const int cx = from.width / 2;
    const int cy = from.height / 2;
    for (int y = 0; y < to.height; ++y) {
        for (int x = 0; x < to.width; ++x) {
            // Pixel (a, b) reaches from a to a + 1: going back a quarter it reaches from b to b + 1 and from
            // -a - 1 to -a.
            int a = x - cx;
            int b = y - cy;
            for (int i = 0; i < quarters; ++i) {
                const int old_a = a;
                a = b;
                b = -old_a - 1;
            }
            if (from.has(a + cx, b + cy)) {
                to.at(x, y) = from.at(a + cx, b + cy);
            }
        }
    }
    return to;
}

TEST(RotateBitmap, TurnsByQuartersPixelForPixel) {
    std::mt19937 random(91);
    SCOPED_TRACE("seed 91");
    const int sizes[][2] = {{1, 1},   {2, 2},   {8, 8},   {64, 64}, {63, 63}, {40, 24},
                            {24, 40}, {41, 24}, {24, 41}, {33, 57}, {2, 200}, {200, 1}};
    for (const auto& size : sizes) {
        const Picture picture = random_picture(random, size[0], size[1], COLOURS);
        for (const int angle : {90, 180, 270, 360, 450, -90, -180, -270, -360, 3600, 3690}) {
            SCOPED_TRACE(testing::Message() << size[0] << " x " << size[1] << " by " << angle);
            expect_same(rotated(picture, static_cast<float>(angle)),
                        turned_by_quarters(picture, (angle / 90 % 4 + 4) % 4));
        }
    }
}

TEST(RotateBitmap, TurnsClockwise) {
    Picture picture(4, 4, 0);
    picture.at(0, 0) = 0xFFFFFF;
    const Picture quarter = rotated(picture, 90.0F);
    EXPECT_EQ(quarter.at(3, 0), 0xFFFFFFU);
    EXPECT_EQ(rotated(picture, -90.0F).at(0, 3), 0xFFFFFFU);
}

// Against the turn in doubles, but where what single precision leaves open decides.
TEST(RotateBitmap, TurnsByAnyAngleToThePixel) {
    std::mt19937 random(92);
    SCOPED_TRACE("seed 92");
    constexpr int WIDTH = 61;
    constexpr int HEIGHT = 40;
    const Picture picture = random_picture(random, WIDTH, HEIGHT, COLOURS);
    for (const float angle : {0.5F, 12.5F, 45.0F, 117.25F, -63.4F, 359.0F}) {
        SCOPED_TRACE(angle);
        const Picture turned = rotated(picture, angle);
        const double radians = static_cast<double>(angle) * std::numbers::pi / 180;
        int compared = 0;
        for (int y = 0; y < HEIGHT; ++y) {
            for (int x = 0; x < WIDTH; ++x) {
                const double right = x + 0.5 - WIDTH / 2;
                const double down = y + 0.5 - HEIGHT / 2;
                const double from_x = right * std::cos(radians) + down * std::sin(radians) + WIDTH / 2;
                const double from_y = down * std::cos(radians) - right * std::sin(radians) + HEIGHT / 2;
                const auto is_open = [](double at) { return std::abs(at - std::round(at)) < 1e-3; };
                if (is_open(from_x) || is_open(from_y)) {
                    continue;
                }
                const auto column = static_cast<int>(std::floor(from_x));
                const auto row = static_cast<int>(std::floor(from_y));
                ASSERT_EQ(turned.at(x, y), picture.has(column, row) ? picture.at(column, row) : UNCOVERED)
                    << x << ' ' << y;
                ++compared;
            }
        }
        EXPECT_GT(compared, WIDTH * HEIGHT * 9 / 10);
    }
}

TEST(RotateBitmap, ChangesNothingOnFailure) {
    Picture picture(6, 4, 0);
    picture.at(1, 1) = 0x123456;
    TestSurface surface(picture);
    CDC dc;
    dc.CreateCompatibleDC(nullptr);
    EXPECT_FALSE(RotateBitmap(&dc, &surface.bitmap(), 0.0F));
    EXPECT_FALSE(RotateBitmap(&dc, &surface.bitmap(), -0.0F));
    EXPECT_FALSE(RotateBitmap(nullptr, &surface.bitmap(), 90.0F));
    EXPECT_FALSE(RotateBitmap(&dc, nullptr, 90.0F));
    for (const float angle :
         {std::numeric_limits<float>::quiet_NaN(), std::numeric_limits<float>::infinity()}) {
        EXPECT_FALSE(RotateBitmap(&dc, &surface.bitmap(), angle));
    }
    CBitmap& bitmap = surface.bitmap();
    surface.select();
    EXPECT_FALSE(RotateBitmap(&dc, &bitmap, 90.0F)) << "selected elsewhere";
    CBitmap none;
    EXPECT_FALSE(RotateBitmap(&dc, &none, 90.0F));
    expect_same(surface.picture(), picture);
}

TEST(RotateBitmap, ChangesNothingWithoutMemory) {
    Picture picture(6, 4, 0);
    picture.at(1, 1) = 0x123456;
    CDC dc;
    dc.CreateCompatibleDC(nullptr);
    TestSurface surface(picture);
    bool turned = false;
    with_failing_allocations([&, &bitmap = surface.bitmap()] { turned = RotateBitmap(&dc, &bitmap, 180.0F); },
                             [&](bool fired) {
                                 EXPECT_NE(turned, fired);
                                 expect_same(surface.picture(),
                                             turned ? turned_by_quarters(picture, 2) : picture);
                                 surface.put(picture);
                                 surface.bitmap();
                             });
}

}  // namespace
