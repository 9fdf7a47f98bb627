#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <string>
#include <vector>

#include "basalt/geo.h"
#include "tests/geo/plain_forms.h"

namespace {

using namespace plain;

TEST(PointOnLine, FactsOfARunToTheEast) {
    const geo_nee a = {0, 0, 0};
    const geo_nee b = {0, 10, 0};
    EXPECT_EQ(geo_point_on_line(a, b, {-0.005, 5, 7}, 0.01), 1);
    EXPECT_EQ(geo_point_on_line(a, b, {0.02, 5, 0}, 0.01), 0);
    EXPECT_EQ(geo_point_on_line(a, b, {0, 10.01, 0}, 0.01), 1);
    EXPECT_EQ(geo_point_on_line(a, b, {0, 10.02, 0}, 0.01), 0);
    EXPECT_EQ(geo_point_on_line(a, b, {0, -0.02, 0}, 0.01), 0);
    EXPECT_EQ(geo_point_on_line(a, b, a, 0.0), 1);
    EXPECT_EQ(geo_point_on_line(a, b, a, NOT_A_NUMBER), 0);
    EXPECT_EQ(geo_point_on_line(a, a, {0.9, -0.9, 0}, 1.0), 1);
}

TEST(PointOnPolyline, ClosesTheChain) {
    const std::vector<geo_nee> v = {{0, 0, 0}, {0, 10, 0}, {10, 10, 0}};
    const auto on = [&](const geo_nee& p, double tolerance) {
        return geo_point_on_polyline(3, v.data(), &p, tolerance);
    };
    EXPECT_EQ(on({5, 5, 0}, 0.001), 1);
    EXPECT_EQ(on({0.5, 5, 0}, 0.5), 0) << "the tolerance is exclusive";
    EXPECT_EQ(on({0, 10, 0}, -1.0), 1) << "a vertex matches exactly";
    EXPECT_EQ(on({0, -0.5, 0}, 1.0), 0) << "ends count through |PA|^2 and |PB|^2, not as caps";
    EXPECT_EQ(geo_point_on_polyline(1, v.data(), &v[0], 0.0), 1);
    EXPECT_EQ(geo_point_on_polyline(1, v.data(), &v[1], 100.0), 0);
    EXPECT_EQ(geo_point_on_polyline(0, nullptr, nullptr, 1.0), 0);
    EXPECT_EQ(geo_point_on_polyline(-5, nullptr, nullptr, 1.0), 0);
}

TEST(LinesCross, FactsOfSides) {
    EXPECT_EQ(geo_lines_cross({0, 0, 0}, {10, 10, 0}, {0, 10, 0}, {10, 0, 0}), 1);
    EXPECT_EQ(geo_lines_cross({0, 0, 0}, {10, 0, 0}, {1, 0, 0}, {5, 0, 0}), 0);
    // A touch from the right of the eastward line counts, one from its left does not.
    EXPECT_EQ(geo_lines_cross({0, 0, 0}, {0, 10, 0}, {-5, 5, 0}, {0, 5, 0}), 1);
    EXPECT_EQ(geo_lines_cross({0, 0, 0}, {0, 10, 0}, {5, 5, 0}, {0, 5, 0}), 0);
}

TEST(LinePredicates, AgreeWithThePlainFormsOnAwkwardInput) {
    const std::uint64_t seed = 31337;
    SCOPED_TRACE("seed " + std::to_string(seed));
    Random random(seed);
    const double tolerances[] = {0.0, 1e-9, 0.5, 1.0, 1e300, -1.0, INF, NOT_A_NUMBER};
    for (int round = 0; round < 100000; ++round) {
        std::vector<geo_nee> v(static_cast<std::size_t>(4 + random.below(5)));
        for (geo_nee& vertex : v) {
            vertex = {random.awkward(), random.awkward(), NOT_A_NUMBER};
        }
        const geo_nee p = {random.awkward(), random.awkward(), NOT_A_NUMBER};
        const double tolerance = tolerances[random.below(8)];
        const int n = 1 + random.below(static_cast<int>(v.size()));
        SCOPED_TRACE(round);
        ASSERT_EQ(geo_point_on_polyline(n, v.data(), &p, tolerance),
                  plain::point_on_polyline(n, v.data(), p, tolerance));
        ASSERT_EQ(geo_point_on_line(v[0], v[1], p, tolerance),
                  plain::point_on_line(v[0], v[1], p, tolerance));
        ASSERT_EQ(geo_lines_cross(v[0], v[1], v[2], v[3]), plain::lines_cross(v[0], v[1], v[2], v[3]));
    }
}

}  // namespace
