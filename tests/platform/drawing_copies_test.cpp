// Copies: raster operations, changes of depth, overlap, one colour left out, stretched and through
// transforms.
#include <gtest/gtest.h>

#include <climits>
#include <cmath>
#include <utility>

#include "src/platform/pixels/row_kernels.h"
#include "tests/support/drawing.h"

namespace {

using drawing::all_ones;
using drawing::Canvas;
using drawing::Picture;
using drawing::Stretch;

constexpr COLORREF TEXT = 0x0000FF;
constexpr COLORREF BACKGROUND = 0x00FF00;
constexpr COLORREF SOURCE_BACKGROUND = 0xFF0000;

/// What a source's values arrive as: the nearest colours', but by the rules for monochrome from and to one
/// bit.
Picture arriving(Picture picture, int from, int to) {
    for (std::uint32_t& value : picture.pixels) {
        const Canvas source(Picture(1, 1, value), from);
        const Canvas target(1, 1, to);
        const COLORREF colour = GetPixel(source, 0, 0);
        SetPixel(target, 0, 0, from > 1 ? colour : value != 0 ? BACKGROUND : TEXT);
        if (from != to && to > 1) {
            value = target.picture().at(0, 0);
        } else if (from != to) {
            value = colour == SetPixel(source, 0, 0, SOURCE_BACKGROUND) ? 1 : 0;
        }
    }
    return picture;
}

struct Block {
    int x, y, width, height, source_x, source_y;

    BOOL copy(HDC to, HDC from, DWORD rop) const {
        return BitBlt(to, x, y, width, height, from, source_x, source_y, rop);
    }
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

/// Copies from a picture of what the source's values arrive as.
Picture expected_copy(const Picture& to, int depth, const Picture& arrived, const Block& block, DWORD rop,
                      std::uint32_t brush) {
    Picture result = to;
    for (int y = 0; y < to.height; ++y) {
        for (int x = 0; x < to.width; ++x) {
            const std::int64_t i = std::int64_t{x} - block.x;
            const std::int64_t j = std::int64_t{y} - block.y;
            const std::int64_t source_x = block.source_x + i;
            const std::int64_t source_y = block.source_y + j;
            if (i >= 0 && j >= 0 && i < block.width && j < block.height && arrived.has(source_x, source_y)) {
                result.at(x, y) =
                    combined(rop, brush, arrived.at(source_x, source_y), to.at(x, y)) & all_ones(depth);
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
            const Picture to = drawing::random_picture(23, 9, to_depth, random);
            const Canvas source(drawing::random_picture(24, 9, from_depth, random), from_depth);
            for (const int x : {2, 7, 8}) {
                SetPixel(source, x, 3, SOURCE_BACKGROUND);
            }
            const Picture arrived = arriving(source.picture(), from_depth, to_depth);
            SetBkColor(source, SOURCE_BACKGROUND);
            for (const Block& block : BLOCKS) {
                const DWORD rop = operations[random() % 6];
                SCOPED_TRACE(testing::Message() << from_depth << " to " << to_depth << " bits, at " << block.x
                                                << ' ' << block.y << ", operation " << std::hex << rop);
                const Canvas canvas(to, to_depth);
                SetTextColor(canvas, TEXT);
                SetBkColor(canvas, BACKGROUND);
                EXPECT_NE(block.copy(canvas, source, rop), 0);
                // A new context's brush is white.
                EXPECT_EQ(canvas.picture(),
                          expected_copy(to, to_depth, arrived, block, rop, drawing::white(to_depth)));
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
                EXPECT_NE(block.copy(canvas, canvas, rop), 0);
                EXPECT_EQ(canvas.picture(), expected_copy(before, depth, before, block, rop, 0))
                    << depth << " bits, from " << block.source_x << " to " << block.x;
            }
        }
    }
}

// A brush that draws nothing keeps back every operation that its values would decide, and no other.
TEST(BlockCopy, MakesEveryOperationAndAsksForNoSourceWithoutNeed) {
    constexpr std::uint32_t TO = 0x00CC5533;
    constexpr std::uint32_t FROM = 0x00AA330F;
    const Canvas source(Picture(1, 1, FROM), 32);
    HBRUSH const brush = CreateSolidBrush(0x332211);
    for (DWORD number = 0; number < 256; ++number) {
        const DWORD rop = number << 16;
        const bool needs_brush = (number >> 4) != (number & 0xF);
        const bool needs_source = (number >> 2 & 0x33) != (number & 0x33);
        for (HGDIOBJ const selected : {HGDIOBJ{brush}, GetStockObject(NULL_BRUSH)}) {
            const Canvas canvas(Picture(1, 1, TO), 32);
            HGDIOBJ const replaced = SelectObject(canvas, selected);
            EXPECT_NE(BitBlt(canvas, 0, 0, 1, 9, needs_source ? HDC{source} : nullptr, 0, 0, rop), 0);
            SelectObject(canvas, replaced);
            EXPECT_EQ(canvas.picture().at(0, 0),
                      needs_brush && selected != brush ? TO : combined(rop, 0x112233, FROM, TO))
                << number;
        }
    }
    EXPECT_NE(DeleteObject(brush), 0);
}

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
    for (const int from_depth : drawing::DEPTHS) {
        const Canvas source(drawing::random_picture(23, 9, from_depth, random), from_depth);
        const COLORREF key = GetPixel(source, 4, 4);
        for (int i = 0; i < 80; ++i) {
            SetPixel(source, static_cast<int>(random() % 23), static_cast<int>(random() % 9), key);
        }
        SetBkColor(source, SOURCE_BACKGROUND);
        const Picture from = source.picture();
        for (const int depth : drawing::DEPTHS) {
            const Picture arrived = arriving(from, from_depth, depth);
            for (const Stretch& s : stretches) {
                // Onto a copy of the source from itself, and onto another surface.
                const bool onto_itself = from_depth == depth && random() % 2 == 0;
                const Picture to = onto_itself ? from : drawing::random_picture(23, 9, depth, random);
                const Canvas canvas(to, depth);
                SetTextColor(canvas, TEXT);
                SetBkColor(canvas, BACKGROUND);
                EXPECT_NE(TransparentBlt(canvas, s.x, s.y, s.width, s.height,
                                         onto_itself ? HDC{canvas} : HDC{source}, s.source_x, s.source_y,
                                         s.source_width, s.source_height, key | 0xFF000000),
                          0);
                Picture expected = to;
                for (int y = 0; y < to.height; ++y) {
                    for (int x = 0; x < to.width; ++x) {
                        const std::int64_t i = std::int64_t{x} - s.x;
                        const std::int64_t j = std::int64_t{y} - s.y;
                        if (i < 0 || j < 0 || i >= s.width || j >= s.height) {
                            continue;
                        }
                        const std::int64_t column =
                            s.source_x + (2 * i + 1) * s.source_width / (2LL * s.width);
                        const std::int64_t row =
                            s.source_y + (2 * j + 1) * s.source_height / (2LL * s.height);
                        if (s.source_width > 0 && s.source_height > 0 && from.has(column, row) &&
                            GetPixel(source, static_cast<int>(column), static_cast<int>(row)) != key) {
                            expected.at(x, y) = arrived.at(column, row);
                        }
                    }
                }
                EXPECT_EQ(canvas.picture(), expected) << from_depth << " to " << depth << " bits, to " << s.x
                                                      << ' ' << s.width << ", " << onto_itself;
            }
        }
        for (int negative = 0; negative < 4; ++negative) {
            int sizes[] = {1, 1, 1, 1};
            sizes[negative] = -1;
            EXPECT_EQ(TransparentBlt(source, 0, 0, sizes[0], sizes[1], source, 0, 0, sizes[2], sizes[3], key),
                      0);
        }
    }
}

TEST(TransparentCopy, LeavesOutTheStoredColourNearestToTheKey) {
    for (const int depth : drawing::DEPTHS) {
        Picture black_and_white(2, 1);
        black_and_white.at(1, 0) = drawing::white(depth);
        const Canvas source(black_and_white, depth);
        const Canvas canvas(Picture(2, 1, 0x123456), 32);
        EXPECT_NE(TransparentBlt(canvas, 0, 0, 2, 1, source, 0, 0, 2, 1, 0x020202), 0);
        EXPECT_EQ(canvas.picture().at(0, 0), depth <= 16 ? 0x123456U : 0U) << depth << " bits";
        EXPECT_EQ(canvas.picture().at(1, 0), 0xFFFFFFU);
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
    for (const Canvas* const each : {&canvas, &source, &expected}) {
        EXPECT_NE(SetGraphicsMode(*each, GM_ADVANCED), 0);
        EXPECT_NE(SetWorldTransform(*each, &twice), 0);
    }
    EXPECT_NE(BitBlt(canvas, 2, 1, 4, 5, canvas, 0, 0, SRCCOPY), 0);
    EXPECT_NE(BitBlt(expected, 2, 1, 4, 5, source, 0, 0, SRCCOPY), 0);
    EXPECT_NE(BitBlt(canvas, 0, 0, 0, 5, canvas, 0, 0, SRCCOPY), 0) << "of no width";
    EXPECT_EQ(canvas.picture(), expected.picture());
}

TEST(TransformedCopy, TakesTheSourcePixelUnderEachMiddle) {
    std::mt19937 random(21);
    SCOPED_TRACE("seed 21");
    std::vector<XFORM> transforms;
    for (const double angle : {30.0, 45.0, 123.4, -77.0, 359.0}) {
        transforms.push_back(drawing::turn_about(angle, 20, 15));
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
                        const drawing::Origin o = drawing::origin(t, x, y);
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

TEST(Transform, IsRefusedWhereItCannotBe) {
    const Canvas canvas(8, 8, 32);
    const XFORM quarter = {0, 1, -1, 0, 8, 0};
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
    ModifyWorldTransform(canvas, nullptr, MWT_IDENTITY);
    EXPECT_EQ(SetMapMode(canvas, MM_ANISOTROPIC), MM_TEXT);
    EXPECT_EQ(SetMapMode(canvas, 2), 0);
    EXPECT_EQ(GetMapMode(canvas), MM_ANISOTROPIC);
    POINT point = {6, 1};
    EXPECT_EQ(DPtoLP(canvas, &point, -1), 0);
    SetLastError(ERROR_SUCCESS);
    EXPECT_EQ(DPtoLP(canvas, nullptr, 1), 0);
    EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);
    EXPECT_NE(DPtoLP(canvas, nullptr, 0), 0);
}

constexpr TRIVERTEX BLUE_SQUARE[] = {{0, 0, 0xFF00, 0, 0, 0}, {4, 4, 0xFF00, 0, 0, 0}};
constexpr GRADIENT_RECT FIRST_TO_SECOND = {0, 1};

TEST(Transform, ByAQuarterReachesAllCallsOrIsRefused) {
    const Canvas canvas(Picture(8, 8, 3), 32);
    const Canvas source(Picture(8, 8, 5), 32);
    const XFORM quarter = {0, 1, -1, 0, 8, 0};
    const XFORM shift = {1, 0, 0, 1, 2, -3};
    SetGraphicsMode(canvas, GM_ADVANCED);
    EXPECT_NE(SetWorldTransform(canvas, &quarter), 0);
    // Point (1, 2) is at the pixel border (6, 1); the pixel to its right and below is (6, 1).
    EXPECT_EQ(SetPixel(canvas, 1, 2, 0xFF), 0xFFU);
    EXPECT_EQ(canvas.picture().at(6, 1), 0xFF0000U);
    EXPECT_EQ(GetPixel(canvas, 1, 2), 0xFFU);
    POINT points[2] = {{6, 1}, {8, 0}};
    EXPECT_NE(DPtoLP(canvas, points, 2), 0);
    EXPECT_EQ(std::pair(points[0].x, points[0].y), std::pair(1, 2));
    EXPECT_EQ(std::pair(points[1].x, points[1].y), std::pair(0, 0));
    const RECT r = {1, 0, 3, 2};
    EXPECT_NE(FillRect(canvas, &r, static_cast<HBRUSH>(GetStockObject(WHITE_BRUSH))), 0);
    Picture expected(8, 8, 3);
    for (const int y : {1, 2}) {
        expected.at(6, y) = expected.at(7, y) = 0xFFFFFF;
    }
    EXPECT_EQ(canvas.picture(), expected);
    EXPECT_NE(BitBlt(canvas, 1, 0, 2, 1, nullptr, 0, 0, BLACKNESS), 0);
    expected.at(7, 1) = expected.at(7, 2) = 0;
    EXPECT_EQ(canvas.picture(), expected);
    EXPECT_EQ(GradientFill(canvas, BLUE_SQUARE, 2, &FIRST_TO_SECOND, 1, 0), 0);
    EXPECT_EQ(RoundRect(canvas, 0, 0, 4, 4, 1, 1), 0);
    EXPECT_EQ(TransparentBlt(canvas, 0, 0, 4, 4, source, 0, 0, 4, 4, 0), 0);
    EXPECT_EQ(GetLastError(), ERROR_NOT_SUPPORTED);
    EXPECT_EQ(BitBlt(source, 0, 0, 4, 4, canvas, 0, 0, SRCCOPY), 0) << "from a turned source";
    EXPECT_NE(SetWorldTransform(canvas, &shift), 0);
    EXPECT_NE(ModifyWorldTransform(canvas, &quarter, MWT_RIGHTMULTIPLY), 0);
    EXPECT_NE(BitBlt(canvas, 0, 3, 2, 1, source, 0, 0, SRCCOPY), 0);
    // (0..2, 3..4), shifted to (2..4, 0..1), turned to columns 7..8 and rows 2..4
    expected.at(7, 2) = expected.at(7, 3) = 5;
    EXPECT_EQ(canvas.picture(), expected);
}

TEST(Transform, JoinsWithAnotherBeforeOrAfter) {
    constexpr XFORM first = {1, 2, 1, 3, 0, 0};
    constexpr XFORM second = {2, 1, 1, 1, 0, 0};
    constexpr POINT logical = {10, 20};
    const struct {
        DWORD mode;
        POINT device;  // x m11 + y m21, x m12 + y m22, twice
    } ways[] = {{MWT_RIGHTMULTIPLY, {140, 110}}, {MWT_LEFTMULTIPLY, {70, 170}}};
    for (const auto& way : ways) {
        const Canvas canvas(1, 1, 32);
        SetGraphicsMode(canvas, GM_ADVANCED);
        SetWorldTransform(canvas, &first);
        EXPECT_NE(ModifyWorldTransform(canvas, &second, way.mode), 0);
        POINT point = way.device;
        EXPECT_NE(DPtoLP(canvas, &point, 1), 0);
        EXPECT_EQ(point.x, logical.x) << way.mode;
        EXPECT_EQ(point.y, logical.y) << way.mode;
    }
}

TEST(Transform, ByWholePixelsIsAShift) {
    const Canvas canvas(8, 8, 32);
    const Canvas source(Picture(8, 8, 5), 32);
    const XFORM shift = {1, 0, 0, 1, 2, -3};
    SetGraphicsMode(canvas, GM_ADVANCED);
    EXPECT_NE(SetWorldTransform(canvas, &shift), 0);
    EXPECT_NE(GradientFill(canvas, BLUE_SQUARE, 2, &FIRST_TO_SECOND, 1, 0), 0);
    Picture expected(8, 8);
    for (int x = 2; x < 6; ++x) {
        expected.at(x, 0) = 0xFF0000;
    }
    EXPECT_EQ(canvas.picture(), expected);
    EXPECT_NE(BitBlt(source, 0, 0, 8, 8, canvas, 0, 0, SRCCOPY), 0) << "from a shifted source";
    EXPECT_EQ(source.picture().at(0, 3), 0xFF0000U);
    EXPECT_EQ(source.picture().at(0, 2), 5U);
}

TEST(Transform, OfStepsAndPlacesFarBeyondAnySurfaceDrawsNothing) {
    const Canvas canvas(Picture(8, 8, 3), 32);
    const Canvas source(Picture(8, 8, 5), 32);
    const XFORM tiny = {1e-30F, 0, 0, 1e-30F, 0, 0};
    const XFORM far = {1, 0.5F, 0, 1, 3e38F, -3e38F};
    const RECT all = {0, 0, 8, 8};
    POINT points[2] = {{1, 2}, {0, 0}};
    SetGraphicsMode(canvas, GM_ADVANCED);
    EXPECT_NE(SetWorldTransform(canvas, &tiny), 0);
    EXPECT_EQ(BitBlt(canvas, 0, 0, 8, 8, source, 0, 0, SRCCOPY), 0);
    EXPECT_EQ(GetLastError(), ERROR_ARITHMETIC_OVERFLOW);
    EXPECT_EQ(FillRect(canvas, &all, static_cast<HBRUSH>(GetStockObject(WHITE_BRUSH))), 0);
    EXPECT_EQ(BitBlt(canvas, 0, 0, 8, 8, nullptr, 0, 0, WHITENESS), 0);
    const XFORM too_small = {0x1p-30F, 0, 0, 0x1p-30F, 0, 0};
    const XFORM small = {0x1p-29F, 0, 0, 0x1p-29F, 0, 0};
    for (const XFORM* const each : {&too_small, &small}) {
        EXPECT_NE(SetWorldTransform(canvas, each), 0);
        EXPECT_EQ(BitBlt(canvas, 0, 0, 8, 8, source, 0, 0, SRCCOPY), each == &small ? 1 : 0);
        EXPECT_EQ(FillRect(canvas, &all, static_cast<HBRUSH>(GetStockObject(WHITE_BRUSH))),
                  each == &small ? 1 : 0);
    }
    EXPECT_NE(SetWorldTransform(canvas, &tiny), 0);
    EXPECT_EQ(DPtoLP(canvas, points, 2), 0);
    EXPECT_EQ(points[0].x, 1);
    EXPECT_NE(DPtoLP(canvas, points + 1, 1), 0);
    EXPECT_NE(SetWorldTransform(canvas, &far), 0);
    EXPECT_NE(BitBlt(canvas, INT_MIN, INT_MIN, INT_MAX, INT_MAX, source, 0, 0, SRCCOPY), 0);
    EXPECT_EQ(SetPixel(canvas, 0, 0, 0), CLR_INVALID);
    EXPECT_EQ(canvas.picture(), Picture(8, 8, 3));
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
        std::vector<std::uint32_t> filled(count, 42);
        filled.push_back(0x55555555);
        EXPECT_EQ(to, filled);
    }
}

}  // namespace
