// fuzz/graphics compares gradients, rounded corners and keyed copies with the picture model.
#include "basalt/graphics/drawing_functions.h"

#include <gtest/gtest.h>

#include <climits>
#include <cmath>
#include <random>
#include <tuple>
#include <vector>

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
    const std::tuple<float, WORD, WORD, WORD> facts[] = {// divided by; the end's red, green, blue
                                                         {1, 0xFF00, 0x4000, 0x1000},
                                                         {4, 0x3FC0, 0x1000, 0x0400},
                                                         {3, 0x5500, 0x1555, 0x0555},
                                                         {0.5F, 0xFFFF, 0x8000, 0x2000},
                                                         {0, 0xFFFF, 0xFFFF, 0xFFFF},
                                                         {-0.0F, 0, 0, 0},
                                                         {-2, 0, 0, 0},
                                                         {NAN, 0, 0, 0},
                                                         {INFINITY, 0, 0, 0}};
    for (const auto& [darkening, red, green, blue] : facts) {
        for (const RECT& r :
             {RECT{-4, 2, 90, 61}, RECT{75, 61, 5, 3}, RECT{INT_MIN, INT_MIN, INT_MAX, INT_MAX}}) {
            for (const std::uint32_t mode : {0U, 1U, 2U}) {
                Picture expected(90, 70, 32, 0x0A0B0C);
                Canvas canvas(expected);
                _gradientfill(canvas, r.left, r.top, r.right, r.bottom, -3, 0xFFFFFF, 0x1040FF, darkening,
                              mode);
                const TRIVERTEX start = {r.left, r.top, 0xFF00, 0x4000, 0x1000, 0};
                if (mode < 2) {
                    gradient(expected, start, {r.right, r.bottom, red, green, blue, 0}, mode == 0);
                }
                EXPECT_EQ(canvas.picture(), expected) << r.left << " by " << darkening << ", mode " << mode;
            }
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
        Stretch same = s;
        same.width = s.source_width, same.height = s.source_height;
        EXPECT_EQ(copy_transparent(to, from, s), 0) << "always, on this family";
        EXPECT_EQ(to.picture(), keyed(before, same, source, KEY)) << i;
        EXPECT_EQ(from.picture(), source);
    }
}

TEST(TransparentCopy, draws_nothing_where_it_cannot) {
    constexpr Stretch ALL = {0, 0, 4, 4, 0, 0, 4, 4};
    constexpr XFORM QUARTER = {0, 1, -1, 0, 0, 0};
    const Picture before(4, 4, 32, 0x112233), unlike(4, 4, 32, 0x445566);
    Canvas to(before), turned(unlike);
    SetGraphicsMode(turned, GM_ADVANCED);
    SetWorldTransform(turned, &QUARTER);
    for (const int code : {0, 1, 2, 5, 11}) {
        const StoredOsCode os(code);
        _gradientfill(code < 5 ? HDC(to) : nullptr, 0, 0, 4, 4, 2, 0xFFFFFF, 0x123456, 2, 0);
        EXPECT_TRUE(refused(copy_transparent(nullptr, to, ALL), copy_transparent(to, nullptr, ALL),
                            copy_transparent(to, turned, ALL),
                            code == 2 ? copy_transparent(turned, to, ALL) : 0));
        for (const int size : {0, -3, INT_MIN}) {
            EXPECT_EQ(code < 2 ? 0 : copy_transparent(to, to, {1, 1, size, size, 0, 0, size, size}),
                      code >= 5 && size == 0);
        }
        EXPECT_EQ(to.picture(), before) << code;
    }
    EXPECT_EQ(turned.picture(), unlike);
}

TEST(TransparentCopy, by_masks_has_its_own_ground) {
    using Values = std::vector<std::uint32_t>;
    const StoredOsCode os(2);
    Canvas to(Picture(6, 1, 32, 0x112233)), from(Picture(2, 1, 32, 0x445566));
    copy_transparent(to, from, {1, 0, 0, 0, -1, 0, 4, 1});
    EXPECT_EQ(to.picture().pixels, (Values{0x112233, 0, 0x445566, 0x445566, 0, 0x112233}))
        << "black outside the source";
    Picture halves(4, 1, 1), stripes(4, 1, 1);
    halves.pixels = {1, 1, 0, 0};
    stripes.pixels = {1, 0, 1, 0};
    Canvas white_black(halves), striped(stripes);
    copy_transparent(white_black, striped, {0, 0, 4, 1, 0, 0, 4, 1});
    EXPECT_EQ(white_black.picture().pixels, (Values{1, 0, 0, 0})) << "of one bit: white in both";
    // Scaled by its context, the source's size counts in the context's own units.
    Canvas ground(Picture(4, 2, 32)), scaled(Picture(4, 4, 32, 5));
    constexpr XFORM TWICE = {2, 0, 0, 2, 0, 0};
    SetGraphicsMode(scaled, GM_ADVANCED);
    SetWorldTransform(scaled, &TWICE);
    copy_transparent(ground, scaled, {0, 0, 4, 2, 0, 0, 4, 2});
    EXPECT_EQ(ground.picture().pixels, (Values{5, 5, 0, 0, 0, 0, 0, 0}));
}

}  // namespace
