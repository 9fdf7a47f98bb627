#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>
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

TEST(BitmapPixels, AreTheStoredRowsTopFirstPaddedToFourBytes) {
    std::mt19937 random(81);
    SCOPED_TRACE("seed 81");
    for (const int depth : drawing::DEPTHS) {
        for (const int width : {1, 2, 3, 7, 8, 9, 15, 16, 17, 31, 32, 33, 100}) {
            SCOPED_TRACE(testing::Message() << depth << " bits, width " << width);
            // Rows come padded to 16 bits, with anything in the padding.
            std::vector<unsigned char> given(drawing::packed(Picture(width, 5), depth, 16).size());
            std::generate(given.begin(), given.end(), [&] { return static_cast<unsigned char>(random()); });
            CBitmap bitmap;
            ASSERT_NE(bitmap.CreateBitmap(width, 5, 1, static_cast<UINT>(depth), given.data()), 0);
            BITMAPINFOHEADER header;
            const Pixels pixels(GetDIBits(bitmap, header));
            ASSERT_NE(pixels, nullptr);
            drawing::DibHeader expected(width, -5, depth);
            expected.header.biSizeImage =
                static_cast<DWORD>((width * depth + 31) / 32 * 4 * 5);  // the platform's addition
            EXPECT_EQ(std::memcmp(&header, &expected.header, sizeof header), 0);
            const std::vector bytes(pixels.get(), pixels.get() + expected.header.biSizeImage);
            EXPECT_EQ(drawing::unpacked(bytes, width, 5, depth, 32),
                      drawing::unpacked(given, width, 5, depth, 16));
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
