// Facts about regions; fuzz/drawing compares their combinations with a picture.
#include "basalt/platform/region.h"

#include <gtest/gtest.h>

#include <climits>

#include "tests/support/drawing.h"

// Hosts name levels of logging so; they stand beside the platform's names without a clash.
enum HostLevel { INFO, WARNING, ERROR };

namespace {

using namespace drawing;

TEST(Region, holds_any_coordinates_and_refuses_what_does_not_fit) {
    CRgn all, hole, copy;
    const RECT first = {0, 0, 1, 1};
    ASSERT_TRUE(all.CreateRectRgn(INT_MAX, INT_MAX, INT_MIN, INT_MIN) && hole.CreateRectRgnIndirect(&first));
    EXPECT_TRUE(all.PtInRegion(INT_MIN, INT_MAX - 1) && !all.PtInRegion({INT_MAX, 0}));
    CRect box;
    EXPECT_EQ(all.GetRgnBox(box), SIMPLEREGION);
    EXPECT_EQ(box, CRect(INT_MIN, INT_MIN, INT_MAX, INT_MAX));
    EXPECT_TRUE(refused(all.OffsetRgn(1, 0), all.OffsetRgn(0, -1), all.GetRgnBox(nullptr),
                        all.CombineRgn(&all, &hole, 0), all.CombineRgn(&all, &hole, 6),
                        all.CombineRgn(&all, nullptr, RGN_OR), SetRectRgn(nullptr, 0, 0, 1, 1)));
    EXPECT_EQ(all.CombineRgn(&all, &hole, RGN_DIFF), COMPLEXREGION);
    EXPECT_FALSE(all.PtInRegion(0, 0));
    EXPECT_TRUE(copy.CreateRectRgn(0, 0, 0, 0) && copy.CopyRgn(&all) == COMPLEXREGION && copy.EqualRgn(&all));
    EXPECT_EQ(hole.OffsetRgn(CPoint(INT_MAX - 1, -5)), SIMPLEREGION);
    EXPECT_TRUE(hole.PtInRegion(INT_MAX - 1, -5) && !copy.EqualRgn(&hole));
    EXPECT_TRUE(hole.SetRectRgn(CRect(3, 2, 1, 1)) && hole.GetRegionData(nullptr, 0) == 48);
    RGNDATA data;
    EXPECT_EQ(hole.GetRegionData(&data, sizeof data), 0);
    EXPECT_TRUE(hole.SetRectRgn(4, 4, 4, 9));
    EXPECT_EQ(hole.OffsetRgn(INT_MAX, INT_MAX), NULLREGION) << "nothing to move";
}

}  // namespace
