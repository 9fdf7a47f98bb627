#include <gtest/gtest.h>

#include <climits>
#include <random>
#include <vector>

#include "basalt/platform/error.h"
#include "basalt/platform/region.h"
#include "src/platform/region_rectangles.h"

// What hosts keep levels of logging by; it stands beside the platform's names without a clash.
enum HostLevel { INFO, WARNING, ERROR };

namespace {

constexpr int SIDE = 24;

/// A region as the pixels it holds.
struct Pixels {
    bool in[SIDE][SIDE] = {};

    void add(const RECT& r) {
        for (int y = 0; y < SIDE; ++y) {
            for (int x = 0; x < SIDE; ++x) {
                in[y][x] |= x >= r.left && x < r.right && y >= r.top && y < r.bottom;
            }
        }
    }
    int kind() const {
        int count = 0;
        RECT box = {SIDE, SIDE, 0, 0};
        for (int y = 0; y < SIDE; ++y) {
            for (int x = 0; x < SIDE; ++x) {
                if (in[y][x]) {
                    ++count;
                    box = {std::min(box.left, x), std::min(box.top, y), std::max(box.right, x + 1),
                           std::max(box.bottom, y + 1)};
                }
            }
        }
        if (count == 0) {
            return NULLREGION;
        }
        return count == (box.right - box.left) * (box.bottom - box.top) ? SIMPLEREGION : COMPLEXREGION;
    }
};

void expect_pixels(HRGN region, const Pixels& pixels) {
    RECT box = {9, 9, 9, 9};
    EXPECT_EQ(GetRgnBox(region, &box), pixels.kind());
    for (int y = -1; y <= SIDE; ++y) {
        for (int x = -1; x <= SIDE; ++x) {
            const bool expected = x >= 0 && y >= 0 && x < SIDE && y < SIDE && pixels.in[y][x];
            ASSERT_EQ(PtInRegion(region, x, y), expected ? 1 : 0) << x << ' ' << y;
            if (expected) {
                EXPECT_TRUE(x >= box.left && x < box.right && y >= box.top && y < box.bottom);
            }
        }
    }
}

RECT random_rectangle(std::mt19937& random) {
    const auto coordinate = [&random] { return static_cast<int>(random() % (SIDE + 1)); };
    return {coordinate(), coordinate(), coordinate(), coordinate()};
}

TEST(Region, CombinesPixelByPixel) {
    std::mt19937 random(41);
    SCOPED_TRACE("seed 41");
    for (int round = 0; round < 200; ++round) {
        Pixels pixels[2];
        CRgn regions[2];
        for (int i = 0; i < 2; ++i) {
            regions[i].CreateRectRgn(0, 0, 0, 0);
            for (int count = 0; count < round % 5; ++count) {
                RECT r = random_rectangle(random);
                CRgn part;
                ASSERT_TRUE(part.CreateRectRgn(r.left, r.top, r.right, r.bottom));
                if (r.left > r.right) {
                    std::swap(r.left, r.right);
                }
                if (r.top > r.bottom) {
                    std::swap(r.top, r.bottom);
                }
                pixels[i].add(r);
                EXPECT_EQ(regions[i].CombineRgn(&part, &regions[i], RGN_OR), pixels[i].kind());
            }
        }
        for (int mode = RGN_AND; mode <= RGN_COPY; ++mode) {
            Pixels expected;
            for (int y = 0; y < SIDE; ++y) {
                for (int x = 0; x < SIDE; ++x) {
                    const bool a = pixels[0].in[y][x];
                    const bool b = pixels[1].in[y][x];
                    const bool results[] = {a && b, a || b, a != b, a && !b, a};
                    expected.in[y][x] = results[mode - RGN_AND];
                }
            }
            // Into a third region, and into each of the two.
            for (int into = 0; into < 3; ++into) {
                CRgn a, b, other;
                for (CRgn* const region : {&a, &b, &other}) {
                    region->CreateRectRgn(1, 2, 3, 4);
                }
                a.CopyRgn(&regions[0]);
                b.CopyRgn(&regions[1]);
                CRgn& result = into == 0 ? a : into == 1 ? b : other;
                EXPECT_EQ(result.CombineRgn(&a, &b, mode), expected.kind());
                expect_pixels(result, expected);
            }
        }
    }
}

TEST(Region, IsOneWhateverItWasMadeOf) {
    std::mt19937 random(42);
    SCOPED_TRACE("seed 42");
    for (int round = 0; round < 300; ++round) {
        std::vector<RECT> rectangles;
        Pixels pixels;
        CRgn joined;
        joined.CreateRectRgn(0, 0, 0, 0);
        for (int count = 0; count < round % 12; ++count) {
            // Reversed and empty ones hold nothing here.
            const RECT r = random_rectangle(random);
            rectangles.push_back(r);
            pixels.add(r);
        }
        std::vector<RECT> runs;
        for (int y = 0; y < SIDE; ++y) {
            for (int x = 0; x < SIDE; ++x) {
                if (pixels.in[y][x]) {
                    CRgn pixel;
                    pixel.CreateRectRgn(x, y, x + 1, y + 1);
                    joined.CombineRgn(&joined, &pixel, RGN_OR);
                    if (!runs.empty() && runs.back().top == y && runs.back().right == x) {
                        ++runs.back().right;
                    } else {
                        runs.push_back({x, y, x + 1, y + 1});
                    }
                }
            }
        }
        CRgn at_once, sorted;
        at_once.Attach(basalt::platform::create_region(rectangles));
        sorted.Attach(basalt::platform::create_region(runs));
        expect_pixels(sorted, pixels);
        EXPECT_TRUE(at_once.EqualRgn(&joined));
        EXPECT_TRUE(sorted.EqualRgn(&joined));
        CRgn more;
        more.CreateRectRgn(SIDE + 1, 0, SIDE + 2, 1);
        EXPECT_FALSE(more.EqualRgn(&joined));
    }
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
    EXPECT_EQ(all.CombineRgn(&all, &hole, RGN_AND), NULLREGION);
    EXPECT_EQ(all.GetRgnBox(&box), NULLREGION);
    EXPECT_EQ(box.left, 0);
    EXPECT_EQ(box.bottom, 0);
    EXPECT_EQ(all.GetRgnBox(nullptr), RGN_ERROR);
    EXPECT_EQ(all.CombineRgn(&all, &hole, 0), RGN_ERROR);
    EXPECT_EQ(all.CombineRgn(&all, &hole, 6), RGN_ERROR);
    EXPECT_EQ(all.CombineRgn(&all, nullptr, RGN_OR), RGN_ERROR);
    EXPECT_EQ(CRgn::FromHandle(hole)->GetSafeHandle(), hole.GetSafeHandle());
    EXPECT_EQ(CRgn::FromHandle(nullptr), nullptr);
}

TEST(Region, OfACheckerboardIsMadeAtOnce) {
    std::vector<RECT> rectangles;
    for (int y = 0; y < 400; ++y) {
        for (int x = y % 2; x < 400; x += 2) {
            rectangles.push_back({x, y, x + 1, y + 1});
        }
    }
    CRgn region;
    ASSERT_TRUE(region.Attach(basalt::platform::create_region(rectangles)));
    for (int i = 0; i < 400; ++i) {
        EXPECT_EQ(region.PtInRegion(i, 399 - i), 0);
        EXPECT_EQ(region.PtInRegion(i, i), 1);
    }
}

}  // namespace
