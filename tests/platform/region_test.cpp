#include "basalt/platform/region.h"

#include <gtest/gtest.h>

#include <climits>
#include <random>

#include "tests/support/drawing.h"

// Hosts name levels of logging so; they stand beside the platform's names without a clash.
enum HostLevel { INFO, WARNING, ERROR };

namespace {

using namespace drawing;
constexpr int SIDE = 24;

TEST(Region, combines_pixel_by_pixel_into_its_one_form) {
    std::mt19937 random(41);
    SCOPED_TRACE("seed 41");
    const auto coordinate = [&random] { return static_cast<int>(random() % (SIDE + 1)); };
    for (int round = 0; round < 300; ++round) {
        Picture pictures[2] = {Picture(SIDE, SIDE, 1), Picture(SIDE, SIDE, 1)};
        CRgn regions[2];
        for (int i = 0; i < 2; ++i) {
            regions[i].CreateRectRgn(0, 0, 0, 0);
            for (int count = 0; count < round % 7; ++count) {
                const RECT r = {coordinate(), coordinate(), coordinate(), coordinate()};
                CRgn part;
                part.CreateRectRgnIndirect(&r);
                on(pictures[i], ordered(r), [](int, int, std::uint32_t& value) { value ^= 1; });
                regions[i].CombineRgn(&part, &regions[i], RGN_XOR);
                ASSERT_TRUE(holds(regions[i], pictures[i])) << round;
            }
        }
        EXPECT_EQ(regions[0].EqualRgn(&regions[1]), pictures[0] == pictures[1]);
        for (int mode = RGN_AND; mode <= RGN_COPY; ++mode) {
            Picture expected(SIDE, SIDE, 1);
            for (std::size_t i = 0; i < expected.pixels.size(); ++i) {
                const std::uint32_t a = pictures[0].pixels[i], b = pictures[1].pixels[i];
                const std::uint32_t results[] = {a & b, a | b, a ^ b, a & ~b, a};
                expected.pixels[i] = results[mode - RGN_AND];
            }
            for (int into = 0; into < 3; ++into) {  // each of the two, and a third
                CRgn operands[3];
                for (int i = 0; i < 3; ++i) {
                    operands[i].CreateRectRgn(1, 2, 3, 4);
                    operands[i].CopyRgn(&regions[i % 2]);
                }
                operands[into].CombineRgn(&operands[0], &operands[1], mode);
                ASSERT_TRUE(holds(operands[into], expected))
                    << round << ", mode " << mode << " into " << into;
            }
        }
    }
}

TEST(Region, holds_any_coordinates_and_refuses_what_does_not_fit) {
    CRgn all, hole;
    ASSERT_TRUE(all.CreateRectRgn(INT_MAX, INT_MAX, INT_MIN, INT_MIN) && hole.CreateRectRgn(0, 0, 1, 1));
    EXPECT_TRUE(all.PtInRegion(INT_MIN, INT_MAX - 1) && !all.PtInRegion({INT_MAX, 0}));
    CRect box;
    EXPECT_EQ(all.GetRgnBox(box), SIMPLEREGION);
    EXPECT_EQ(box, CRect(INT_MIN, INT_MIN, INT_MAX, INT_MAX));
    EXPECT_EQ(all.OffsetRgn(1, 0) + all.OffsetRgn(0, -1), RGN_ERROR);
    EXPECT_EQ(all.CombineRgn(&all, &hole, RGN_DIFF), COMPLEXREGION);
    EXPECT_FALSE(all.PtInRegion(0, 0));
    EXPECT_EQ(hole.OffsetRgn(CPoint(INT_MAX - 1, -5)), SIMPLEREGION);
    EXPECT_TRUE(hole.PtInRegion(INT_MAX - 1, -5));
    EXPECT_TRUE(hole.SetRectRgn(CRect(3, 2, 1, 1)) && holds(hole, Picture(3, 2, 1)) == 0);
    EXPECT_EQ(hole.GetRegionData(nullptr, 0), 48);
    RGNDATA data;
    EXPECT_EQ(hole.GetRegionData(&data, sizeof data), 0);
    EXPECT_EQ(all.GetRgnBox(nullptr) + all.CombineRgn(&all, &hole, 0) + all.CombineRgn(&all, &hole, 6),
              RGN_ERROR);
    EXPECT_EQ(all.CombineRgn(&all, nullptr, RGN_OR) + SetRectRgn(nullptr, 0, 0, 1, 1), RGN_ERROR);
    EXPECT_TRUE(hole.SetRectRgn(4, 4, 4, 9));
    EXPECT_EQ(hole.OffsetRgn(INT_MAX, INT_MAX), NULLREGION) << "nothing to move";
}

}  // namespace
