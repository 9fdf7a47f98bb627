#include <gtest/gtest.h>

#include <algorithm>
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

// The fill, one pixel at a time. ends: the levels of red, green and blue where the gradient ends.
void paint(Picture& picture, const Fill& f, const int (&ends)[3]) {
    // There are no corners where sides are exchanged, and none in the colour that stands for the inside.
    const bool is_rounded = f.diameter > 0 && f.left < f.right && f.top < f.bottom && f.corner != 0x808080;
    const RECT all = drawing::ordered({f.left, f.top, f.right, f.bottom});
    for (int y = std::max(all.top, 0); y < std::min(all.bottom, picture.height); ++y) {
        for (int x = std::max(all.left, 0); x < std::min(all.right, picture.width); ++x) {
            int levels[3];
            for (int i = 0; i < 3; ++i) {
                const int start = static_cast<int>(f.colour >> 8 * i & 0xFF) << 8;
                levels[i] = f.mode == 0 ? drawing::gradient_level(start, ends[i], f.left, f.right, x)
                                        : drawing::gradient_level(start, ends[i], f.top, f.bottom, y);
            }
            const bool is_outside = is_rounded && !drawing::is_in_rounded(all, f.diameter, f.diameter, x, y);
            picture.at(x, y) = is_outside ? f.corner : RGB(levels[0], levels[1], levels[2]);
        }
    }
}

void expect_filled(const Fill& f, const int (&ends)[3], int depth = 32) {
    SCOPED_TRACE(testing::Message() << f.left << ' ' << f.top << ' ' << f.right << ' ' << f.bottom
                                    << " diameter " << f.diameter << " mode " << f.mode << " depth "
                                    << depth);
    TestSurface surface(Picture(90, 70, GROUND), depth);
    Picture expected = surface.picture();
    fill(surface, f);
    paint(expected, f, ends);
    expect_same(surface.picture(), expected);
}

TEST(GradientFill, DrawsNothingBelowTheNtFamilyInNoModeAndWithoutAContext) {
    TestSurface surface(Picture(20, 20, GROUND));
    for (int code = 0; code < 5; ++code) {
        const StoredOsCode os(code);
        fill(surface, {0, 0, 20, 20, 6, 0xFFFFFF, 0x123456, 2.0F, 0});
    }
    const StoredOsCode os(NT);
    fill(surface, {5, 3, 25, 15, 0, 0, 0x000010, 2.0F, 2});
    fill(nullptr, {0, 0, 10, 10, 4, 0xFFFFFF, 0x336699, 2.0F, 1});
    expect_same(surface.picture(), Picture(20, 20, GROUND));
}

TEST(GradientFill, RunsFromTheColourToItsPart) {
    const StoredOsCode os(NT);
    for (const std::uint32_t mode : {0U, 1U}) {
        expect_filled({0, 0, 90, 70, 0, 0, 0x0000FF, 2.0F, mode}, {0x7F80, 0, 0});
        expect_filled({10, 20, 75, 61, -3, 0xFFFFFF, 0x20C0FF, 4.0F, mode}, {0x3FC0, 0x3000, 0x0800});
        expect_filled({10, 20, 75, 61, 0, 0, 0xFFC020, 1.0F, mode}, {0x2000, 0xC000, 0xFF00});
        // Opposite sides in any order, which have no corners; then no width.
        expect_filled({25, 15, 5, 3, 6, 0xFFFFFF, 0x000010, 2.0F, mode}, {0x0800, 0, 0});
        expect_filled({7, 3, 7, 15, 6, 0xFFFFFF, 0x000010, 2.0F, mode}, {0x0800, 0, 0});
        // Hanging out on all sides, the surface shows the middle of the ramp.
        expect_filled({-400, -300, 700, 500, 0, 0, 0xFFFFFF, 3.0F, mode}, {0x5500, 0x5500, 0x5500});
        // Widths whose products need more than 32 bits.
        expect_filled({-100000, -100000, 100000, 100000, 0, 0, 0xFEDCBA, 2.0F, mode},
                      {0x5D00, 0x6E00, 0x7F00});
        constexpr int FAR = std::numeric_limits<int>::max();
        expect_filled({-FAR - 1, -FAR - 1, FAR, FAR, FAR, 0xFFFFFF, 0x336699, 1.0F, mode},
                      {0x9900, 0x6600, 0x3300});
    }
}

TEST(GradientFill, KeepsTheEndWithinSixteenBits) {
    const StoredOsCode os(NT);
    const struct {
        float darkening;
        int ends[3];
    } facts[] = {{0.5F, {0xFFFF, 0x8000, 0}}, {0.0F, {0xFFFF, 0xFFFF, 0}},  {-0.0F, {0, 0, 0}},
                 {-2.0F, {0, 0, 0}},          {NOT_A_NUMBER, {0, 0, 0}},    {INF, {0, 0, 0}},
                 {3.0F, {0x5500, 0x1555, 0}}, {1e-30F, {0xFFFF, 0xFFFF, 0}}};
    for (const auto& fact : facts) {
        SCOPED_TRACE(fact.darkening);
        expect_filled({0, 0, 90, 4, 0, 0, 0x0040FF, fact.darkening, 0}, fact.ends);
    }
}

TEST(RoundedCorners, StandInTheRectanglesOwnPlace) {
    const StoredOsCode os(NT);
    std::mt19937 random(74);
    SCOPED_TRACE("seed 74");
    expect_filled({0, 0, 60, 40, 24, 0xFFFFFF, 0x0000FF, 2.0F, 0}, {0x7F80, 0, 0});
    expect_filled({17, 23, 78, 60, 25, 0xFFFFFF, 0x0000FF, 2.0F, 0}, {0x7F80, 0, 0});
    expect_filled({17, 23, 78, 60, 25, 0x808080, 0x0000FF, 2.0F, 1}, {0x7F80, 0, 0});        // the key itself
    expect_filled({3, 4, 43, 44, 2147483647, 0xFFFFFF, 0x0000FF, 2.0F, 1}, {0x7F80, 0, 0});  // a disc
    for (int i = 0; i < 300; ++i) {
        const int left = between(random, -20, 80);
        const int top = between(random, -20, 60);
        expect_filled({left, top, left + between(random, 1, 90), top + between(random, 1, 70),
                       between(random, 1, i % 2 == 0 ? 12 : 120), 0x00EEAA55, 0x336699, 2.0F,
                       static_cast<std::uint32_t>(i % 2)},
                      {0x4C80, 0x3300, 0x1980});
    }
    for (const int depth : drawing::DEPTHS) {
        expect_filled({7, 5, 50, 38, 20, 0, 0xFFFFFF, 1.0F, 0}, {0xFF00, 0xFF00, 0xFF00}, depth);
    }
}

// Its corners were once drawn in full, seen or not, which took minutes.
TEST(RoundedCorners, OfARectangleFarLargerThanTheSurface) {
    const StoredOsCode os(NT);
    for (const RECT& r : {RECT{-39000, -20, 70, 39000}, RECT{12, -39900, 40000, 60}}) {
        expect_filled({r.left, r.top, r.right, r.bottom, 40000, 0xFFFFFF, 0x336699, 1.0F, 0},
                      {0x9900, 0x6600, 0x3300}, 8);
    }
}

TEST(RoundedCorners, NeedNoMemoryAndKeepTheBrush) {
    const StoredOsCode os(NT);
    const Fill corners = {2, 2, 40, 40, 16, 0xFFFFFF, 0x336699, 2.0F, 1};
    const TestSurface surface(Picture(44, 44, GROUND));
    HBRUSH const brush = CreateSolidBrush(0x010203);
    SelectObject(surface, brush);
    EXPECT_EQ(with_failing_allocations([&] { fill(surface, corners); }, [](bool) {}), 0);
    EXPECT_EQ(GetPixel(surface, 2, 2), 0xFFFFFFU);
    EXPECT_EQ(SelectObject(surface, GetStockObject(WHITE_BRUSH)), brush);
    DeleteObject(brush);
}

TEST(RoundedCorners, ShowTheGradientWhereTheSurfaceTellsTheirColourNotFromTheKey) {
    const StoredOsCode os(NT);
    const TestSurface surface(Picture(20, 20, GROUND), 16);
    fill(surface, {0, 0, 20, 20, 8, 0x818181, 0xFFFFFF, 1.0F, 0});
    EXPECT_EQ(GetPixel(surface, 0, 0), 0xFFFFFFU);
}

}  // namespace
