#include <gtest/gtest.h>

#include <cstdint>
#include <memory>
#include <new>
#include <random>
#include <vector>

#include "tests/graphics/test_surface.h"
#include "tests/support/failing_new.h"

namespace {

using namespace basalt::test;
using vex_util::mfc::GetDIBits;

using Pixels = std::unique_ptr<unsigned char[]>;

constexpr int EVERY_DEPTH[] = {1, 4, 8, 16, 24, 32};

TEST(BitmapPixels, AreTheStoredRowsTopFirstPaddedToFourBytes) {
    std::mt19937 random(81);
    SCOPED_TRACE("seed 81");
    for (const int depth : EVERY_DEPTH) {
        for (const int width : {1, 2, 3, 7, 8, 9, 15, 16, 17, 31, 32, 33, 100}) {
            SCOPED_TRACE(testing::Message() << depth << " bits, width " << width);
            const int height = 5;
            const int bits = width * depth;
            const int given_row = (bits + 15) / 16 * 2;  // rows come padded to 16 bits
            const int row = (bits + 31) / 32 * 4;
            std::vector<unsigned char> given(static_cast<std::size_t>(given_row * height));
            for (unsigned char& byte : given) {
                byte = static_cast<unsigned char>(random());
            }
            CBitmap bitmap;
            ASSERT_NE(bitmap.CreateBitmap(width, height, 1, static_cast<UINT>(depth), given.data()), 0);
            BITMAPINFOHEADER header;
            const Pixels pixels(GetDIBits(bitmap, header));
            ASSERT_NE(pixels, nullptr);
            EXPECT_EQ(header.biSize, 40U);
            EXPECT_EQ(header.biWidth, width);
            EXPECT_EQ(header.biHeight, -height);
            EXPECT_EQ(header.biPlanes, 1);
            EXPECT_EQ(header.biBitCount, depth);
            EXPECT_EQ(header.biCompression, BI_RGB);
            EXPECT_EQ(header.biSizeImage, static_cast<DWORD>(row * height));  // the platform's addition
            EXPECT_EQ(header.biXPelsPerMeter | header.biYPelsPerMeter, 0);
            EXPECT_EQ(header.biClrUsed | header.biClrImportant, 0U);
            for (int y = 0; y < height; ++y) {
                for (int bit = 0; bit < bits; ++bit) {
                    const int mask = 0x80 >> bit % 8;
                    ASSERT_EQ(pixels[static_cast<std::size_t>(y * row + bit / 8)] & mask,
                              given[static_cast<std::size_t>(y * given_row + bit / 8)] & mask)
                        << "row " << y << " bit " << bit;
                }
            }
        }
    }
}

TEST(BitmapPixels, OfNoBitmapAreNone) {
    CBitmap none;
    BITMAPINFOHEADER header;
    header.biWidth = 77;
    EXPECT_EQ(GetDIBits(none, header), nullptr);
    EXPECT_EQ(header.biSize, 40U);
    EXPECT_EQ(header.biWidth, 0);
    HBRUSH const brush = CreateSolidBrush(0);
    none.Attach(brush);
    EXPECT_EQ(GetDIBits(none, header), nullptr);
}

TEST(BitmapPixels, NeedMemory) {
    CBitmap bitmap;
    bitmap.CreateBitmap(100, 100, 1, 32, nullptr);
    BITMAPINFOHEADER header;
    for (int i = 0; i < 66000; ++i) {  // more contexts than there may be, should any be left behind
        const long live = live_allocations();
        bool thrown = false;
        {
            const FailAllocation failure(1, true);
            try {
                EXPECT_EQ(GetDIBits(bitmap, header), nullptr);
            } catch (const std::bad_alloc&) {
                thrown = true;
            }
        }
        ASSERT_EQ(live_allocations(), live);
        ASSERT_TRUE(thrown);
    }
    EXPECT_NE(Pixels(GetDIBits(bitmap, header)), nullptr);
}

}  // namespace
