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
constexpr RECT EDGES[] = {
    {2, 1, 13, 4},  {0, 0, 1, 1},  {-5, -5, 9, 3},          {5, 2, 99, 99},
    {3, 3, 3, 5},   {9, 3, 2, 5},  {-9, -9, -1, -1},        {INT_MIN, INT_MIN, INT_MAX, INT_MAX},
    {16, 0, 20, 6}, {7, 0, 16, 6}, {INT_MAX, 0, INT_MIN, 3}};

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

TEST(Fill, ends_before_its_last_sides_and_at_the_surface) {
    for (const int depth : DEPTHS) {
        for (const RECT& r : EDGES) {
            SCOPED_TRACE(testing::Message() << depth << " bits, " << r.left << ' ' << r.top);
            Picture expected(17, 6, depth);
            Canvas canvas(expected);
            Canvas rounded(expected);
            EXPECT_NE(FillRect(canvas, &r, WHITE), 0);
            EXPECT_NE(RoundRect(rounded, r.left, r.top, r.right, r.bottom, 0, -9), 0);
            on(expected, r, [&](int, int, std::uint32_t& value) { value = value_of(depth, 0xFFFFFF); });
            EXPECT_EQ(canvas.picture(), expected);
            on(expected, ordered(r),
               [&](int, int, std::uint32_t& value) { value = value_of(depth, 0xFFFFFF); });
            EXPECT_EQ(rounded.picture(), expected) << "opposite sides may be swapped";
        }
    }
    Canvas canvas(Picture(2, 2, 32));
    canvas.dc().FillSolidRect(CRect(0, 0, 1, 2), 0x0000FF);
    EXPECT_EQ(canvas.picture().pixels, (std::vector<std::uint32_t>{0xFF0000, 0, 0xFF0000, 0}));
    const COLORREF greys[] = {0xFFFFFF, 0xC0C0C0, 0x808080, 0x404040, 0, 0};  // the last brush draws nothing
    for (int stock = WHITE_BRUSH; stock <= NULL_BRUSH; ++stock) {
        canvas.dc().FillRect(CRect(1, 0, 2, 1),
                             CBrush::FromHandle(static_cast<HBRUSH>(GetStockObject(stock))));
        EXPECT_EQ(GetPixel(canvas, 1, 0), greys[stock]);
    }
    EXPECT_EQ(FillRect(canvas, nullptr, WHITE), 0);
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

TEST(Copy, reads_before_it_writes_and_at_any_coordinates) {
    std::mt19937 random(13);
    SCOPED_TRACE("seed 13");
    const Block blocks[] = {{1, 0, 1499, 6, 0, 0},
                            {0, 0, 1499, 6, 1, 0},
                            {3, 2, 1490, 4, 0, 0},
                            {0, 0, 1490, 4, 3, 2},
                            {0, 1, 1490, 4, 3, 0},
                            {600, 0, 900, 6, 0, 0},
                            {4, 4, -3, -3, 0, 0},
                            {INT_MIN, INT_MIN, INT_MAX, INT_MAX, INT_MIN, INT_MIN},
                            {INT_MAX, 0, INT_MAX, 9, INT_MIN, 0},
                            {-1000, -1000, INT_MAX, INT_MAX, -1000, -1001}};
    const Stretch stretches[] = {{0, 0, INT_MAX, INT_MAX, 0, 0, INT_MAX, INT_MAX},
                                 {2, 1, 700, 4, 0, 0, 1400, 5},
                                 {INT_MIN, INT_MIN, INT_MAX, INT_MAX, INT_MIN, 0, 9, INT_MAX},
                                 {-1000, -1000, INT_MAX, 2000, 0, 0, INT_MAX, 9}};
    for (const int depth : {1, 4, 24, 32}) {
        const Picture before = random_picture(1500, 6, depth, random);
        for (const DWORD rop : {SRCCOPY, SRCINVERT}) {
            for (const Block& b : blocks) {
                Canvas canvas(before);
                EXPECT_NE(BitBlt(canvas, b.x, b.y, b.width, b.height, canvas, b.source_x, b.source_y, rop),
                          0);
                EXPECT_EQ(canvas.picture(), copied(before, b, before, rop)) << depth << " bits, at " << b.x;
            }
        }
        for (const Stretch& s : stretches) {
            Canvas canvas(before);
            EXPECT_NE(TransparentBlt(canvas, s.x, s.y, s.width, s.height, canvas, s.source_x, s.source_y,
                                     s.source_width, s.source_height, 0xFF000000),
                      0);
            EXPECT_EQ(canvas.picture(), keyed(before, s, before, 0)) << depth << " bits, to " << s.x;
        }
    }
    Canvas canvas(Picture(1, 1, 32, 3));
    EXPECT_EQ(canvas.dc().BitBlt(0, 0, 1, 1, &canvas.dc(), 0, 0, 0x00F00021), 0)
        << "no operation with a brush";
    EXPECT_EQ(TransparentBlt(canvas, 0, 0, 1, 1, canvas, 0, 0, 1, -1, 0), 0);
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

constexpr XFORM QUARTER = {0, 1, -1, 0, 8, 0}, SHIFT = {1, 0, 0, 1, 2, -3}, TWICE = {2, 0, 0, 2, 0, 0};

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

TEST(Transform, by_whole_pixels_is_a_shift_for_every_call) {
    Picture expected(8, 8, 32, 7);
    Canvas canvas(expected), source(Picture(8, 8, 32, 5));
    for (Canvas* const each : {&canvas, &source}) {
        SetGraphicsMode(*each, GM_ADVANCED);
        EXPECT_NE(SetWorldTransform(*each, &SHIFT), 0);
    }
    const RECT r = {0, 3, 2, 4};
    EXPECT_NE(FillRect(canvas, &r, WHITE), 0);
    expected.at(2, 0) = expected.at(3, 0) = 0xFFFFFF;
    EXPECT_EQ(SetPixel(canvas, 4, 5, 0xFF), 0xFFU);
    expected.at(6, 2) = 0xFF0000;
    EXPECT_NE(BitBlt(canvas, 2, 4, 1, 9, source, -2, 9, SRCCOPY), 0) << "rows 6 and 7 of the source";
    expected.at(4, 1) = expected.at(4, 2) = 5;
    EXPECT_NE(TransparentBlt(canvas, 0, 8, 1, 1, source, 0, 4, 1, 1, 0), 0);
    expected.at(2, 5) = 5;
    EXPECT_EQ(canvas.picture(), expected);
    EXPECT_NE(SetWorldTransform(source, &TWICE), 0);
    SetPixel(canvas, 0, 3, 0);
    EXPECT_NE(BitBlt(canvas, 0, 3, 4, 1, source, 0, 0, SRCCOPY), 0) << "a source may be scaled";
    EXPECT_EQ(canvas.picture().at(5, 0), 5U);
}

TEST(Rows, come_as_stored_in_either_order_and_colours_in_another_depth) {
    std::mt19937 random(31);
    SCOPED_TRACE("seed 31");
    for (const int from : DEPTHS) {
        const Picture picture = random_picture(17, 5, from, random);
        Canvas canvas(picture);
        for (const int to : DEPTHS) {
            for (const int height : {5, -5}) {
                Picture rows(17, 5, to);
                on(rows, {0, 0, 17, 5}, [&](int x, int y, std::uint32_t& value) {
                    const std::uint32_t stored = picture.at(x, height < 0 ? y : 4 - y);
                    value = from == to ? stored : value_of(to, colour_of(from, stored));
                });
                const Bytes all = packed(rows, 32);
                const std::size_t row = all.size() / 5;
                const struct {
                    UINT first, count;
                    int there;
                } parts[] = {{0, 5, 5}, {1, 2, 2}, {3, UINT_MAX, 2}, {5, 1, 0}};
                for (const auto& part : parts) {
                    SCOPED_TRACE(testing::Message() << from << " to " << to << " bits, from " << part.first);
                    DibHeader dib(17, height, to);
                    Bytes bytes(all.size(), 0xA5), expected = bytes;
                    std::copy_n(all.begin() + static_cast<long>(row * part.first),
                                row * static_cast<std::size_t>(part.there), expected.begin());
                    EXPECT_EQ(GetDIBits(canvas, canvas.bitmap(), part.first, part.count, bytes.data(),
                                        dib.info(), 0),
                              part.there);
                    EXPECT_EQ(bytes, expected) << "with zeros in the padding";
                    EXPECT_EQ(dib.header.biSizeImage, row * static_cast<std::size_t>(part.there));
                }
            }
        }
    }
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
