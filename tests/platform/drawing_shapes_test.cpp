// Pixels, filled and rounded rectangles, gradients.
#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <cstdlib>

#include "tests/platform/drawing_support.h"

namespace {

using drawing::Canvas;
using drawing::Picture;

class SolidBrush {
public:
    explicit SolidBrush(COLORREF colour) : m_brush(CreateSolidBrush(colour)) {}
    ~SolidBrush() { EXPECT_NE(DeleteObject(m_brush), 0); }
    SolidBrush(const SolidBrush&) = delete;
    SolidBrush& operator=(const SolidBrush&) = delete;
    operator HBRUSH() const { return m_brush; }

private:
    HBRUSH m_brush;
};

TEST(Pixel, TakesTheNearestColourOfItsDepth) {
    const struct {
        int depth;
        COLORREF drawn;
        std::uint32_t stored;
        COLORREF colour;
    } facts[] = {
        {32, 0xFF332211, 0x112233, 0x332211}, {24, 0x332211, 0x112233, 0x332211},
        {16, 0x000004, 0, 0x000000},          {16, 0x000005, 1 << 10, 0x000008},
        {16, 0x808080, 0x4210, 0x848484},     {16, 0xFFFFFF, 0x7FFF, 0xFFFFFF},
        {16, 0xFF0000, 0x001F, 0xFF0000},     {8, 0xFFFFFF, 255, 0xFFFFFF},
        {8, 0x000000, 0, 0x000000},           {8, 0x0000FE, 249, 0x0000FF},
        {8, 0x336699, 0, 0x336699},           {4, 0x0000F0, 9, 0x0000FF},
        {4, 0x909090, 8, 0x808080},           {1, 0x7F7F7F, 0, 0x000000},
        {1, 0x808080, 1, 0xFFFFFF},
    };
    for (const auto& fact : facts) {
        SCOPED_TRACE(testing::Message() << fact.depth << " bits, " << std::hex << fact.drawn);
        const Canvas canvas(19, 2, fact.depth);
        for (const int x : {0, 7, 8, 18}) {
            EXPECT_EQ(SetPixel(canvas, x, 1, fact.drawn), fact.colour);
            EXPECT_EQ(GetPixel(canvas, x, 1), fact.colour);
            if (fact.drawn != 0x336699) {
                EXPECT_EQ(canvas.picture().at(x, 1), fact.stored);
            }
        }
        const Picture picture = canvas.picture();
        EXPECT_EQ(std::count(picture.values.begin(), picture.values.end(), 0U),
                  fact.stored == 0 && fact.drawn != 0x336699 ? 38 : 34);
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
    const RECT rectangles[] = {{2, 1, 13, 4},
                               {0, 0, 1, 1},
                               {-5, -5, 9, 3},
                               {5, 2, 99, 99},
                               {3, 3, 3, 5},
                               {9, 3, 2, 5},
                               {INT_MIN, INT_MIN, INT_MAX, INT_MAX},
                               {INT_MAX, 0, INT_MIN, 3},
                               {-9, -9, -1, -1},
                               {16, 0, 20, 6},
                               {7, 0, 16, 6}};
    for (const int depth : drawing::DEPTHS) {
        for (const RECT& r : rectangles) {
            const Canvas canvas(17, 6, depth);
            const SolidBrush white(0xFFFFFF);
            EXPECT_NE(FillRect(canvas, &r, white), 0);
            Picture expected(17, 6);
            for (int y = 0; y < 6; ++y) {
                for (int x = 0; x < 17; ++x) {
                    if (x >= r.left && x < r.right && y >= r.top && y < r.bottom) {
                        expected.at(x, y) = depth == 32   ? 0xFFFFFF
                                            : depth == 16 ? 0x7FFF
                                                          : drawing::all_ones(depth);
                    }
                }
            }
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

/// A rounded rectangle's pixel, by where its middle lies.
bool is_in_rounded(const RECT& r, double ew, double eh, int x, int y) {
    const double a = std::min<double>(ew, r.right - r.left) / 2;
    const double b = std::min<double>(eh, r.bottom - r.top) / 2;
    const double px = x + 0.5;
    const double py = y + 0.5;
    if (px < r.left || px > r.right || py < r.top || py > r.bottom) {
        return false;
    }
    const double dx = std::max({r.left + a - px, px - (r.right - a), 0.0});
    const double dy = std::max({r.top + b - py, py - (r.bottom - b), 0.0});
    return dx == 0 || dy == 0 || dx * dx / (a * a) + dy * dy / (b * b) < 1;
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
        RECT r = shape.rectangle;
        const int width = std::abs(shape.width);
        const int height = std::abs(shape.height);
        SCOPED_TRACE(testing::Message() << r.left << ' ' << r.top << ' ' << width << 'x' << height);
        const Canvas filled(64, 48, 32);
        const Canvas outlined(64, 48, 32);
        const SolidBrush red(0x0000FF);
        HPEN const blue = CreatePen(PS_SOLID, 1, 0xFF0000);
        for (HDC const dc : {HDC(filled), HDC(outlined)}) {
            HGDIOBJ const brush = SelectObject(dc, red);
            HGDIOBJ const pen = SelectObject(dc, dc == HDC(filled) ? GetStockObject(NULL_PEN) : blue);
            EXPECT_NE(RoundRect(dc, r.left, r.top, r.right, r.bottom, shape.width, shape.height), 0);
            SelectObject(dc, brush);
            SelectObject(dc, pen);
        }
        EXPECT_NE(DeleteObject(blue), 0);
        if (r.left > r.right) {
            std::swap(r.left, r.right);
            std::swap(r.top, r.bottom);
        }
        const auto inside = [&](int x, int y) { return is_in_rounded(r, width, height, x, y); };
        Picture expected(64, 48);
        Picture bordered(64, 48);
        for (int y = 0; y < 48; ++y) {
            for (int x = 0; x < 64; ++x) {
                if (inside(x, y)) {
                    expected.at(x, y) = 0xFF0000;
                    const bool is_border =
                        !inside(x - 1, y) || !inside(x + 1, y) || !inside(x, y - 1) || !inside(x, y + 1);
                    bordered.at(x, y) = is_border ? 0x0000FF : 0xFF0000;
                }
            }
        }
        EXPECT_EQ(filled.picture(), expected);
        EXPECT_EQ(outlined.picture(), bordered);
    }
    // Beyond what any surface holds: the middle of an ellipse of 2^32 pixels fills the surface.
    const Canvas canvas(3, 3, 1);
    EXPECT_NE(RoundRect(canvas, INT_MIN, INT_MIN, INT_MAX, INT_MAX, INT_MIN, INT_MAX), 0);
    EXPECT_EQ(canvas.picture(), Picture(3, 3, 1));
}

struct GradientFacts {
    TRIVERTEX first;
    TRIVERTEX second;
    DWORD mode;
};

/// The colour along the gradient, as its formula stands.
std::uint32_t level(WORD c1, WORD c2, std::int64_t p, std::int64_t begin, std::int64_t end) {
    return static_cast<std::uint32_t>((c2 * (p - begin) + c1 * (end - p)) / (end - begin)) >> 8;
}

void expect_gradient(int depth, const GradientFacts& facts) {
    const Canvas canvas(Picture(40, 30), depth);
    const TRIVERTEX corners[3] = {{}, facts.second, facts.first};
    const GRADIENT_RECT mesh = {2, 1};
    EXPECT_NE(GradientFill(canvas, corners, 3, &mesh, 1, facts.mode), 0);
    TRIVERTEX a = facts.first;
    TRIVERTEX b = facts.second;
    const bool across = facts.mode == GRADIENT_FILL_RECT_H;
    if (across ? a.x > b.x : a.y > b.y) {
        std::swap(a, b);
    }
    Picture expected(40, 30);
    for (int y = 0; y < 30; ++y) {
        for (int x = 0; x < 40; ++x) {
            if (x < std::min(a.x, b.x) || x >= std::max(a.x, b.x) || y < std::min(a.y, b.y) ||
                y >= std::max(a.y, b.y)) {
                continue;
            }
            const std::int64_t p = across ? x : y;
            const std::int64_t begin = across ? a.x : a.y;
            const std::int64_t end = across ? b.x : b.y;
            const std::uint32_t red = level(a.Red, b.Red, p, begin, end);
            const std::uint32_t green = level(a.Green, b.Green, p, begin, end);
            const std::uint32_t blue = level(a.Blue, b.Blue, p, begin, end);
            expected.at(x, y) =
                depth == 16 ? red >> 3 << 10 | green >> 3 << 5 | blue >> 3 : red << 16 | green << 8 | blue;
        }
    }
    EXPECT_EQ(canvas.picture(), expected) << depth << " bits, mode " << facts.mode;
}

TEST(Gradient, FollowsItsFormulaInBothDirectionsAndIsCutByTheSurface) {
    const GradientFacts facts[] = {
        {{0, 0, 0xFF00, 0, 0x1234, 0}, {40, 30, 0, 0xFF00, 0xFFFF, 0}, 0},
        {{3, 2, 0x8000, 0x100, 0xFF00, 0xFFFF}, {17, 19, 0xFF00, 0xFF, 0, 0}, 1},
        {{30, 20, 0xFF00, 0, 0, 0}, {4, 5, 0, 0, 0xFF00, 0}, 0},  // from right to left
        {{4, 20, 0xFF00, 0, 0, 0}, {30, 5, 0, 0, 0xFF00, 0}, 1},  // from bottom to top
        {{-100, -50, 0, 0, 0, 0}, {300, 500, 0xFF00, 0x8000, 0xFFFF, 0}, 0},
        {{-100, -50, 0, 0, 0, 0}, {300, 500, 0xFF00, 0x8000, 0xFFFF, 0}, 1},
        {{INT_MIN, INT_MIN, 0, 0xFF00, 0x7FFF, 0}, {INT_MAX, INT_MAX, 0xFF00, 0, 0x8000, 0}, 0},
        {{INT_MIN, INT_MIN, 0, 0xFF00, 0x7FFF, 0}, {INT_MAX, INT_MAX, 0xFF00, 0, 0x8000, 0}, 1},
        {{5, 5, 0xFF00, 0, 0, 0}, {6, 6, 0, 0, 0, 0}, 0},
        {{5, 5, 0xFF00, 0, 0, 0}, {5, 9, 0, 0, 0, 0}, 0},
        {{5, 5, 0xFF00, 0, 0, 0}, {9, 5, 0, 0, 0, 0}, 0},
        {{50, 5, 0xFF00, 0, 0, 0}, {90, 50, 0, 0, 0, 0}, 0},
    };
    for (const GradientFacts& fact : facts) {
        for (const int depth : {16, 24, 32}) {
            expect_gradient(depth, fact);
        }
    }
}

TEST(Gradient, TakesTheNearestColourOfATable) {
    for (const int depth : {1, 4, 8}) {
        const Canvas canvas(Picture(40, 3), depth);
        const TRIVERTEX corners[2] = {{1, 0, 0, 0, 0, 0}, {39, 3, 0xFF00, 0xFF00, 0xFF00, 0}};
        const GRADIENT_RECT mesh = {0, 1};
        EXPECT_NE(GradientFill(canvas, corners, 2, &mesh, 1, 0), 0);
        for (int x = 1; x < 39; ++x) {
            const Canvas pixel(1, 1, depth);
            const auto grey = static_cast<int>(level(0, 0xFF00, x, 1, 39));
            const COLORREF nearest = SetPixel(pixel, 0, 0, RGB(grey, grey, grey));
            EXPECT_EQ(GetPixel(canvas, x, 0), nearest) << depth << ' ' << x;
            EXPECT_EQ(GetPixel(canvas, x, 2), nearest) << depth << ' ' << x;
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
