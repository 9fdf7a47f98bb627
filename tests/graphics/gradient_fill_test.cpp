#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <limits>
#include <random>

#include "tests/graphics/test_surface.h"

namespace {

using namespace basalt::test;

constexpr float NOT_A_NUMBER = std::numeric_limits<float>::quiet_NaN();
constexpr float INF = std::numeric_limits<float>::infinity();
constexpr COLORREF GROUND = 0x0A0B0C;

struct Fill {
    int left, top, right, bottom;
    int diameter;
    COLORREF corner;
    COLORREF colour;
    float darkening;
    std::uint32_t mode;
};

void fill(HDC dc, const Fill& f) {
    _gradientfill(dc, f.left, f.top, f.right, f.bottom, f.diameter, f.corner, f.colour, f.darkening, f.mode);
}

// 8.8 at place p of a ramp from `first` at a to `last` at b, by division of whole numbers.
int level(std::int64_t first, std::int64_t last, std::int64_t a, std::int64_t b, std::int64_t p) {
    return static_cast<int>((last * (p - a) + first * (b - p)) / (b - a) >> 8);
}

// Whether a pixel's middle lies in the rounding of a rectangle; lengths in half pixels.
bool is_inside(const Fill& f, int x, int y) {
    const std::int64_t wide = std::min(f.diameter, f.right - f.left);
    const std::int64_t high = std::min(f.diameter, f.bottom - f.top);
    // From the nearest corner inwards, then to the middle of its ellipse.
    const std::int64_t dx = std::min(2 * (x - f.left) + 1, 2 * (f.right - x) - 1) - wide;
    const std::int64_t dy = std::min(2 * (y - f.top) + 1, 2 * (f.bottom - y) - 1) - high;
    return dx >= 0 || dy >= 0 || dx * dx * high * high + dy * dy * wide * wide <= wide * wide * high * high;
}

// The fill, one pixel at a time. ends: the levels of red, green and blue where the gradient ends.
void paint(Picture& picture, const Fill& f, const int (&ends)[3]) {
    for (int y = std::max(f.top, 0); y < std::min(f.bottom, picture.height); ++y) {
        for (int x = std::max(f.left, 0); x < std::min(f.right, picture.width); ++x) {
            int levels[3];
            for (int i = 0; i < 3; ++i) {
                const int start = static_cast<int>(f.colour >> 8 * i & 0xFF) << 8;
                levels[i] = f.mode == 0 ? level(start, ends[i], f.left, f.right, x)
                                        : level(start, ends[i], f.top, f.bottom, y);
            }
            picture.at(x, y) = RGB(levels[0], levels[1], levels[2]);
            if (f.diameter > 0 && f.corner != 0x808080 && !is_inside(f, x, y)) {
                picture.at(x, y) = f.corner;
            }
        }
    }
}

void expect_filled(const Fill& f, const int (&ends)[3], int width = 90, int height = 70) {
    SCOPED_TRACE(testing::Message() << f.left << ' ' << f.top << ' ' << f.right << ' ' << f.bottom
                                    << " diameter " << f.diameter << " mode " << f.mode);
    Picture expected(width, height, GROUND);
    TestSurface surface(expected);
    fill(surface.dc(), f);
    paint(expected, f, ends);
    expect_same(surface.picture(), expected);
}

TEST(GradientFill, DrawsNothingBelowTheNtFamily) {
    for (int code = 0; code < 5; ++code) {
        const StoredOsCode os(code);
        TestSurface surface(Picture(20, 20, GROUND));
        fill(surface.dc(), {0, 0, 20, 20, 6, 0xFFFFFF, 0x123456, 2.0F, 0});
        expect_same(surface.picture(), Picture(20, 20, GROUND));
    }
}

TEST(GradientFill, RunsFromTheColourToItsPart) {
    const StoredOsCode os(NT);
    for (const std::uint32_t mode : {0U, 1U}) {
        expect_filled({0, 0, 90, 70, 0, 0, 0x0000FF, 2.0F, mode}, {0x7F80, 0, 0});
        expect_filled({10, 20, 75, 61, -3, 0xFFFFFF, 0x20C0FF, 4.0F, mode}, {0x3FC0, 0x3000, 0x0800});
        expect_filled({10, 20, 75, 61, 0, 0, 0xFFC020, 1.0F, mode}, {0x2000, 0xC000, 0xFF00});
        // Hanging out on all sides, the surface shows the middle of the ramp.
        expect_filled({-400, -300, 700, 500, 0, 0, 0xFFFFFF, 3.0F, mode}, {0x5500, 0x5500, 0x5500});
        // A width whose products need more than 32 bits.
        expect_filled({-100000, -100000, 100000, 100000, 0, 0, 0xFEDCBA, 2.0F, mode},
                      {0x5D00, 0x6E00, 0x7F00});
    }
}

TEST(GradientFill, KeepsTheEndWithinSixteenBits) {
    const StoredOsCode os(NT);
    const struct {
        float darkening;
        int ends[3];
    } facts[] = {
        {0.5F, {0xFFFF, 0x8000, 0}},
        {0.0F, {0xFFFF, 0xFFFF, 0}},
        {-0.0F, {0, 0, 0}},
        {-2.0F, {0, 0, 0}},
        {NOT_A_NUMBER, {0, 0, 0}},
        {INF, {0, 0, 0}},
        {1e-30F, {0xFFFF, 0xFFFF, 0}},
        {3.0F, {0x5500, 0x1555, 0}},
        {1e30F, {0, 0, 0}},
    };
    for (const auto& fact : facts) {
        SCOPED_TRACE(fact.darkening);
        expect_filled({0, 0, 90, 4, 0, 0, 0x0040FF, fact.darkening, 0}, fact.ends);
    }
}

TEST(GradientFill, TakesOppositeSidesInAnyOrder) {
    const StoredOsCode os(NT);
    Picture expected(30, 20, GROUND);
    TestSurface surface(expected);
    fill(surface.dc(), {25, 15, 5, 3, 6, 0xFFFFFF, 0x000010, 2.0F, 0});  // no corners
    for (int y = 3; y < 15; ++y) {
        for (int x = 5; x < 25; ++x) {
            // From level 8 at the left to 16 at the right.
            expected.at(x, y) = static_cast<COLORREF>(level(0x0800, 0x1000, 5, 25, x));
        }
    }
    expect_same(surface.picture(), expected);
    fill(surface.dc(), {7, 3, 7, 15, 6, 0xFFFFFF, 0x000010, 2.0F, 0});  // no width
    fill(surface.dc(), {5, 3, 25, 15, 0, 0, 0x000010, 2.0F, 2});        // no such mode
    expect_same(surface.picture(), expected);
}

TEST(RoundedCorners, StandInTheRectanglesOwnPlace) {
    const StoredOsCode os(NT);
    std::mt19937 random(74);
    SCOPED_TRACE("seed 74");
    const auto draw = [&](int low, int high) {
        return low + static_cast<int>(random() % static_cast<unsigned>(high - low + 1));
    };
    expect_filled({0, 0, 60, 40, 24, 0xFFFFFF, 0x0000FF, 2.0F, 0}, {0x7F80, 0, 0});
    expect_filled({17, 23, 78, 60, 25, 0xFFFFFF, 0x0000FF, 2.0F, 0}, {0x7F80, 0, 0});
    expect_filled({17, 23, 78, 60, 25, 0x808080, 0x0000FF, 2.0F, 1}, {0x7F80, 0, 0});        // the key itself
    expect_filled({3, 4, 43, 44, 2147483647, 0xFFFFFF, 0x0000FF, 2.0F, 1}, {0x7F80, 0, 0});  // a disc
    for (int i = 0; i < 300; ++i) {
        const int left = draw(-20, 80);
        const int top = draw(-20, 60);
        expect_filled({left, top, left + draw(1, 90), top + draw(1, 70), draw(1, i % 2 == 0 ? 12 : 120),
                       0x00EEAA55, 0x336699, 2.0F, static_cast<std::uint32_t>(i % 2)},
                      {0x4C80, 0x3300, 0x1980});
    }
}

TEST(RoundedCorners, CutTheSameShapeAtEveryDepth) {
    const StoredOsCode os(NT);
    const Fill corners = {7, 5, 50, 38, 20, 0, 0xFFFFFF, 1.0F, 0};
    Picture expected(60, 45, 0);
    paint(expected, corners, {0xFF00, 0xFF00, 0xFF00});
    for (const int depth : {1, 4, 8, 16, 24, 32}) {
        SCOPED_TRACE(depth);
        TestSurface surface(60, 45, depth);
        fill(surface.dc(), corners);
        expect_same(surface.picture(), expected);
    }
}

TEST(RoundedCorners, LeaveNothingBehind) {
    const StoredOsCode os(NT);
    const Fill corners = {2, 2, 40, 40, 16, 0xFFFFFF, 0x336699, 2.0F, 1};
    Picture square(44, 44, GROUND);
    Fill without = corners;
    without.diameter = 0;
    paint(square, without, {0x4C80, 0x3300, 0x1980});
    Picture rounded(44, 44, GROUND);
    paint(rounded, corners, {0x4C80, 0x3300, 0x1980});
    TestSurface surface(Picture(44, 44, GROUND));
    with_failing_allocations([&] { fill(surface.dc(), corners); },
                             [&](bool fired) {
                                 expect_same(surface.picture(), fired ? square : rounded);
                                 surface.put(Picture(44, 44, GROUND));
                             });
    HBRUSH const brush = CreateSolidBrush(0x010203);
    SelectObject(surface.dc(), brush);
    fill(surface.dc(), corners);
    EXPECT_EQ(GetPixel(surface.dc(), 2, 2), 0xFFFFFFU);
    EXPECT_EQ(SelectObject(surface.dc(), GetStockObject(WHITE_BRUSH)), brush);
    DeleteObject(brush);
}

TEST(GradientFill, OfAWrongContextDoesNothing) {
    const StoredOsCode os(NT);
    fill(nullptr, {0, 0, 10, 10, 4, 0xFFFFFF, 0x336699, 2.0F, 1});
    TestSurface surface(8, 8);
    fill(surface.dc(),
         {-2147483647 - 1, -2147483647 - 1, 2147483647, 2147483647, 2147483647, 0xFFFFFF, 0x336699, 1.0F, 1});
    expect_same(surface.picture(), Picture(8, 8, 0x336699));
}

}  // namespace
