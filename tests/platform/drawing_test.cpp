// Facts about pixels, fills, copies, transforms and rows; fuzz/drawing compares random calls with the picture
// model.
#include <gtest/gtest.h>

#include <climits>
#include <cmath>
#include <random>

#include "src/platform/pixels/keyed_copy.h"
#include "tests/support/drawing.h"

namespace {

using namespace drawing;

const HBRUSH WHITE = static_cast<HBRUSH>(GetStockObject(WHITE_BRUSH));
TEST(Pixel, takes_the_nearest_colour_of_its_depth) {
    const struct {
        int depth;
        COLORREF drawn;
        std::uint32_t stored;
        COLORREF colour;
    } facts[] = {{32, 0xFF332211, 0x112233, 0x332211}, {24, 0x332211, 0x112233, 0x332211},
                 {16, 0x000004, 0, 0x000000},          {16, 0x000005, 1 << 10, 0x000008},
                 {16, 0x808080, 0x4210, 0x848484},     {8, 0x0000FE, 249, 0x0000FF},
                 {8, 0x336699, 127, 0x336699},         {4, 0x0000F0, 9, 0x0000FF},
                 {4, 0x909090, 8, 0x808080},           {1, 0x7F7F7F, 0, 0x000000},
                 {1, 0x808080, 1, 0xFFFFFF},           {16, 0xFFFFFF, 0x7FFF, 0xFFFFFF}};
    for (const auto& fact : facts) {
        SCOPED_TRACE(testing::Message() << fact.depth << " bits, " << std::hex << fact.drawn);
        Canvas canvas(Picture(19, 2, fact.depth));
        Picture expected(19, 2, fact.depth);
        for (const int x : {0, 7, 8, 18}) {
            EXPECT_EQ(canvas.dc().SetPixel(x, 1, fact.drawn), fact.colour);
            EXPECT_EQ(canvas.dc().GetPixel({x, 1}), fact.colour);
            expected.at(x, 1) = fact.stored;
        }
        EXPECT_EQ(canvas.picture(), expected);
        EXPECT_EQ(SetPixel(canvas, 19, 0, 0) & GetPixel(canvas, 0, -1), CLR_INVALID);
    }
    const Canvas unused(Picture(1, 1, 32, 0xAB332211));
    EXPECT_EQ(GetPixel(unused, 0, 0), 0x112233U);
    EXPECT_EQ(unused.picture().at(0, 0), 0xAB332211U) << "the unused byte is kept";
}

TEST(ColourTable, holds_the_system_colours_once_and_a_grey_near_any) {
    const COLORREF system[] = {0x000000, 0x000080, 0x008000, 0x008080, 0x800000, 0x800080, 0x808000,
                               0xC0C0C0, 0xC0DCC0, 0xF0CAA6, 0xF0FBFF, 0xA4A0A0, 0x808080, 0x0000FF,
                               0x00FF00, 0x00FFFF, 0xFF0000, 0xFF00FF, 0xFFFF00, 0xFFFFFF};
    const COLORREF* const last = system + 20;
    EXPECT_TRUE(std::equal(system, system + 10, table(8).begin()) &&
                std::equal(system + 10, last, table(8).end() - 10));
    EXPECT_TRUE(std::equal(system, system + 7, table(4).begin()) && table(4)[7] == 0xC0C0C0);
    EXPECT_TRUE(std::equal(system + 12, last, table(4).begin() + 8));
    EXPECT_EQ(table(1), (std::vector<COLORREF>{0, 0xFFFFFF}));
    for (std::uint32_t i = 0; i < 256; ++i) {
        EXPECT_EQ(value_of(8, table(8)[i]), i) << "each colour once";
        EXPECT_NEAR(table(8)[value_of(8, i * 0x010101)] & 0xFF, i, 5);
    }
}

TEST(Fill, takes_stock_brushes_and_colours) {
    Canvas canvas(Picture(2, 1, 32));
    canvas.dc().FillSolidRect(CRect(0, 0, 1, 2), 0x0000FF);
    const COLORREF greys[] = {0xFFFFFF, 0xC0C0C0, 0x808080, 0x404040, 0, 0};  // the last brush draws nothing
    for (int stock = WHITE_BRUSH; stock <= NULL_BRUSH; ++stock) {
        CBrush* const brush = CBrush::FromHandle(static_cast<HBRUSH>(GetStockObject(stock)));
        canvas.dc().FillRect(CRect(1, 0, 9, 9), brush);
        EXPECT_EQ(canvas.picture().pixels, (std::vector<std::uint32_t>{0xFF0000, greys[stock]}));
    }
    EXPECT_EQ(FillRect(canvas, nullptr, WHITE), 0);
    const RECT all = {INT_MIN, INT_MIN, INT_MAX, INT_MAX};
    EXPECT_NE(FillRect(canvas, &all, WHITE), 0);
    EXPECT_EQ(GetPixel(canvas, 0, 0), 0xFFFFFFU);
    EXPECT_NE(RoundRect(canvas, INT_MIN, INT_MIN, INT_MAX, INT_MAX, INT_MIN, INT_MAX), 0);
}

TEST(Gradient, refuses_what_it_cannot_draw_as_a_whole) {
    Canvas canvas(Picture(4, 4, 32));
    const TRIVERTEX corners[2] = {{0, 0, 0xFF00, 0, 0, 0}, {4, 4, 0xFF00, 0, 0, 0}};
    const GRADIENT_RECT meshes[2] = {{0, 1}, {0, 2}};
    EXPECT_EQ(GradientFill(canvas, corners, 2, meshes, 2, 0), 0) << "not even the first rectangle";
    EXPECT_EQ(GradientFill(canvas, corners, 2, meshes, 1, 2), 0);
    EXPECT_EQ(GradientFill(canvas, nullptr, 2, meshes, 1, 0), 0);
    EXPECT_EQ(GradientFill(canvas, corners, 2, nullptr, 1, 0), 0);
    EXPECT_EQ(canvas.picture(), Picture(4, 4, 32));
    EXPECT_NE(canvas.dc().GradientFill(corners, 2, meshes, 0, 0), 0);
}

TEST(Copy, goes_to_any_coordinates_by_five_operations) {
    const Picture before(9, 6, 32, 3);
    Canvas canvas(before), source(Picture(9, 6, 32, 5));
    constexpr int LOW = INT_MIN, HIGH = INT_MAX;
    for (const Block& b : {Block{LOW, LOW, HIGH, HIGH, LOW, LOW}, Block{HIGH, 0, HIGH, 9, LOW, 0}}) {
        EXPECT_NE(BitBlt(canvas, b.x, b.y, b.width, b.height, source, b.source_x, b.source_y, SRCCOPY), 0);
    }
    EXPECT_NE(TransparentBlt(canvas, LOW, LOW, HIGH, HIGH, source, LOW, 0, 9, HIGH, 0), 0);
    EXPECT_EQ(canvas.dc().BitBlt(0, 0, 1, 1, &source.dc(), 0, 0, 0x00F00021), 0) << "with a brush";
    EXPECT_EQ(TransparentBlt(canvas, 0, 0, 1, 1, canvas, 0, 0, 1, -1, 0), 0);
    EXPECT_EQ(canvas.picture(), before);
    EXPECT_NE(TransparentBlt(canvas, 0, 0, HIGH, HIGH, source, 0, 0, HIGH, HIGH, 0xFF000000), 0);
    EXPECT_NE(BitBlt(canvas, -1000, -1000, HIGH, HIGH, source, -1000, -1001, SRCPAINT), 0);
    EXPECT_EQ(canvas.picture(), source.picture());
}

TEST(Copy, within_a_surface_reads_before_it_writes) {
    std::mt19937 random(13);
    SCOPED_TRACE("seed 13");
    for (const int depth : {1, 4, 24, 32}) {
        const Picture before = random_picture(1500, 6, depth, random);
        for (const Block& b :
             {Block{1, 0, 1499, 6, 0, 0}, Block{0, 0, 1499, 6, 1, 0}, Block{3, 2, 1490, 4, 0, 0},
              Block{0, 0, 1490, 4, 3, 2}, Block{0, 1, 1490, 4, 3, 0}}) {
            for (const DWORD rop : {SRCCOPY, SRCINVERT}) {
                Canvas canvas(before);
                BitBlt(canvas, b.x, b.y, b.width, b.height, canvas, b.source_x, b.source_y, rop);
                EXPECT_EQ(canvas.picture(), copied(before, b, before, rop)) << depth << " bits, at " << b.x;
            }
        }
    }
}

TEST(Copy, kernels_agree) {
    std::mt19937 random(16);
    SCOPED_TRACE("seed 16");
    for (std::size_t count = 0; count < 70; ++count) {
        std::vector<std::uint32_t> from(count), to(count + 1, 0x55555555), plain = to, portable = to;
        for (std::size_t i = 0; i < count; ++i) {
            from[i] = static_cast<std::uint32_t>(random()) & (count % 3 == 0 ? 0x03000001U : 0x01000001U);
            plain[i] = (from[i] & 0xFFFFFF) != 1 ? from[i] : plain[i];
        }
        basalt::platform::copy_words_but_key(to.data(), from.data(), count, 0xFF000001);
        basalt::platform::copy_words_but_key_portable(portable.data(), from.data(), count, 0xFF000001);
        EXPECT_TRUE(to == plain && portable == plain);
    }
}

constexpr XFORM QUARTER = {0, 1, -1, 0, 8, 0}, TWICE = {2, 0, 0, 2, 0, 0};

TEST(Transform, is_refused_where_it_cannot_be) {
    Canvas canvas(Picture(8, 8, 32));
    const XFORM flat = {1, 2, 2, 4, 0, 0}, endless = {INFINITY, 0, 0, 1, 0, 0};
    EXPECT_EQ(SetWorldTransform(canvas, &QUARTER), 0) << "in the compatible mode";
    EXPECT_EQ(canvas.dc().SetGraphicsMode(3), 0);
    EXPECT_EQ(canvas.dc().SetGraphicsMode(GM_ADVANCED), GM_COMPATIBLE);
    EXPECT_EQ(SetWorldTransform(canvas, &flat) + SetWorldTransform(canvas, &endless) +
                  SetWorldTransform(canvas, nullptr),
              0);
    EXPECT_EQ(ModifyWorldTransform(canvas, &QUARTER, 4), 0);
    EXPECT_NE(canvas.dc().SetWorldTransform(&QUARTER), 0);
    EXPECT_EQ(SetGraphicsMode(canvas, GM_COMPATIBLE), 0) << "while a transform is set";
    const TRIVERTEX corners[] = {{0, 0, 0xFF00, 0, 0, 0}, {4, 4, 0xFF00, 0, 0, 0}};
    const GRADIENT_RECT mesh = {0, 1};
    const RECT all = {0, 0, 8, 8};
    EXPECT_EQ(FillRect(canvas, &all, WHITE) + RoundRect(canvas, 0, 0, 4, 4, 1, 1) +
                  GradientFill(canvas, corners, 2, &mesh, 1, 0) +
                  TransparentBlt(canvas, 0, 0, 4, 4, canvas, 0, 0, 4, 4, 0),
              0);
    EXPECT_EQ(SetPixel(canvas, 0, 0, 1) & GetPixel(canvas, 0, 0), CLR_INVALID);
    EXPECT_EQ(GetLastError(), ERROR_NOT_SUPPORTED);
    Canvas other(Picture(8, 8, 32, 5));
    EXPECT_EQ(BitBlt(other, 0, 0, 4, 4, canvas, 0, 0, SRCCOPY), 0) << "from a turned source";
    for (const float reduced : {1e-30F, 0x1p-30F, 0x1p-29F}) {
        const XFORM small = {reduced, 0, 0, reduced, 0, 0};
        EXPECT_NE(SetWorldTransform(canvas, &small), 0);
        EXPECT_EQ(BitBlt(canvas, 0, 0, 8, 8, other, 0, 0, SRCCOPY), reduced == 0x1p-29F);
    }
    const XFORM far = {1, 0.5F, 0, 1, 3e38F, -3e38F};
    EXPECT_NE(SetWorldTransform(canvas, &far), 0);
    EXPECT_NE(BitBlt(canvas, INT_MIN, INT_MIN, INT_MAX, INT_MAX, other, 0, 0, SRCCOPY), 0);
    EXPECT_EQ(canvas.picture(), Picture(8, 8, 32)) << "nothing was drawn";
}

TEST(Transform, takes_points_back_and_joins_before_or_after) {
    Canvas canvas(Picture(8, 8, 32));
    EXPECT_EQ(canvas.dc().SetMapMode(MM_ANISOTROPIC), MM_TEXT);
    EXPECT_EQ(SetMapMode(canvas, 2), 0);
    EXPECT_EQ(canvas.dc().GetMapMode(), MM_ANISOTROPIC);
    SetGraphicsMode(canvas, GM_ADVANCED);
    const struct {
        XFORM first, second;
        DWORD mode;
        POINT device, logical;
    } facts[] = {{{1, 2, 1, 3, 0, 0}, {2, 1, 1, 1, 0, 0}, MWT_RIGHTMULTIPLY, {140, 110}, {10, 20}},
                 {{1, 2, 1, 3, 0, 0}, {2, 1, 1, 1, 0, 0}, MWT_LEFTMULTIPLY, {70, 170}, {10, 20}},
                 {QUARTER, {}, MWT_IDENTITY, {6, 1}, {6, 1}},
                 {QUARTER, {1, 0, 0, 1, 0, 0}, MWT_LEFTMULTIPLY, {6, 1}, {1, 2}}};
    for (const auto& fact : facts) {
        EXPECT_NE(SetWorldTransform(canvas, &fact.first), 0);
        EXPECT_NE(ModifyWorldTransform(canvas, &fact.second, fact.mode), 0);
        POINT point = fact.device;
        EXPECT_NE(DPtoLP(canvas, &point, 1), 0);
        EXPECT_EQ(CPoint(point), CPoint(fact.logical)) << fact.mode;
    }
    const XFORM tiny = {1e-30F, 0, 0, 1e-30F, 0, 0};
    EXPECT_NE(SetWorldTransform(canvas, &tiny), 0);
    POINT points[2] = {{1, 2}, {0, 0}};
    EXPECT_EQ(DPtoLP(canvas, points, 2) + DPtoLP(canvas, points, -1) + DPtoLP(canvas, nullptr, 1), 0);
    EXPECT_EQ(points[0].x, 1) << "unchanged when another does not fit";
    EXPECT_NE(DPtoLP(canvas, nullptr, 0) + DPtoLP(canvas, points + 1, 1), 0);
}

TEST(Transform, of_a_source_may_scale) {
    Canvas canvas(Picture(4, 1, 32)), source(Picture(2, 2, 32, 5));
    SetGraphicsMode(source, GM_ADVANCED);
    SetWorldTransform(source, &TWICE);
    EXPECT_NE(BitBlt(canvas, 1, 0, 4, 1, source, 0, 0, SRCCOPY), 0);
    EXPECT_EQ(canvas.picture().pixels, (std::vector<std::uint32_t>{0, 5, 0, 0}));
}

TEST(Rows, need_a_header_that_fits) {
    Canvas canvas(Picture(3, 2, 32));
    std::uint32_t bits[7] = {};
    const auto get = [&](DibHeader dib, UINT first = 0, UINT usage = DIB_RGB_COLORS) {
        return GetDIBits(canvas, canvas.bitmap(), first, 2, bits, dib.info(), usage);
    };
    DibHeader compressed(3, 2, 32), planeless(3, 2, 32), other(3, 2, 32), question(0, 0, 0),
        size_only(3, 2, 24);
    compressed.header.biCompression = 3;
    planeless.header.biPlanes = 0;
    other.header.biSize = 12;
    for (const DibHeader& bad :
         {DibHeader(4, 2, 32), DibHeader(3, 3, 32), DibHeader(3, INT_MIN, 32), DibHeader(3, 2, 2),
          DibHeader(-3, 2, 32), DibHeader(3, 2, 0), compressed, planeless, other}) {
        EXPECT_EQ(get(bad), 0);
        EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);
    }
    EXPECT_EQ(get(DibHeader(3, -2, 32), 0, 1) + GetDIBits(canvas, canvas.bitmap(), 0, 2, bits, nullptr, 0),
              0);
    EXPECT_EQ(get(DibHeader(3, -2, 32)), 2);
    EXPECT_EQ(GetDIBits(canvas, canvas.bitmap(), 0, 0, nullptr, question.info(), DIB_RGB_COLORS), 1);
    EXPECT_TRUE(question.header.biWidth == 3 && question.header.biHeight == 2 &&
                question.header.biBitCount == 32);
    EXPECT_EQ(question.header.biSizeImage, 24U);
    EXPECT_EQ(GetDIBits(canvas, canvas.bitmap(), 1, 1, nullptr, size_only.info(), DIB_RGB_COLORS), 1);
    EXPECT_EQ(size_only.header.biSizeImage, 24U) << "of all rows, each of 12 bytes";
}

}  // namespace
