#include "basalt/graphics/drawing_functions.h"

#include <gtest/gtest.h>

#include <climits>
#include <cmath>
#include <random>

#include "tests/graphics/stored_os_code.h"
#include "tests/support/drawing.h"

namespace {

using namespace drawing;
constexpr COLORREF KEY = 0xC08040;

int copy_transparent(HDC to, HDC from, const Stretch& s) {
    return _transparentblt(to, s.x, s.y, s.width, s.height, from, s.source_x, s.source_y, s.source_width,
                           s.source_height, KEY);
}

TEST(GradientFill, goes_from_the_colour_to_its_part_within_16_bits) {
    const StoredOsCode nt(5);
    const struct {
        RECT r;
        COLORREF colour;
        float darkening;
        WORD red, green, blue;  // at the end
    } facts[] = {{{0, 0, 90, 70}, 0x0000FF, 2, 0x7F80, 0, 0},
                 {{10, 20, 75, 61}, 0x20C0FF, 4, 0x3FC0, 0x3000, 0x0800},
                 {{10, 20, 75, 61}, 0xFFC020, 1, 0x2000, 0xC000, 0xFF00},
                 {{25, 15, 5, 3}, 0x000010, 2, 0x0800, 0, 0},
                 {{7, 3, 7, 15}, 0x000010, 2, 0x0800, 0, 0},
                 {{-400, -300, 700, 500}, 0xFFFFFF, 3, 0x5500, 0x5500, 0x5500},
                 {{-100000, -100000, 100000, 100000}, 0xFEDCBA, 2, 0x5D00, 0x6E00, 0x7F00},
                 {{INT_MIN, INT_MIN, INT_MAX, INT_MAX}, 0x336699, 1, 0x9900, 0x6600, 0x3300},
                 {{0, 0, 90, 4}, 0x0040FF, 0.5F, 0xFFFF, 0x8000, 0},
                 {{0, 0, 90, 4}, 0x0040FF, 0, 0xFFFF, 0xFFFF, 0},
                 {{0, 0, 90, 4}, 0x0040FF, -0.0F, 0, 0, 0},
                 {{0, 0, 90, 4}, 0x0040FF, -2, 0, 0, 0},
                 {{0, 0, 90, 4}, 0x0040FF, NAN, 0, 0, 0},
                 {{0, 0, 90, 4}, 0x0040FF, INFINITY, 0, 0, 0},
                 {{0, 0, 90, 4}, 0x0040FF, 3, 0x5500, 0x1555, 0}};
    for (const auto& f : facts) {
        for (const std::uint32_t mode : {0U, 1U, 2U}) {
            SCOPED_TRACE(testing::Message()
                         << f.r.left << ' ' << f.r.right << " by " << f.darkening << ", mode " << mode);
            Picture expected(90, 70, 32, 0x0A0B0C);
            Canvas canvas(expected);
            _gradientfill(canvas, f.r.left, f.r.top, f.r.right, f.r.bottom, -3, 0xFFFFFF, f.colour,
                          f.darkening, mode);
            const auto start = [&](int shift) { return static_cast<WORD>((f.colour >> shift & 0xFF) << 8); };
            if (mode < 2) {
                gradient(expected, {f.r.left, f.r.top, start(0), start(8), start(16), 0},
                         {f.r.right, f.r.bottom, f.red, f.green, f.blue, 0}, mode == 0);
            }
            EXPECT_EQ(canvas.picture(), expected);
        }
    }
}

// The corners of a huge one were once drawn in full, seen or not, which took minutes.
TEST(GradientFill, rounds_corners_in_their_own_place) {
    const StoredOsCode nt(5);
    const struct {
        RECT r;
        int diameter;
        COLORREF corner;
    } facts[] = {{{0, 0, 60, 40}, 24, 0xFFFFFF},      {{17, 23, 78, 60}, 25, 0xFFFFFF},
                 {{3, 4, 43, 44}, INT_MAX, 0xFFFFFF}, {{-39000, -20, 70, 39000}, 40000, 0xFFFFFF},
                 {{12, -39900, 40000, 60}, 40000, 0}, {{50, 40, 20, 10}, 9, 0xFFFFFF},
                 {{17, 23, 78, 60}, 25, 0x808080},    {{0, 0, 20, 20}, 8, 0x818181}};
    for (const int depth : DEPTHS) {
        for (const auto& f : facts) {
            Picture expected(90, 70, depth);
            Canvas canvas(expected);
            HGDIOBJ const before = SelectObject(canvas, GetStockObject(GRAY_BRUSH));
            _gradientfill(canvas, f.r.left, f.r.top, f.r.right, f.r.bottom, f.diameter, f.corner, 0xFF00FF, 1,
                          0);
            EXPECT_EQ(SelectObject(canvas, before), GetStockObject(GRAY_BRUSH));
            const bool is_rounded =
                f.r.left < f.r.right && value_of(depth, f.corner) != value_of(depth, 0x808080);
            on(expected, ordered(f.r), [&](int x, int y, std::uint32_t& value) {
                const bool is_in = !is_rounded || is_in_rounded(f.r, f.diameter, f.diameter, x, y);
                value = depth == 16 && is_in ? 0x7C1F : value_of(depth, is_in ? 0xFF00FF : f.corner);
            });
            EXPECT_EQ(canvas.picture(), expected) << depth << " bits, " << f.r.left << ' ' << f.diameter;
        }
    }
}

TEST(TransparentCopy, by_masks_takes_the_sources_size) {
    std::mt19937 random(71);
    SCOPED_TRACE("seed 71");
    const auto below = [&](unsigned limit) { return static_cast<int>(random() % limit); };
    constexpr std::uint32_t INKS[] = {0x4080C0, 0, 0xFFFFFF, 0x563412, 0x4180C0, 0x4080C0};
    const auto ink = [&] { return INKS[below(6)]; };
    for (int i = 0; i < 120; ++i) {
        const StoredOsCode os(2 + i % 3);
        const Picture before = random_picture(40, 30, i % 2 == 0 ? 24 : 32, ink);
        const Picture source = random_picture(32, 24, 32, ink);
        Canvas to(before), from(source);
        const Stretch s = {below(65) - 20, below(55) - 20, 1 + below(16), 1 + below(12),
                           below(16),      below(12),      1 + below(16), 1 + below(12)};
        const Stretch same = {s.x,        s.y,        s.source_width, s.source_height,
                              s.source_x, s.source_y, s.source_width, s.source_height};
        EXPECT_EQ(copy_transparent(to, from, s), 0) << "always, on this family";
        EXPECT_EQ(to.picture(), keyed(before, same, source, KEY)) << i;
        EXPECT_EQ(from.picture(), source);
    }
}

TEST(TransparentCopy, draws_nothing_where_it_cannot) {
    constexpr Stretch ALL = {0, 0, 4, 4, 0, 0, 4, 4};
    constexpr XFORM QUARTER = {0, 1, -1, 0, 0, 0};
    const Picture before(4, 4, 32, 0x112233);
    Canvas to(before), turned(Picture(4, 4, 32, 0x445566));
    SetGraphicsMode(turned, GM_ADVANCED);
    SetWorldTransform(turned, &QUARTER);
    for (const int code : {0, 1, 2, 5, 11}) {
        const StoredOsCode os(code);
        _gradientfill(code < 5 ? HDC(to) : nullptr, 0, 0, 4, 4, 2, 0xFFFFFF, 0x123456, 2, 0);
        EXPECT_EQ(copy_transparent(nullptr, to, ALL) + copy_transparent(to, nullptr, ALL) +
                      copy_transparent(to, turned, ALL),
                  0);
        EXPECT_EQ(code == 2 ? copy_transparent(turned, to, ALL) : 0, 0);
        for (const int size : {0, -3, INT_MIN}) {
            EXPECT_EQ(code < 2 ? 0 : copy_transparent(to, to, {1, 1, size, size, 0, 0, size, size}),
                      code >= 5 && size == 0);
        }
        EXPECT_EQ(to.picture(), before) << code;
    }
    EXPECT_EQ(turned.picture(), Picture(4, 4, 32, 0x445566));
}

TEST(TransparentCopy, by_masks_has_its_own_ground) {
    const StoredOsCode os(2);
    Picture expected(6, 1, 32, 0x112233);
    Canvas to(expected), from(Picture(2, 1, 32, 0x445566));
    copy_transparent(to, from, {1, 0, 0, 0, -1, 0, 4, 1});
    expected.pixels = {0x112233, 0, 0x445566, 0x445566, 0, 0x112233};
    EXPECT_EQ(to.picture(), expected) << "black outside the source";
    Picture halves(4, 1, 1), stripes(4, 1, 1);
    halves.pixels = {1, 1, 0, 0};
    stripes.pixels = {1, 0, 1, 0};
    Canvas white_black(halves), striped(stripes);
    copy_transparent(white_black, striped, {0, 0, 4, 1, 0, 0, 4, 1});
    EXPECT_EQ(white_black.picture().pixels, (std::vector<std::uint32_t>{1, 0, 0, 0}))
        << "of one bit: white in both";
    // Scaled by its context, the source's size counts in the context's own units.
    Canvas ground(Picture(4, 4, 32)), scaled(Picture(4, 4, 32, 5));
    constexpr XFORM TWICE = {2, 0, 0, 2, 0, 0};
    SetGraphicsMode(scaled, GM_ADVANCED);
    SetWorldTransform(scaled, &TWICE);
    copy_transparent(ground, scaled, {0, 0, 4, 4, 0, 0, 4, 4});
    Picture quarter(4, 4, 32);
    on(quarter, {0, 0, 2, 2}, [](int, int, std::uint32_t& value) { value = 5; });
    EXPECT_EQ(ground.picture(), quarter);
}

}  // namespace
