// Facts about colours, fills, copies, transforms, rows and regions; fuzz/drawing compares random calls with
// the picture model.
#include <gtest/gtest.h>

#include <climits>
#include <cmath>
#include <cstring>
#include <random>

#include "src/platform/pixels/keyed_copy.h"
#include "src/platform/pixels/mapped_words.h"
#include "tests/support/drawing.h"

namespace {

using namespace drawing;

const HBRUSH WHITE = static_cast<HBRUSH>(GetStockObject(WHITE_BRUSH));
constexpr int LOW = INT_MIN, HIGH = INT_MAX;

TEST(Colours, are_the_nearest_of_their_depth) {
    // Depth, colour drawn, value stored, colour read.
    constexpr std::uint32_t ROWS[][4] = {{32, 0xFF332211, 0x112233, 0x332211},
                                         {24, 0x332211, 0x112233, 0x332211},
                                         {16, 0x000004, 0, 0},
                                         {16, 0x000005, 1 << 10, 0x000008},
                                         {16, 0x808080, 0x4210, 0x848484},
                                         {16, 0xFFFFFF, 0x7FFF, 0xFFFFFF},
                                         {8, 0x0000FE, 249, 0x0000FF},
                                         {8, 0x336699, 127, 0x336699},
                                         {4, 0x0000F0, 9, 0x0000FF},
                                         {4, 0x909090, 8, 0x808080},
                                         {1, 0x7F7F7F, 0, 0x000000},
                                         {1, 0x808080, 1, 0xFFFFFF}};
    for (const auto& [depth, drawn, stored, colour] : ROWS) {
        Canvas canvas(Picture(1, 1, static_cast<int>(depth)));
        EXPECT_EQ(canvas.dc().SetPixel(0, 0, drawn), colour) << depth << " bits, " << drawn;
        EXPECT_EQ(canvas.dc().GetPixel({0, 0}), colour);
        EXPECT_EQ(canvas.picture().at(0, 0), stored);
    }
    const COLORREF system[] = {0x000000, 0x000080, 0x008000, 0x008080, 0x800000, 0x800080, 0x808000,
                               0xC0C0C0, 0xC0DCC0, 0xF0CAA6, 0xF0FBFF, 0xA4A0A0, 0x808080, 0x0000FF,
                               0x00FF00, 0x00FFFF, 0xFF0000, 0xFF00FF, 0xFFFF00, 0xFFFFFF};
    EXPECT_TRUE(std::equal(system, system + 10, table(8).begin()));
    EXPECT_TRUE(std::equal(system + 10, system + 20, table(8).end() - 10));
    EXPECT_TRUE(std::equal(system, system + 7, table(4).begin()) && table(4)[7] == 0xC0C0C0);
    EXPECT_TRUE(std::equal(system + 12, system + 20, table(4).begin() + 8));
    EXPECT_EQ(table(1), (std::vector<COLORREF>{0, 0xFFFFFF}));
    for (std::uint32_t i = 0; i < 256; ++i) {
        EXPECT_EQ(value_of(8, table(8)[i]), i) << "each colour once";
        EXPECT_NEAR(table(8)[value_of(8, i * 0x010101)] & 0xFF, i, 5) << "a grey near any";
    }
}

TEST(Fill, takes_stock_brushes_and_colours_and_any_coordinates) {
    Canvas canvas(Picture(2, 1, 32));
    canvas.dc().FillSolidRect(CRect(0, 0, 1, 2), 0x0000FF);
    const COLORREF greys[] = {0xFFFFFF, 0xC0C0C0, 0x808080, 0x404040, 0, 0};  // the last brush draws nothing
    for (int stock = WHITE_BRUSH; stock <= NULL_BRUSH; ++stock) {
        const auto brush = static_cast<HBRUSH>(GetStockObject(stock));
        canvas.dc().FillRect(CRect(1, 0, 9, 9), CBrush::FromHandle(brush));
        EXPECT_EQ(canvas.picture().pixels, (std::vector<std::uint32_t>{0xFF0000, greys[stock]}));
    }
    const RECT all = {LOW, LOW, HIGH, HIGH};
    EXPECT_EQ(FillRect(canvas, nullptr, WHITE), 0);
    EXPECT_TRUE(FillRect(canvas, &all, WHITE) && RoundRect(canvas, LOW, LOW, HIGH, HIGH, LOW, HIGH));
    constexpr TRIVERTEX CORNERS[2] = {{0, 0, 0xFF00, 0, 0, 0}, {4, 4, 0xFF00, 0, 0, 0}};
    constexpr GRADIENT_RECT MESHES[2] = {{0, 1}, {0, 2}};
    EXPECT_TRUE(refused(
        GradientFill(canvas, CORNERS, 2, MESHES, 2, 0), GradientFill(canvas, CORNERS, 2, MESHES, 1, 2),
        GradientFill(canvas, nullptr, 2, MESHES, 1, 0), GradientFill(canvas, CORNERS, 2, nullptr, 1, 0)));
    EXPECT_NE(canvas.dc().GradientFill(CORNERS, 2, MESHES, 0, 0), 0);
    EXPECT_EQ(canvas.picture(), Picture(2, 1, 32, 0xFFFFFF)) << "not even the first rectangle of two";
}

TEST(Copy, goes_to_any_coordinates_by_five_operations) {
    const Picture before(9, 6, 32, 3);
    Canvas canvas(before), source(Picture(9, 6, 32, 5));
    EXPECT_TRUE(BitBlt(canvas, LOW, LOW, HIGH, HIGH, source, LOW, LOW, SRCCOPY) &&
                BitBlt(canvas, HIGH, 0, HIGH, 9, source, LOW, 0, SRCCOPY) &&
                TransparentBlt(canvas, LOW, LOW, HIGH, HIGH, source, LOW, 0, 9, HIGH, 0));
    EXPECT_TRUE(refused(canvas.dc().BitBlt(0, 0, 1, 1, &source.dc(), 0, 0, 0x00F00021),  // with a brush
                        TransparentBlt(canvas, 0, 0, 1, 1, canvas, 0, 0, 1, -1, 0)));
    EXPECT_EQ(canvas.picture(), before);
    EXPECT_NE(TransparentBlt(canvas, 0, 0, HIGH, HIGH, source, 0, 0, HIGH, HIGH, 0xFF000000), 0);
    EXPECT_NE(BitBlt(canvas, -1000, -1000, HIGH, HIGH, source, -1000, -1001, SRCPAINT), 0);
    EXPECT_EQ(canvas.picture(), source.picture());
}

TEST(Copy, kernels_leave_out_the_key_whatever_the_unused_byte) {
    for (std::size_t count = 0; count < 70; ++count) {
        std::vector<std::uint32_t> from(count), to(count + 1, 0x55), portable = to;
        for (std::size_t i = 0; i < count; ++i) {
            from[i] = static_cast<std::uint32_t>((i * i % 7) << 24 | i * count % 3);
        }
        basalt::platform::copy_words_but_key(to.data(), from.data(), count, 0xFF000001);
        basalt::platform::copy_words_but_key_portable(portable.data(), from.data(), count, 0xFF000001);
        std::ranges::replace_if(
            from, [](std::uint32_t word) { return (word & 0xFFFFFF) == 1; }, 0x55);
        from.push_back(0x55);
        EXPECT_TRUE(to == from && portable == from) << count;
    }
}

constexpr XFORM QUARTER = {0, 1, -1, 0, 8, 0}, TWICE = {2, 0, 0, 2, 0, 0},
                TINY = {1e-30F, 0, 0, 1e-30F, 0, 0};

TEST(Transform, turns_large_pictures_by_either_kernel) {
    using namespace basalt::platform;
    constexpr int WIDTH = 300, HEIGHT = 170;
    std::minstd_rand random(5);
    const Picture before(WIDTH, HEIGHT, 32), from = random_picture(WIDTH, HEIGHT, 32, random);
    Canvas source(from);
    ::basalt::platform::Surface words;
    ASSERT_TRUE(words.create(WIDTH, HEIGHT, 32));
    std::memcpy(words.row(0), from.pixels.data(), from.pixels.size() * 4);
    for (const double degrees : {2.0, 17.0, 45.0, 88.0, 90.0, 181.0, 271.0}) {
        SCOPED_TRACE(degrees);
        Canvas canvas(before);
        const Settings turned = {0, 0, turn_about(degrees, 151, 84)};
        SetGraphicsMode(canvas, GM_ADVANCED);
        SetWorldTransform(canvas, &turned.world);
        EXPECT_NE(BitBlt(canvas, 0, 0, WIDTH, HEIGHT, source, 0, 0, SRCCOPY), 0);
        const Picture result = canvas.picture();
        EXPECT_EQ(result,
                  copied(before, {0, 0, WIDTH, HEIGHT, 0, 0}, from, SRCCOPY, turned, 0, &result, 1e-6));
        const XFORM& t = turned.world;
        const auto rows = AffineRows::create(*Affine{t.eM11, t.eM12, t.eM21, t.eM22, t.eDx, t.eDy}.inverse(),
                                             0, 0, WIDTH, HEIGHT);
        Picture portable = before;
        for (int y = 0; y < HEIGHT; ++y) {
            copy_mapped_words_portable(words, *rows, rows->row(y, WIDTH), &portable.at(0, y));
        }
        EXPECT_EQ(portable, result);
    }
}

TEST(Transform, is_refused_where_it_cannot_be) {
    Canvas canvas(Picture(8, 8, 32)), other(Picture(8, 8, 32, 5));
    const XFORM flat = {1, 2, 2, 4, 0, 0}, endless = {INFINITY, 0, 0, 1, 0, 0},
                far = {1, 0.5F, 0, 1, 3e38F, -3e38F};
    EXPECT_TRUE(refused(SetWorldTransform(canvas, &QUARTER), SetGraphicsMode(canvas, 3)))
        << "compatible mode";
    EXPECT_EQ(canvas.dc().SetGraphicsMode(GM_ADVANCED), GM_COMPATIBLE);
    EXPECT_TRUE(refused(SetWorldTransform(canvas, &flat), SetWorldTransform(canvas, &endless),
                        SetWorldTransform(canvas, nullptr), ModifyWorldTransform(canvas, &QUARTER, 4)));
    EXPECT_NE(canvas.dc().SetWorldTransform(&QUARTER), 0);
    EXPECT_EQ(SetGraphicsMode(canvas, GM_COMPATIBLE), 0) << "while a transform is set";
    EXPECT_TRUE(GetPixel(canvas, 0, 0) == CLR_INVALID && GetLastError() == ERROR_NOT_SUPPORTED);
    for (const float reduced : {1e-30F, 0x1p-30F, 0x1p-29F}) {
        const XFORM small = {reduced, 0, 0, reduced, 0, 0};
        EXPECT_NE(SetWorldTransform(canvas, &small), 0);
        EXPECT_EQ(BitBlt(canvas, 0, 0, 8, 8, other, 0, 0, SRCCOPY), reduced == 0x1p-29F);
    }
    EXPECT_NE(SetWorldTransform(canvas, &far), 0);
    EXPECT_NE(BitBlt(canvas, LOW, LOW, HIGH, HIGH, other, 0, 0, SRCCOPY), 0);
    EXPECT_EQ(canvas.picture(), Picture(8, 8, 32)) << "nothing was drawn";
}

TEST(Transform, takes_points_back_and_joins_before_or_after) {
    Canvas canvas(Picture(4, 1, 32)), source(Picture(2, 2, 32, 5));
    EXPECT_EQ(canvas.dc().SetMapMode(MM_ANISOTROPIC), MM_TEXT);
    EXPECT_TRUE(SetMapMode(canvas, 2) == 0 && canvas.dc().GetMapMode() == MM_ANISOTROPIC);
    SetGraphicsMode(canvas, GM_ADVANCED);
    constexpr XFORM A = {1, 2, 1, 3, 0, 0}, B = {2, 1, 1, 1, 0, 0}, SAME = {1, 0, 0, 1, 0, 0};
    const struct {
        XFORM first, second;
        DWORD mode;
        POINT device, logical;
    } rows[] = {{A, B, MWT_RIGHTMULTIPLY, {140, 110}, {10, 20}},
                {A, B, MWT_LEFTMULTIPLY, {70, 170}, {10, 20}},
                {QUARTER, {}, MWT_IDENTITY, {6, 1}, {6, 1}},
                {QUARTER, SAME, MWT_LEFTMULTIPLY, {6, 1}, {1, 2}}};
    for (const auto& [first, second, mode, device, logical] : rows) {
        POINT point = device;
        EXPECT_TRUE(SetWorldTransform(canvas, &first) && ModifyWorldTransform(canvas, &second, mode));
        EXPECT_TRUE(DPtoLP(canvas, &point, 1) && CPoint(point) == CPoint(logical)) << mode;
    }
    POINT points[2] = {{1, 2}, {0, 0}};
    EXPECT_NE(SetWorldTransform(canvas, &TINY), 0);
    EXPECT_TRUE(refused(DPtoLP(canvas, points, 2), DPtoLP(canvas, points, -1), DPtoLP(canvas, nullptr, 1)));
    EXPECT_EQ(points[0].x, 1) << "unchanged when another does not fit";
    EXPECT_TRUE(DPtoLP(canvas, nullptr, 0) && DPtoLP(canvas, points + 1, 1));
    ModifyWorldTransform(canvas, nullptr, MWT_IDENTITY);
    SetGraphicsMode(source, GM_ADVANCED);
    SetWorldTransform(source, &TWICE);
    EXPECT_NE(BitBlt(canvas, 1, 0, 4, 1, source, 0, 0, SRCCOPY), 0);
    EXPECT_EQ(canvas.picture().pixels, (std::vector<std::uint32_t>{0, 5, 0, 0})) << "a source's may scale";
}

TEST(Rows, need_a_header_that_fits) {
    Canvas canvas(Picture(3, 2, 32));
    std::uint32_t bits[7] = {};
    const auto get = [&](DibHeader dib, UINT first = 0, UINT usage = DIB_RGB_COLORS) {
        return GetDIBits(canvas, canvas.bitmap(), first, 2, bits, dib.info(), usage);
    };
    const auto ask = [&](UINT count, DibHeader& dib) {
        return GetDIBits(canvas, canvas.bitmap(), count, count, nullptr, dib.info(), DIB_RGB_COLORS);
    };
    DibHeader compressed(3, 2, 32), planeless = compressed, other = compressed;
    compressed.header.biCompression = 3, planeless.header.biPlanes = 0, other.header.biSize = 12;
    for (const DibHeader& bad :
         {DibHeader(4, 2, 32), DibHeader(3, 3, 32), DibHeader(3, LOW, 32), DibHeader(3, 2, 2),
          DibHeader(-3, 2, 32), DibHeader(3, 2, 0), compressed, planeless, other}) {
        EXPECT_TRUE(get(bad) == 0 && GetLastError() == ERROR_INVALID_PARAMETER);
    }
    const DibHeader good(3, -2, 32);
    EXPECT_EQ(get(good), 2);
    EXPECT_TRUE(refused(get(good, 0, 1), GetDIBits(canvas, canvas.bitmap(), 0, 2, bits, nullptr, 0)));
    SetLastError(0);
    EXPECT_TRUE(get(good, 2) == 0 && GetLastError() == ERROR_INVALID_PARAMETER) << "no such row";
    DibHeader question(0, 0, 0), sizes(3, 2, 24), expected(3, 2, 32);
    expected.header.biSizeImage = 24;
    EXPECT_TRUE(ask(0, question) == 1 && ask(1, sizes) == 1);
    EXPECT_EQ(std::memcmp(&question.header, &expected.header, sizeof expected.header), 0);
    EXPECT_EQ(sizes.header.biSizeImage, 24U) << "of all rows, each of 12 bytes";
}

TEST(Region, holds_any_coordinates_and_refuses_what_does_not_fit) {
    CRgn all, hole, copy;
    const RECT first = {0, 0, 1, 1};
    ASSERT_TRUE(all.CreateRectRgn(HIGH, HIGH, LOW, LOW) && hole.CreateRectRgnIndirect(&first));
    EXPECT_TRUE(all.PtInRegion(LOW, HIGH - 1) && !all.PtInRegion({HIGH, 0}));
    CRect box;
    EXPECT_TRUE(all.GetRgnBox(box) == SIMPLEREGION && box == CRect(LOW, LOW, HIGH, HIGH));
    EXPECT_TRUE(refused(all.OffsetRgn(1, 0), all.OffsetRgn(0, -1), all.GetRgnBox(nullptr),
                        all.CombineRgn(&all, &hole, 0), all.CombineRgn(&all, &hole, 6),
                        all.CombineRgn(&all, nullptr, RGN_OR), SetRectRgn(nullptr, 0, 0, 1, 1)));
    EXPECT_TRUE(all.CombineRgn(&all, &hole, RGN_DIFF) == COMPLEXREGION && !all.PtInRegion(0, 0));
    EXPECT_TRUE(copy.CreateRectRgn(0, 0, 0, 0) && copy.CopyRgn(&all) == COMPLEXREGION && copy.EqualRgn(&all));
    EXPECT_TRUE(hole.OffsetRgn(CPoint(HIGH - 1, -5)) == SIMPLEREGION && hole.PtInRegion(HIGH - 1, -5));
    EXPECT_FALSE(copy.EqualRgn(&hole));
    EXPECT_TRUE(hole.SetRectRgn(CRect(3, 2, 1, 1)) && hole.GetRegionData(nullptr, 0) == 48);
    RGNDATA data;
    EXPECT_EQ(hole.GetRegionData(&data, sizeof data), 0);
    EXPECT_TRUE(hole.SetRectRgn(4, 4, 4, 9) && hole.OffsetRgn(HIGH, HIGH) == NULLREGION) << "nothing to move";
}

}  // namespace
