// Pixels, filled and rounded rectangles, gradients.
#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <cstdlib>

#include "tests/support/drawing.h"

namespace {

using drawing::Canvas;
using drawing::Picture;

TEST(Pixel, TakesTheNearestColourOfItsDepth) {
    const struct {
        int depth;
        COLORREF drawn;
        std::uint32_t stored;
        COLORREF colour;
    } facts[] = {
        {32, 0xFF332211, 0x112233, 0x332211}, {24, 0x332211, 0x112233, 0x332211},
        {16, 0x000004, 0, 0x000000},          {16, 0x000005, 1 << 10, 0x000008},
        {16, 0x808080, 0x4210, 0x848484},     {8, 0xFFFFFF, 255, 0xFFFFFF},
        {8, 0x000000, 0, 0x000000},           {8, 0x0000FE, 249, 0x0000FF},
        {8, 0x336699, 127, 0x336699},         {4, 0x0000F0, 9, 0x0000FF},
        {4, 0x909090, 8, 0x808080},           {1, 0x7F7F7F, 0, 0x000000},
        {1, 0x808080, 1, 0xFFFFFF},           {16, 0xFFFFFF, 0x7FFF, 0xFFFFFF},
    };
    for (const auto& fact : facts) {
        SCOPED_TRACE(testing::Message() << fact.depth << " bits, " << std::hex << fact.drawn);
        const Canvas canvas(19, 2, fact.depth);
        for (const int x : {0, 7, 8, 18}) {
            EXPECT_EQ(SetPixel(canvas, x, 1, fact.drawn), fact.colour);
            EXPECT_EQ(GetPixel(canvas, x, 1), fact.colour);
            EXPECT_EQ(canvas.picture().at(x, 1), fact.stored);
        }
        const Picture picture = canvas.picture();
        EXPECT_EQ(std::count(picture.pixels.begin(), picture.pixels.end(), 0U), fact.stored == 0 ? 38 : 34);
    }
    const Canvas five_bits(1, 1, 16);
    for (int level = 0; level < 256; ++level) {
        SetPixel(five_bits, 0, 0, RGB(level, 0, 255 - level));
        const auto nearest = [](int value) { return static_cast<std::uint32_t>(value * 31 / 255.0 + 0.5); };
        EXPECT_EQ(five_bits.picture().at(0, 0), nearest(level) << 10 | nearest(255 - level)) << level;
    }
    // Four bits: red 1, green 2, blue 4, at half and at full strength; two greys between.
    for (std::uint32_t value = 0; value < 16; ++value) {
        const COLORREF level = value < 8 ? 0x80 : 0xFF;
        const COLORREF expected = value == 7   ? 0xC0C0C0
                                  : value == 8 ? 0x808080
                                               : (value & 1) * level | (value >> 1 & 1) * level << 8 |
                                                     (value >> 2 & 1) * level << 16;
        EXPECT_EQ(GetPixel(Canvas(Picture(1, 1, value), 4), 0, 0), expected) << value;
    }
    const Canvas canvas(Picture(1, 1, 0xAB332211), 32);
    EXPECT_EQ(GetPixel(canvas, 0, 0), 0x112233U) << "the unused byte is not told";
    EXPECT_EQ(canvas.picture().at(0, 0), 0xAB332211U) << "but kept";
}

TEST(FilledRectangle, EndsBeforeItsLastSidesAndAtTheSurface) {
    const RECT rectangles[] = {
        {2, 1, 13, 4},
        {0, 0, 1, 1},
        {-5, -5, 9, 3},
        {5, 2, 99, 99},
        {3, 3, 3, 5},
        {9, 3, 2, 5},
        {INT_MIN, INT_MIN, INT_MAX, INT_MAX},
        {INT_MAX, 0, INT_MIN, 3},
        {-9, -9, -1, -1},
        {16, 0, 20, 6},
        {7, 0, 16, 6},
    };
    for (const int depth : drawing::DEPTHS) {
        for (const RECT& r : rectangles) {
            const Canvas canvas(17, 6, depth);
            EXPECT_NE(FillRect(canvas, &r, static_cast<HBRUSH>(GetStockObject(WHITE_BRUSH))), 0);
            Picture expected(17, 6);
            drawing::fill(expected, r, drawing::white(depth));
            EXPECT_EQ(canvas.picture(), expected) << depth << " bits, " << r.left << ' ' << r.top;
        }
    }
    const Canvas canvas(2, 2, 32);
    const RECT all = {0, 0, 2, 2};
    EXPECT_NE(FillRect(canvas, &all, static_cast<HBRUSH>(GetStockObject(NULL_BRUSH))), 0);
    EXPECT_EQ(canvas.picture(), Picture(2, 2));
    EXPECT_EQ(FillRect(canvas, nullptr, static_cast<HBRUSH>(GetStockObject(WHITE_BRUSH))), 0);
    int stock = WHITE_BRUSH;
    for (const COLORREF grey : {0xFFFFFFU, 0xC0C0C0U, 0x808080U, 0x404040U, 0U}) {
        EXPECT_NE(FillRect(canvas, &all, static_cast<HBRUSH>(GetStockObject(stock++))), 0);
        EXPECT_EQ(GetPixel(canvas, 1, 1), grey);
    }
}

TEST(RoundedRectangle, HoldsThePixelsWhoseMiddlesLieInside) {
    const struct {
        RECT rectangle;
        int width, height;
    } shapes[] = {{{0, 0, 60, 40}, 24, 24}, {{3, 5, 40, 42}, 17, 9},    {{10, 10, 34, 34}, 24, 24},
                  {{2, 2, 30, 21}, 99, 99}, {{-8, -6, 70, 50}, 31, 40}, {{1, 1, 9, 9}, 1, 1},
                  {{4, 4, 20, 20}, 0, 8},   {{4, 4, 20, 20}, -12, -7},  {{5, 5, 6, 30}, 5, 5},
                  {{30, 20, 10, 5}, 6, 6},  {{7, 7, 7, 20}, 4, 4}};
    for (const auto& shape : shapes) {
        const RECT& given = shape.rectangle;
        const RECT r = drawing::ordered(given);
        HBRUSH const red = CreateSolidBrush(0x0000FF);
        HPEN const blue = CreatePen(PS_SOLID, 1, 0xFF0000);
        for (const bool outlined : {false, true}) {
            const Canvas canvas(64, 48, 32);
            HGDIOBJ const brush = SelectObject(canvas, red);
            HGDIOBJ const pen = SelectObject(canvas, outlined ? blue : GetStockObject(NULL_PEN));
            EXPECT_NE(RoundRect(canvas, given.left, given.top, given.right, given.bottom, shape.width,
                                shape.height),
                      0);
            SelectObject(canvas, brush);
            SelectObject(canvas, pen);
            const auto inside = [&](int x, int y) {
                return drawing::is_in_rounded(r, std::abs(shape.width), std::abs(shape.height), x, y);
            };
            Picture expected(64, 48);
            for (int y = 0; y < 48; ++y) {
                for (int x = 0; x < 64; ++x) {
                    if (inside(x, y)) {
                        const bool is_border =
                            !inside(x - 1, y) || !inside(x + 1, y) || !inside(x, y - 1) || !inside(x, y + 1);
                        expected.at(x, y) = outlined && is_border ? 0x0000FF : 0xFF0000;
                    }
                }
            }
            EXPECT_EQ(canvas.picture(), expected) << r.left << ' ' << r.top << ' ' << shape.width << 'x'
                                                  << shape.height << (outlined ? " outlined" : "");
        }
        EXPECT_NE(DeleteObject(red), 0);
        EXPECT_NE(DeleteObject(blue), 0);
    }
    // Beyond what any surface holds: the middle of an ellipse of 2^32 pixels fills the surface.
    const Canvas canvas(3, 3, 1);
    EXPECT_NE(RoundRect(canvas, INT_MIN, INT_MIN, INT_MAX, INT_MAX, INT_MIN, INT_MAX), 0);
    EXPECT_EQ(canvas.picture(), Picture(3, 3, 1));
}

TEST(Gradient, FollowsItsFormulaInBothDirectionsAndIsCutByTheSurface) {
    const TRIVERTEX ends[][2] = {
        {{0, 0, 0xFF00, 0, 0x1234, 0}, {40, 30, 0, 0xFF00, 0xFFFF, 0}},
        {{3, 2, 0x8000, 0x100, 0xFF00, 0xFFFF}, {17, 19, 0xFF00, 0xFF, 0, 0}},
        {{30, 20, 0xFF00, 0, 0, 0}, {4, 5, 0, 0, 0xFF00, 0}},  // from right to left, from bottom to top
        {{4, 20, 0xFF00, 0, 0, 0}, {30, 5, 0, 0, 0xFF00, 0}},
        {{-100, -50, 0, 0, 0, 0}, {300, 500, 0xFF00, 0x8000, 0xFFFF, 0}},
        {{INT_MIN, INT_MIN, 0, 0xFF00, 0x7FFF, 0}, {INT_MAX, INT_MAX, 0xFF00, 0, 0x8000, 0}},
        {{5, 5, 0xFF00, 0, 0, 0}, {6, 6, 0, 0, 0, 0}},
        {{5, 5, 0xFF00, 0, 0, 0}, {5, 9, 0, 0, 0, 0}},
        {{5, 5, 0xFF00, 0, 0, 0}, {9, 5, 0, 0, 0, 0}},
        {{50, 5, 0xFF00, 0, 0, 0}, {90, 50, 0, 0, 0, 0}},
    };
    for (const auto& [a, b] : ends) {
        for (const DWORD mode : {GRADIENT_FILL_RECT_H, GRADIENT_FILL_RECT_V}) {
            for (const int depth : drawing::DEPTHS) {
                const Canvas canvas(40, 30, depth);
                const TRIVERTEX corners[3] = {{}, b, a};
                const GRADIENT_RECT mesh = {2, 1};
                EXPECT_NE(GradientFill(canvas, corners, 3, &mesh, 1, mode), 0);
                const RECT box = drawing::ordered({a.x, a.y, b.x, b.y});
                const Canvas expected(40, 30, depth);
                for (int y = std::max(box.top, 0); y < std::min(box.bottom, 30); ++y) {
                    for (int x = std::max(box.left, 0); x < std::min(box.right, 40); ++x) {
                        const auto level = [&, &a = a, &b = b](WORD first, WORD last) {
                            const int eight = mode == GRADIENT_FILL_RECT_H
                                                  ? drawing::gradient_level(first, last, a.x, b.x, x)
                                                  : drawing::gradient_level(first, last, a.y, b.y, y);
                            return depth == 16 ? eight >> 3 << 3 | eight >> 5
                                               : eight;  // cut, not the nearest
                        };
                        SetPixel(expected, x, y,
                                 RGB(level(a.Red, b.Red), level(a.Green, b.Green), level(a.Blue, b.Blue)));
                    }
                }
                EXPECT_EQ(canvas.picture(), expected.picture())
                    << depth << " bits, mode " << mode << ", from " << a.x;
            }
        }
    }
}

TEST(Gradient, RefusesWhatDoesNotHoldTogether) {
    const Canvas canvas(4, 4, 32);
    const TRIVERTEX corners[2] = {{0, 0, 0xFF00, 0, 0, 0}, {4, 4, 0xFF00, 0, 0, 0}};
    const GRADIENT_RECT meshes[2] = {{0, 1}, {0, 2}};
    EXPECT_EQ(GradientFill(canvas, corners, 2, meshes, 2, 0), 0);
    EXPECT_EQ(GradientFill(canvas, corners, 2, meshes, 1, 2), 0);
    EXPECT_EQ(GradientFill(canvas, nullptr, 2, meshes, 1, 0), 0);
    EXPECT_EQ(GradientFill(canvas, corners, 2, nullptr, 1, 0), 0);
    EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);
    EXPECT_EQ(canvas.picture(), Picture(4, 4)) << "not even the first rectangle";
    EXPECT_NE(GradientFill(canvas, corners, 2, meshes, 0, 0), 0);
}

}  // namespace
