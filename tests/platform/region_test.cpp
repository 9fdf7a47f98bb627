#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <cstring>
#include <random>
#include <vector>

#include "basalt/platform/error.h"
#include "basalt/platform/region.h"
#include "src/platform/region_rectangles.h"
#include "tests/support/drawing.h"

// What hosts keep levels of logging by; it stands beside the platform's names without a clash.
enum HostLevel { INFO, WARNING, ERROR };

namespace {

using drawing::Picture;

constexpr int SIDE = 24;

/// That a region holds the pixels that are not 0; answers what kind of region that is.
int expect_pixels(HRGN region, const Picture& picture) {
    RECT box = {SIDE, SIDE, 0, 0};
    int count = 0;
    for (int y = 0; y < SIDE; ++y) {
        for (int x = 0; x < SIDE; ++x) {
            if (picture.at(x, y) != 0) {
                ++count;
                box = {std::min(box.left, x), std::min(box.top, y), std::max(box.right, x + 1),
                       std::max(box.bottom, y + 1)};
            }
        }
    }
    int kind = count == (box.right - box.left) * (box.bottom - box.top) ? SIMPLEREGION : COMPLEXREGION;
    if (count == 0) {
        kind = NULLREGION;
        box = {};
    }
    RECT told = {9, 9, 9, 9};
    EXPECT_EQ(GetRgnBox(region, &told), kind);
    EXPECT_EQ(std::memcmp(&told, &box, sizeof box), 0);
    drawing::expect_region(region, picture, 0);
    return kind;
}

RECT random_rectangle(std::mt19937& random) {
    const auto coordinate = [&random] { return static_cast<int>(random() % (SIDE + 1)); };
    return {coordinate(), coordinate(), coordinate(), coordinate()};
}

TEST(Region, CombinesPixelByPixel) {
    std::mt19937 random(41);
    SCOPED_TRACE("seed 41");
    for (int round = 0; round < 200; ++round) {
        Picture pictures[] = {Picture(SIDE, SIDE), Picture(SIDE, SIDE)};
        CRgn regions[2];
        for (int i = 0; i < 2; ++i) {
            regions[i].CreateRectRgn(0, 0, 0, 0);
            for (int count = 0; count < round % 5; ++count) {
                const RECT r = random_rectangle(random);
                CRgn part;
                ASSERT_TRUE(part.CreateRectRgn(r.left, r.top, r.right, r.bottom));
                drawing::fill(pictures[i], drawing::ordered(r), 1);
                const int kind = regions[i].CombineRgn(&part, &regions[i], RGN_OR);
                EXPECT_EQ(kind, expect_pixels(regions[i], pictures[i]));
            }
        }
        for (int mode = RGN_AND; mode <= RGN_COPY; ++mode) {
            Picture expected(SIDE, SIDE);
            for (std::size_t i = 0; i < expected.pixels.size(); ++i) {
                const std::uint32_t a = pictures[0].pixels[i];
                const std::uint32_t b = pictures[1].pixels[i];
                const std::uint32_t results[] = {a & b, a | b, a ^ b, a & ~b, a};
                expected.pixels[i] = results[mode - RGN_AND];
            }
            // Into a third region, and into each of the two.
            for (int into = 0; into < 3; ++into) {
                CRgn operands[3];
                for (CRgn& region : operands) {
                    region.CreateRectRgn(1, 2, 3, 4);
                }
                operands[0].CopyRgn(&regions[0]);
                operands[1].CopyRgn(&regions[1]);
                const int kind = operands[into].CombineRgn(&operands[0], &operands[1], mode);
                EXPECT_EQ(kind, expect_pixels(operands[into], expected));
            }
        }
    }
}

TEST(Region, IsOneWhateverItWasMadeOf) {
    std::mt19937 random(42);
    SCOPED_TRACE("seed 42");
    testing::internal::CaptureStderr();
    for (int round = 0; round < 300; ++round) {
        std::vector<RECT> rectangles;
        Picture picture(SIDE, SIDE);
        for (int count = 0; count < round % 12; ++count) {
            // Reversed and empty ones hold nothing here.
            rectangles.push_back(random_rectangle(random));
            drawing::fill(picture, rectangles.back(), 1);
        }
        CRgn joined;
        joined.CreateRectRgn(0, 0, 0, 0);
        for (int i = 0; i < SIDE * SIDE; ++i) {
            if (picture.at(i % SIDE, i / SIDE) != 0) {
                CRgn pixel;
                pixel.CreateRectRgn(i % SIDE, i / SIDE, i % SIDE + 1, i / SIDE + 1);
                joined.CombineRgn(&joined, &pixel, RGN_OR);
            }
        }
        CRgn at_once, more;
        at_once.Attach(basalt::platform::create_region(rectangles));
        expect_pixels(at_once, picture);
        EXPECT_TRUE(at_once.EqualRgn(&joined));
        more.CreateRectRgn(SIDE + 1, 0, SIDE + 2, 1);
        EXPECT_FALSE(more.EqualRgn(&joined));
    }
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "") << "pixman complains of a reversed rectangle";
}

TEST(Region, HoldsWhateverCoordinatesCanSay) {
    CRgn all;
    ASSERT_TRUE(all.CreateRectRgn(INT_MAX, INT_MAX, INT_MIN, INT_MIN));
    EXPECT_TRUE(all.PtInRegion(INT_MIN, INT_MAX - 1));
    EXPECT_FALSE(all.PtInRegion(INT_MAX, 0));
    RECT box = {};
    EXPECT_EQ(all.GetRgnBox(&box), SIMPLEREGION);
    EXPECT_EQ(box.left, INT_MIN);
    EXPECT_EQ(box.bottom, INT_MAX);
    CRgn hole;
    hole.CreateRectRgn(0, 0, 1, 1);
    EXPECT_EQ(all.CombineRgn(&all, &hole, RGN_DIFF), COMPLEXREGION);
    EXPECT_FALSE(all.PtInRegion(0, 0));
    EXPECT_EQ(all.GetRgnBox(nullptr), RGN_ERROR);
    EXPECT_EQ(all.CombineRgn(&all, &hole, 0), RGN_ERROR);
    EXPECT_EQ(all.CombineRgn(&all, &hole, 6), RGN_ERROR);
    EXPECT_EQ(all.CombineRgn(&all, nullptr, RGN_OR), RGN_ERROR);
    EXPECT_EQ(CRgn::FromHandle(hole)->GetSafeHandle(), hole.GetSafeHandle());
    EXPECT_EQ(CRgn::FromHandle(nullptr), nullptr);
}

}  // namespace
