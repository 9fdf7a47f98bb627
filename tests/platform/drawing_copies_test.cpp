// Copies: raster operations, changes of depth, overlap, one colour left out, stretched and through
// transforms.
#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <cmath>
#include <numbers>

#include "src/platform/row_kernels.h"
#include "tests/platform/drawing_support.h"

namespace {

using drawing::all_ones;
using drawing::Canvas;
using drawing::Picture;

constexpr COLORREF TEXT = 0x0000FF;
constexpr COLORREF BACKGROUND = 0x00FF00;

/// What a source value arrives as, by the rules for monochrome; other depths meet their equals only.
std::uint32_t arriving(std::uint32_t value, int from, int to) {
    if (from == to) {
        return value;
    }
    const auto stored = [](COLORREF colour, int depth) {
        const Canvas canvas(1, 1, depth);
        SetPixel(canvas, 0, 0, colour);
        return canvas.picture().at(0, 0);
    };
    if (from == 1) {
        return stored(value != 0 ? BACKGROUND : TEXT, to);
    }
    const std::uint32_t telling = from == 32 ? 0xFFFFFF : from == 16 ? 0x7FFF : all_ones(from);
    return (value & telling) == stored(BACKGROUND, from) ? 1 : 0;
}

struct Block {
    int x, y, width, height, source_x, source_y;
};

constexpr Block BLOCKS[] = {
    {0, 0, 23, 9, 0, 0},
    {3, 2, 11, 5, 1, 4},
    {-4, -3, 15, 9, 2, 1},
    {5, 1, 30, 30, -3, -2},
    {20, 8, 9, 9, 22, 8},
    {4, 4, 0, 3, 0, 0},
    {4, 4, -3, -3, 0, 0},
    {-30, 0, 10, 5, 0, 0},
    {0, 0, 5, 5, 100, 0},
    {1, 0, 22, 9, 0, 0},
    {0, 1, 23, 8, 0, 0},
    {0, 0, 22, 9, 1, 0},
    {INT_MIN, INT_MIN, INT_MAX, INT_MAX, INT_MIN, INT_MIN},
    {INT_MAX, 0, INT_MAX, 9, INT_MIN, 0},
    {-1000, -1000, INT_MAX, INT_MAX, -1000, -1001},
};

/// Each bit by the operation's table.
std::uint32_t combined(DWORD rop, std::uint32_t brush, std::uint32_t source, std::uint32_t destination) {
    std::uint32_t result = 0;
    for (int bit = 0; bit < 32; ++bit) {
        const std::uint32_t number =
            (brush >> bit & 1) * 4 + (source >> bit & 1) * 2 + (destination >> bit & 1);
        result |= (rop >> (16 + number) & 1) << bit;
    }
    return result;
}

Picture expected_copy(const Picture& to, int to_depth, const Picture& from, int from_depth,
                      const Block& block, DWORD rop, std::uint32_t brush) {
    Picture result = to;
    for (int y = 0; y < to.height; ++y) {
        for (int x = 0; x < to.width; ++x) {
            const std::int64_t i = std::int64_t{x} - block.x;
            const std::int64_t j = std::int64_t{y} - block.y;
            const std::int64_t source_x = block.source_x + i;
            const std::int64_t source_y = block.source_y + j;
            if (i >= 0 && j >= 0 && i < block.width && j < block.height && from.has(source_x, source_y)) {
                const std::uint32_t source = arriving(from.at(source_x, source_y), from_depth, to_depth);
                result.at(x, y) = combined(rop, brush, source, to.at(x, y)) & all_ones(to_depth);
            }
        }
    }
    return result;
}

TEST(BlockCopy, CombinesStoredValuesAtEveryDepthAndPlace) {
    std::mt19937 random(11);
    SCOPED_TRACE("seed 11");
    const DWORD operations[] = {SRCCOPY, SRCAND, SRCPAINT, NOTSRCCOPY, SRCINVERT, 0x00B8074A};
    for (const int from_depth : drawing::DEPTHS) {
        for (const int to_depth : drawing::DEPTHS) {
            if (from_depth != to_depth && from_depth != 1 && to_depth != 1) {
                continue;
            }
            const Picture to = drawing::random_picture(23, 9, to_depth, random);
            Picture from = drawing::random_picture(24, 9, from_depth, random);
            const Canvas source(from, from_depth);
            for (const int x : {2, 7, 8}) {
                SetPixel(source, x, 3, BACKGROUND);
            }
            from = source.picture();
            SetBkColor(source, BACKGROUND);
            for (const Block& block : BLOCKS) {
                const DWORD rop = operations[random() % 6];
                SCOPED_TRACE(testing::Message() << from_depth << " to " << to_depth << " bits, at " << block.x
                                                << ' ' << block.y << ", operation " << std::hex << rop);
                const Canvas canvas(to, to_depth);
                SetTextColor(canvas, TEXT);
                SetBkColor(canvas, BACKGROUND);
                // A new context's brush is white; 32 bits store that with the high byte 0.
                const std::uint32_t white = to_depth == 16 ? 0x7FFF : all_ones(to_depth) & 0xFFFFFF;
                EXPECT_NE(BitBlt(canvas, block.x, block.y, block.width, block.height, source, block.source_x,
                                 block.source_y, rop),
                          0);
                EXPECT_EQ(canvas.picture(), expected_copy(to, to_depth, from, from_depth, block, rop, white));
            }
        }
    }
}

TEST(BlockCopy, BringsColoursToTheNearestOfAnotherDepth) {
    std::mt19937 random(12);
    SCOPED_TRACE("seed 12");
    for (const int from_depth : {4, 8, 16, 24, 32}) {
        for (const int to_depth : {4, 8, 16, 24, 32}) {
            const Picture from = drawing::random_picture(9, 4, from_depth, random);
            const Canvas source(from, from_depth);
            const Canvas canvas(9, 4, to_depth);
            const Canvas model(9, 4, to_depth);
            EXPECT_NE(BitBlt(canvas, 0, 0, 9, 4, source, 0, 0, SRCCOPY), 0);
            for (int i = 0; i < 36; ++i) {
                SetPixel(model, i % 9, i / 9, GetPixel(source, i % 9, i / 9));
                EXPECT_EQ(GetPixel(canvas, i % 9, i / 9), GetPixel(model, i % 9, i / 9))
                    << from_depth << " to " << to_depth;
            }
        }
    }
}

TEST(BlockCopy, OntoItsOwnSurfaceReadsBeforeItWrites) {
    std::mt19937 random(13);
    SCOPED_TRACE("seed 13");
    for (const int depth : drawing::DEPTHS) {
        const Picture before = drawing::random_picture(1500, 6, depth, random);
        for (const DWORD rop : {SRCCOPY, SRCINVERT}) {
            for (const Block& block :
                 {Block{1, 0, 1499, 6, 0, 0}, Block{0, 0, 1499, 6, 1, 0}, Block{3, 2, 1490, 4, 0, 0},
                  Block{0, 0, 1490, 4, 3, 2}, Block{0, 1, 1490, 4, 3, 0}, Block{600, 0, 900, 6, 0, 0}}) {
                const Canvas canvas(before, depth);
                EXPECT_NE(BitBlt(canvas, block.x, block.y, block.width, block.height, canvas, block.source_x,
                                 block.source_y, rop),
                          0);
                EXPECT_EQ(canvas.picture(), expected_copy(before, depth, before, depth, block, rop, 0))
                    << depth << " bits, from " << block.source_x << " to " << block.x;
            }
        }
    }
}

TEST(BlockCopy, WithoutASourceTakesBrushAndDestination) {
    const Canvas canvas(Picture(5, 1, 0x00F0F0F0), 32);
    HBRUSH const brush = CreateSolidBrush(0x332211);
    HGDIOBJ const replaced = SelectObject(canvas, brush);
    EXPECT_NE(BitBlt(canvas, 0, 0, 1, 1, nullptr, 0, 0, PATCOPY), 0);
    EXPECT_NE(BitBlt(canvas, 1, 0, 1, 1, nullptr, 0, 0, DSTINVERT), 0);
    EXPECT_NE(BitBlt(canvas, 2, 0, 1, 1, nullptr, 0, 0, BLACKNESS), 0);
    EXPECT_NE(BitBlt(canvas, 3, 0, 1, 9, nullptr, 0, 0, WHITENESS), 0);
    SelectObject(canvas, GetStockObject(NULL_BRUSH));
    EXPECT_NE(BitBlt(canvas, 4, 0, 1, 1, nullptr, 0, 0, PATCOPY), 0);
    SelectObject(canvas, replaced);
    EXPECT_NE(DeleteObject(brush), 0);
    EXPECT_EQ(canvas.picture().values,
              (std::vector<std::uint32_t>{0x112233, 0xFF0F0F0F, 0, 0xFFFFFFFF, 0x00F0F0F0}));
}

// A brush that draws nothing keeps back every operation that its values would decide, and no other.
TEST(BlockCopy, WithoutABrushMakesWhatNeedsNone) {
    constexpr std::uint32_t TO = 0x00CC5533;
    constexpr std::uint32_t FROM = 0x00AA330F;
    const Canvas source(Picture(1, 1, FROM), 32);
    for (DWORD number = 0; number < 256; ++number) {
        const Canvas canvas(Picture(1, 1, TO), 32);
        SelectObject(canvas, GetStockObject(NULL_BRUSH));
        const DWORD rop = number << 16;
        EXPECT_NE(BitBlt(canvas, 0, 0, 1, 1, source, 0, 0, rop), 0);
        const bool is_kept_back = (number >> 4) != (number & 0xF);
        EXPECT_EQ(canvas.picture().at(0, 0), is_kept_back ? TO : combined(rop, 0, FROM, TO)) << number;
    }
}

TEST(BlockCopy, WithoutASourceFillsTheTransformedBoxAlone) {
    const Canvas canvas(Picture(20, 6, 7), 32);
    const XFORM twice = {2, 0, 0, 2, 0, 0};
    SetGraphicsMode(canvas, GM_ADVANCED);
    SetWorldTransform(canvas, &twice);
    EXPECT_NE(BitBlt(canvas, 2, 1, 3, 1, nullptr, 0, 0, BLACKNESS), 0);
    const Picture picture = canvas.picture();
    for (int y = 0; y < picture.height; ++y) {
        for (int x = 0; x < picture.width; ++x) {
            EXPECT_EQ(picture.at(x, y), x >= 4 && x < 10 && (y == 2 || y == 3) ? 0U : 7U) << x << ' ' << y;
        }
    }
}

struct Stretch {
    int x, y, width, height, source_x, source_y, source_width, source_height;
};

TEST(TransparentCopy, LeavesOneColourOutAtEveryDepthAndSize) {
    const Stretch stretches[] = {{0, 0, 23, 9, 0, 0, 23, 9},
                                 {2, 1, 20, 7, 3, 2, 20, 7},
                                 {-5, -3, 23, 9, 0, 0, 23, 9},
                                 {9, 4, 23, 9, 0, 0, 23, 9},
                                 {0, 0, 11, 4, 0, 0, 23, 9},
                                 {-7, -2, 46, 18, 1, 1, 20, 8},
                                 {3, 3, 7, 5, -4, -2, 40, 30},
                                 {0, 0, 0, 5, 0, 0, 5, 5},
                                 {0, 0, 5, 5, 0, 0, 5, 0},
                                 {0, 0, INT_MAX, INT_MAX, 0, 0, INT_MAX, INT_MAX},
                                 {INT_MIN, INT_MIN, INT_MAX, INT_MAX, INT_MIN, 0, 9, INT_MAX},
                                 {-1000, -1000, INT_MAX, 2000, 0, 0, INT_MAX, 9}};
    std::mt19937 random(14);
    SCOPED_TRACE("seed 14");
    for (const int depth : drawing::DEPTHS) {
        Picture from = drawing::random_picture(23, 9, depth, random);
        const Canvas source(from, depth);
        const COLORREF key = GetPixel(source, 4, 4);
        for (int i = 0; i < 80; ++i) {
            const auto x = static_cast<int>(random() % 23);
            const auto y = static_cast<int>(random() % 9);
            SetPixel(source, x, y, key);
            if (depth == 32) {
                from = source.picture();
            }
        }
        from = source.picture();
        for (const Stretch& s : stretches) {
            const Picture to = drawing::random_picture(23, 9, depth, random);
            const Canvas canvas(to, depth);
            EXPECT_NE(TransparentBlt(canvas, s.x, s.y, s.width, s.height, source, s.source_x, s.source_y,
                                     s.source_width, s.source_height, key),
                      0);
            Picture expected = to;
            for (int y = 0; y < to.height; ++y) {
                for (int x = 0; x < to.width; ++x) {
                    const std::int64_t i = std::int64_t{x} - s.x;
                    const std::int64_t j = std::int64_t{y} - s.y;
                    if (i < 0 || j < 0 || i >= s.width || j >= s.height || s.source_width == 0 ||
                        s.source_height == 0) {
                        continue;
                    }
                    const std::int64_t source_x = s.source_x + (2 * i + 1) * s.source_width / (2LL * s.width);
                    const std::int64_t source_y =
                        s.source_y + (2 * j + 1) * s.source_height / (2LL * s.height);
                    if (from.has(source_x, source_y) &&
                        GetPixel(source, static_cast<int>(source_x), static_cast<int>(source_y)) != key) {
                        expected.at(x, y) = from.at(source_x, source_y);
                    }
                }
            }
            EXPECT_EQ(canvas.picture(), expected) << depth << " bits, to " << s.x << ' ' << s.width;
        }
        EXPECT_EQ(TransparentBlt(source, 0, 0, -1, 1, source, 0, 0, 1, 1, key), 0);
        EXPECT_EQ(TransparentBlt(source, 0, 0, 1, 1, source, 0, 0, 1, -1, key), 0);
    }
}

TEST(TransparentCopy, ComparesColoursNotTheUnusedByte) {
    Picture from(2, 1);
    from.at(0, 0) = 0xAA112233;
    from.at(1, 0) = 0xAA112234;
    const Canvas source(from, 32);
    const Canvas canvas(Picture(2, 1, 7), 32);
    EXPECT_NE(TransparentBlt(canvas, 0, 0, 2, 1, source, 0, 0, 2, 1, 0xFF332211), 0);
    EXPECT_EQ(canvas.picture().values, (std::vector<std::uint32_t>{7, 0xAA112234}));
}

TEST(TransparentCopy, OfOneBitTakesTheColoursOfTheDestination) {
    Picture bits(2, 1);
    bits.at(1, 0) = 1;
    const Canvas source(bits, 1);
    const Canvas canvas(2, 1, 32);
    SetBkColor(source, 0xFF0000);
    SetTextColor(canvas, 0x0000FF);
    SetBkColor(canvas, 0x00FF00);
    EXPECT_NE(TransparentBlt(canvas, 0, 0, 2, 1, source, 0, 0, 2, 1, 0x000000), 0);
    EXPECT_EQ(canvas.picture().at(0, 0), 0U) << "the key";
    EXPECT_EQ(canvas.picture().at(1, 0), 0x00FF00U) << "its background";
    EXPECT_NE(TransparentBlt(canvas, 0, 0, 2, 1, source, 0, 0, 2, 1, 0xFFFFFF), 0);
    EXPECT_EQ(canvas.picture().at(0, 0), 0xFF0000U) << "its text";
}

TEST(TransparentCopy, OntoItsOwnSurfaceReadsThePictureBefore) {
    std::mt19937 random(15);
    SCOPED_TRACE("seed 15");
    const Picture before = drawing::random_picture(12, 6, 8, random);
    const Canvas canvas(before, 8);
    const Canvas source(before, 8);
    const Canvas expected(before, 8);
    EXPECT_NE(TransparentBlt(canvas, 1, 1, 11, 5, canvas, 0, 0, 6, 6, 0xFFFFFF), 0);
    EXPECT_NE(TransparentBlt(expected, 1, 1, 11, 5, source, 0, 0, 6, 6, 0xFFFFFF), 0);
    EXPECT_EQ(canvas.picture(), expected.picture());
}

/// Where the middle of a destination pixel comes from, and by how much it misses the border of a pixel.
struct Origin {
    std::int64_t x, y;
    double margin;
};

Origin origin(const XFORM& t, int x, int y) {
    const double determinant = double{t.eM11} * t.eM22 - double{t.eM12} * t.eM21;
    const double px = x + 0.5 - t.eDx;
    const double py = y + 0.5 - t.eDy;
    const double u = (px * t.eM22 - py * t.eM21) / determinant;
    const double v = (py * t.eM11 - px * t.eM12) / determinant;
    return {static_cast<std::int64_t>(std::floor(u)), static_cast<std::int64_t>(std::floor(v)),
            std::min(std::fabs(u - std::round(u)), std::fabs(v - std::round(v)))};
}

XFORM turned(double degrees, double x, double y) {
    const double a = degrees * std::numbers::pi / 180;
    const double c = std::cos(a);
    const double s = std::sin(a);
    return {static_cast<float>(c),
            static_cast<float>(s),
            static_cast<float>(-s),
            static_cast<float>(c),
            static_cast<float>(x - x * c + y * s),
            static_cast<float>(y - x * s - y * c)};
}

TEST(TransformedCopy, TakesTheSourcePixelUnderEachMiddle) {
    std::mt19937 random(21);
    SCOPED_TRACE("seed 21");
    std::vector<XFORM> transforms;
    for (const double angle : {30.0, 45.0, 123.4, -77.0, 359.0}) {
        transforms.push_back(turned(angle, 20, 15));
    }
    transforms.push_back({2.37F, 0, 0, 0.71F, -10, 3});
    transforms.push_back({-1, 0, 0, 1, 40, 0});
    transforms.push_back({1, 0.3F, -0.7F, 1.2F, 5.25F, -3.5F});
    transforms.push_back({1e-3F, 0, 0, 1e-3F, 20, 15});
    transforms.push_back({1e3F, 20, -300, 1e3F, -2e4F, 100});
    for (const int depth : drawing::DEPTHS) {
        const Picture from = drawing::random_picture(41, 30, depth, random);
        const Picture to = drawing::random_picture(40, 31, depth, random);
        const Canvas source(from, depth);
        for (const XFORM& t : transforms) {
            for (const DWORD rop : {SRCCOPY, SRCAND}) {
                SCOPED_TRACE(testing::Message() << depth << " bits, " << t.eM11 << ' ' << t.eM12);
                const Canvas canvas(to, depth);
                EXPECT_EQ(SetGraphicsMode(canvas, GM_ADVANCED), GM_COMPATIBLE);
                EXPECT_NE(SetWorldTransform(canvas, &t), 0);
                EXPECT_NE(BitBlt(canvas, 2, 1, 37, 40, source, 4, 0, rop), 0);
                const Picture result = canvas.picture();
                int ties = 0;
                for (int y = 0; y < to.height; ++y) {
                    for (int x = 0; x < to.width; ++x) {
                        const Origin o = origin(t, x, y);
                        const bool is_in = o.x >= 2 && o.x < 39 && o.y >= 1 && o.y < 41;
                        std::uint32_t expected = to.at(x, y);
                        if (is_in && from.has(o.x + 2, o.y - 1)) {
                            expected =
                                combined(rop, 0, from.at(o.x + 2, o.y - 1), expected) & all_ones(depth);
                        }
                        if (o.margin < 1e-6) {
                            ++ties;
                        } else {
                            ASSERT_EQ(result.at(x, y), expected) << x << ' ' << y;
                        }
                    }
                }
                EXPECT_LT(ties, 80);
            }
        }
    }
}

TEST(TransformedCopy, OntoItsOwnSurfaceReadsThePictureBefore) {
    std::mt19937 random(22);
    SCOPED_TRACE("seed 22");
    const Picture before = drawing::random_picture(12, 12, 32, random);
    const Canvas canvas(before, 32);
    const Canvas source(before, 32);
    const Canvas expected(before, 32);
    const XFORM twice = {2, 0, 0, 2, 0, 0};
    const XFORM turn = turned(90, 6, 6);
    for (const Canvas* const each : {&canvas, &source, &expected}) {
        EXPECT_NE(SetGraphicsMode(*each, GM_ADVANCED), 0);
        EXPECT_NE(SetWorldTransform(*each, &twice), 0);
    }
    EXPECT_NE(BitBlt(canvas, 2, 1, 4, 5, canvas, 0, 0, SRCCOPY), 0);
    EXPECT_NE(BitBlt(expected, 2, 1, 4, 5, source, 0, 0, SRCCOPY), 0);
    EXPECT_NE(BitBlt(canvas, 0, 0, 0, 5, canvas, 0, 0, SRCCOPY), 0) << "of no width";
    EXPECT_EQ(canvas.picture(), expected.picture());
    EXPECT_NE(SetWorldTransform(source, &turn), 0);
    EXPECT_EQ(BitBlt(canvas, 0, 0, 8, 8, source, 0, 0, SRCCOPY), 0) << "from a turned source";
    EXPECT_EQ(canvas.picture(), expected.picture());
}

TEST(Transform, ReachesAllCallsOrIsRefused) {
    const Canvas canvas(8, 8, 32);
    const Canvas source(Picture(8, 8, 5), 32);
    const XFORM quarter = {0, 1, -1, 0, 8, 0};
    const XFORM shift = {1, 0, 0, 1, 2, -3};
    const XFORM flat = {1, 2, 2, 4, 0, 0};
    const XFORM endless = {INFINITY, 0, 0, 1, 0, 0};
    EXPECT_EQ(SetWorldTransform(canvas, &quarter), 0) << "in the compatible mode";
    EXPECT_EQ(SetGraphicsMode(canvas, 3), 0);
    SetGraphicsMode(canvas, GM_ADVANCED);
    for (const XFORM* const bad : {&flat, &endless, static_cast<const XFORM*>(nullptr)}) {
        EXPECT_EQ(SetWorldTransform(canvas, bad), 0);
    }
    EXPECT_EQ(ModifyWorldTransform(canvas, &quarter, 4), 0);
    EXPECT_NE(SetWorldTransform(canvas, &quarter), 0);
    EXPECT_EQ(SetGraphicsMode(canvas, GM_COMPATIBLE), 0) << "while a transform is set";
    // Point (1, 2) is at the pixel border (6, 1); the pixel to its right and below is (6, 1).
    EXPECT_EQ(SetPixel(canvas, 1, 2, 0xFF), 0xFFU);
    EXPECT_EQ(canvas.picture().at(6, 1), 0xFF0000U);
    EXPECT_EQ(GetPixel(canvas, 1, 2), 0xFFU);
    POINT points[2] = {{6, 1}, {8, 0}};
    EXPECT_NE(DPtoLP(canvas, points, 2), 0);
    EXPECT_EQ(points[0].x, 1);
    EXPECT_EQ(points[0].y, 2);
    EXPECT_EQ(points[1].x, 0);
    EXPECT_EQ(points[1].y, 0);
    const RECT r = {1, 0, 3, 2};
    EXPECT_NE(FillRect(canvas, &r, static_cast<HBRUSH>(GetStockObject(WHITE_BRUSH))), 0);
    Picture expected(8, 8);
    for (int y = 1; y < 3; ++y) {
        expected.at(6, y) = expected.at(7, y) = 0xFFFFFF;
    }
    EXPECT_EQ(canvas.picture(), expected);
    EXPECT_NE(BitBlt(canvas, 1, 0, 2, 2, nullptr, 0, 0, BLACKNESS), 0);
    EXPECT_EQ(canvas.picture(), Picture(8, 8));
    const TRIVERTEX corners[2] = {{0, 0, 0xFF00, 0, 0, 0}, {4, 4, 0xFF00, 0, 0, 0}};
    const GRADIENT_RECT mesh = {0, 1};
    EXPECT_EQ(GradientFill(canvas, corners, 2, &mesh, 1, 0), 0);
    EXPECT_EQ(RoundRect(canvas, 0, 0, 4, 4, 1, 1), 0);
    EXPECT_EQ(TransparentBlt(canvas, 0, 0, 4, 4, source, 0, 0, 4, 4, 0), 0);
    EXPECT_EQ(GetLastError(), ERROR_NOT_SUPPORTED);
    EXPECT_EQ(BitBlt(source, 0, 0, 4, 4, canvas, 0, 0, SRCCOPY), 0) << "from a turned source";
    EXPECT_NE(SetWorldTransform(canvas, &shift), 0);
    EXPECT_NE(ModifyWorldTransform(canvas, &quarter, MWT_RIGHTMULTIPLY), 0);
    EXPECT_NE(BitBlt(canvas, 0, 3, 2, 1, source, 0, 0, SRCCOPY), 0);
    // (0..2, 3..4), shifted to (2..4, 0..1), turned to columns 7..8 and rows 2..4
    expected = Picture(8, 8);
    expected.at(7, 2) = expected.at(7, 3) = 5;
    EXPECT_EQ(canvas.picture(), expected);
    EXPECT_NE(SetWorldTransform(canvas, &shift), 0);
    EXPECT_NE(GradientFill(canvas, corners, 2, &mesh, 1, 0), 0);
    EXPECT_EQ(canvas.picture().at(2, 0), 0xFF0000U);
    EXPECT_EQ(canvas.picture().at(5, 0), 0xFF0000U);
    EXPECT_EQ(canvas.picture().at(1, 0), 0U);
    EXPECT_EQ(canvas.picture().at(6, 0), 0U);
    EXPECT_EQ(canvas.picture().at(2, 1), 0U);
    EXPECT_NE(BitBlt(source, 0, 0, 8, 8, canvas, 0, 0, SRCCOPY), 0) << "from a shifted source";
    EXPECT_EQ(source.picture().at(0, 3), 0xFF0000U);
    EXPECT_EQ(source.picture().at(0, 2), 5U);
    // Steps and places far beyond any surface.
    const XFORM tiny = {1e-30F, 0, 0, 1e-30F, 0, 0};
    const XFORM far = {1, 0.5F, 0, 1, 3e38F, -3e38F};
    EXPECT_NE(SetWorldTransform(canvas, &tiny), 0);
    EXPECT_EQ(BitBlt(canvas, 0, 0, 8, 8, source, 0, 0, SRCCOPY), 0);
    EXPECT_EQ(GetLastError(), ERROR_ARITHMETIC_OVERFLOW);
    const RECT all = {0, 0, 8, 8};
    EXPECT_EQ(FillRect(canvas, &all, static_cast<HBRUSH>(GetStockObject(WHITE_BRUSH))), 0);
    EXPECT_EQ(BitBlt(canvas, 0, 0, 8, 8, nullptr, 0, 0, WHITENESS), 0);
    EXPECT_EQ(DPtoLP(canvas, points, 2), 0);
    EXPECT_EQ(points[0].x, 1);
    EXPECT_NE(DPtoLP(canvas, points + 1, 1), 0);
    EXPECT_NE(SetWorldTransform(canvas, &far), 0);
    expected = canvas.picture();
    EXPECT_NE(BitBlt(canvas, INT_MIN, INT_MIN, INT_MAX, INT_MAX, source, 0, 0, SRCCOPY), 0);
    EXPECT_EQ(SetPixel(canvas, 0, 0, 0), CLR_INVALID);
    EXPECT_EQ(canvas.picture(), expected);
    ModifyWorldTransform(canvas, nullptr, MWT_IDENTITY);
    EXPECT_EQ(SetMapMode(canvas, MM_ANISOTROPIC), MM_TEXT);
    EXPECT_EQ(SetMapMode(canvas, 2), 0);
    EXPECT_EQ(GetMapMode(canvas), MM_ANISOTROPIC);
    EXPECT_EQ(DPtoLP(canvas, points, -1), 0);
    EXPECT_EQ(DPtoLP(canvas, nullptr, 1), 0);
    EXPECT_NE(DPtoLP(canvas, nullptr, 0), 0);
}

TEST(TransparentCopy, KernelsAgree) {
    std::mt19937 random(16);
    SCOPED_TRACE("seed 16");
    for (std::size_t count = 0; count < 70; ++count) {
        std::vector<std::uint32_t> from(count);
        std::vector<std::uint32_t> to(count + 1, 0x55555555);
        for (std::uint32_t& word : from) {
            word = static_cast<std::uint32_t>(random()) & (count % 3 == 0 ? 0x03000001U : 0x01000001U);
        }
        std::vector<std::uint32_t> plain = to;
        for (std::size_t i = 0; i < count; ++i) {
            if ((from[i] & 0xFFFFFF) != 1) {
                plain[i] = from[i];
            }
        }
        std::vector<std::uint32_t> portable = to;
        basalt::platform::copy_words_but_key(to.data(), from.data(), count, 0xFF000001);
        basalt::platform::copy_words_but_key_portable(portable.data(), from.data(), count, 0xFF000001);
        EXPECT_EQ(to, plain);
        EXPECT_EQ(portable, plain);
        basalt::platform::fill_words(to.data(), count, 42);
        EXPECT_EQ(to, [&] {
            std::vector<std::uint32_t> filled(count, 42);
            filled.push_back(0x55555555);
            return filled;
        }());
    }
}

}  // namespace
