// A bitmap's rows in the format of a header.
#include <gtest/gtest.h>

#include <climits>

#include "tests/support/drawing.h"

namespace {

using drawing::Canvas;
using drawing::DibHeader;
using drawing::Picture;

std::vector<unsigned char> room_for(int width, int rows, int depth) {
    return std::vector<unsigned char>(static_cast<std::size_t>((width * depth + 31) / 32 * 4 * rows), 0xA5);
}

TEST(DibRows, ComeAsStoredInEitherOrder) {
    std::mt19937 random(31);
    SCOPED_TRACE("seed 31");
    for (const int depth : drawing::DEPTHS) {
        for (const int width : {1, 2, 15, 17, 33}) {
            const Picture picture = drawing::random_picture(width, 5, depth, random);
            const Canvas canvas(picture, depth);
            for (const bool top_first : {false, true}) {
                SCOPED_TRACE(testing::Message() << depth << " bits, width " << width << ", " << top_first);
                const std::vector<unsigned char> all =
                    drawing::packed(top_first ? picture : drawing::upside_down(picture), depth, 32);
                const std::size_t row = all.size() / 5;
                const auto expect_rows = [&](UINT first, UINT asked, int there) {
                    DibHeader dib(width, top_first ? -5 : 5, depth);
                    std::vector<unsigned char> bytes = room_for(width, 5, depth);
                    std::vector<unsigned char> expected = bytes;
                    const std::size_t size = row * static_cast<std::size_t>(there);
                    std::copy_n(&all[row * first], size, expected.data());
                    EXPECT_EQ(GetDIBits(canvas, canvas.bitmap(), first, asked, bytes.data(), dib.info(), 0),
                              there);
                    EXPECT_EQ(bytes, expected) << "with zeros in the padding";
                    EXPECT_EQ(dib.header.biSizeImage, size);
                };
                expect_rows(1, 2, 2);
                expect_rows(3, UINT_MAX, 2);
                expect_rows(0, 5, 5);
            }
        }
    }
}

TEST(DibRows, BringATableWithThemAndColoursToAnotherDepth) {
    std::mt19937 random(32);
    SCOPED_TRACE("seed 32");
    for (const int from : drawing::DEPTHS) {
        const Canvas canvas(drawing::random_picture(21, 3, from, random), from);
        for (const int to : drawing::DEPTHS) {
            SCOPED_TRACE(testing::Message() << from << " to " << to << " bits");
            DibHeader dib(21, -3, to);
            dib.table[0] = {1, 2, 3, 4};
            std::vector<unsigned char> bytes = room_for(21, 3, to);
            EXPECT_EQ(GetDIBits(canvas, canvas.bitmap(), 0, 3, bytes.data(), dib.info(), DIB_RGB_COLORS), 3);
            const Canvas model(21, 3, to);
            for (int i = 0; i < 63; ++i) {
                SetPixel(model, i % 21, i / 21, GetPixel(canvas, i % 21, i / 21));
            }
            EXPECT_EQ(drawing::unpacked(bytes, 21, 3, to, 32), (from == to ? canvas : model).picture());
            for (std::uint32_t value = 0; to <= 8 && value < 1U << to; ++value) {
                const RGBQUAD& entry = dib.table[value];
                EXPECT_EQ(RGB(entry.rgbRed, entry.rgbGreen, entry.rgbBlue),
                          GetPixel(Canvas(Picture(1, 1, value), to), 0, 0));
                EXPECT_EQ(entry.rgbReserved, 0);
            }
            EXPECT_EQ(dib.table[0].rgbBlue, to <= 8 ? 0 : 1) << "a table is written at 8 bits and fewer";
        }
    }
}

TEST(ColourTable, HoldsTheSystemColours) {
    const int system_colours[20][2] = {{0, 0x000000},   {1, 0x000080},   {2, 0x008000},   {3, 0x008080},
                                       {4, 0x800000},   {5, 0x800080},   {6, 0x808000},   {7, 0xC0C0C0},
                                       {8, 0xC0DCC0},   {9, 0xF0CAA6},   {246, 0xF0FBFF}, {247, 0xA4A0A0},
                                       {248, 0x808080}, {249, 0x0000FF}, {250, 0x00FF00}, {251, 0x00FFFF},
                                       {252, 0xFF0000}, {253, 0xFF00FF}, {254, 0xFFFF00}, {255, 0xFFFFFF}};
    for (const auto& [number, colour] : system_colours) {
        const Canvas canvas(Picture(1, 1, static_cast<std::uint32_t>(number)), 8);
        EXPECT_EQ(GetPixel(canvas, 0, 0), static_cast<COLORREF>(colour));
    }
    for (std::uint32_t number = 0; number < 256; ++number) {
        const Canvas canvas(Picture(1, 1, number), 8);
        SetPixel(canvas, 0, 0, GetPixel(canvas, 0, 0));
        EXPECT_EQ(canvas.picture().at(0, 0), number) << "each colour is there once";
    }
    // Any grey is near one of the greys.
    const Canvas canvas(1, 1, 8);
    for (int grey = 0; grey < 256; ++grey) {
        EXPECT_NEAR(SetPixel(canvas, 0, 0, RGB(grey, grey, grey)) & 0xFF, grey, 5);
    }
}

TEST(DibRows, RefuseAHeaderThatDoesNotFit) {
    const Canvas canvas(3, 2, 32);
    std::uint32_t bits[7] = {};
    const auto get = [&](DibHeader dib, UINT first = 0, UINT usage = DIB_RGB_COLORS) {
        return GetDIBits(canvas, canvas.bitmap(), first, 2, bits, dib.info(), usage);
    };
    const DibHeader good(3, -2, 32);
    EXPECT_EQ(get(good), 2);
    EXPECT_EQ(get(good, 2), 0);
    EXPECT_EQ(get(good, 0, 1), 0);
    DibHeader compressed = good, planeless = good, other = good;
    compressed.header.biCompression = 3;
    planeless.header.biPlanes = 0;
    other.header.biSize = 12;
    for (const DibHeader& bad :
         {DibHeader(4, 2, 32), DibHeader(3, 3, 32), DibHeader(3, INT_MIN, 32), DibHeader(3, 2, 2),
          DibHeader(-3, 2, 32), DibHeader(3, 2, 0), compressed, planeless, other}) {
        EXPECT_EQ(get(bad), 0);
        EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);
    }
    EXPECT_EQ(GetDIBits(canvas, canvas.bitmap(), 0, 2, bits, nullptr, DIB_RGB_COLORS), 0);
    DibHeader question(0, 0, 0);
    EXPECT_EQ(GetDIBits(canvas, canvas.bitmap(), 0, 0, nullptr, question.info(), DIB_RGB_COLORS), 1);
    EXPECT_EQ(question.header.biWidth, 3);
    EXPECT_EQ(question.header.biHeight, 2);
    EXPECT_EQ(question.header.biBitCount, 32);
    EXPECT_EQ(question.header.biSizeImage, 24U);
    DibHeader size_only(3, 2, 24);
    EXPECT_EQ(GetDIBits(canvas, canvas.bitmap(), 1, 1, nullptr, size_only.info(), DIB_RGB_COLORS), 1);
    EXPECT_EQ(size_only.header.biSizeImage, 24U) << "of all rows, each of 12 bytes";
    EXPECT_EQ(bits[6], 0U);
}

}  // namespace
