// Polygons, frames and arrays: beside fuzz/geometry.cpp, which compares them with the single calls.
#include <gtest/gtest.h>

#include <cmath>
#include <stdexcept>
#include <utility>
#include <vector>

#include "basalt/geo.h"
#include "tests/geo/plain_forms.h"

namespace {

using namespace plain;

TEST(PreparedPolygon, IsCopiedMovedAndEmptied) {
    const std::vector<geo_nee> square = {{0, 0, 0}, {0, 10, 0}, {10, 10, 0}, {10, 0, 0}};
    basalt::PreparedPolygon polygon(square);
    const basalt::PreparedPolygon copy = polygon;
    const basalt::PreparedPolygon moved = std::move(polygon);
    polygon = basalt::PreparedPolygon(nullptr, 0);
    EXPECT_THROW(basalt::PreparedPolygon(square.data(), std::size_t{1} << 31), std::length_error);
    EXPECT_FALSE(polygon.contains({5, 5, 0}) || polygon.contains({5, 5, 0}, 100.0));
    const std::vector<geo_nee> points = {{5, 5, 0}, {11, 5, 0}, {NOT_A_NUMBER, 5, 0}, {10, 10, 0}};
    bool inside[5] = {false, true, true, false, true};
    copy.contains(points.data(), 4, inside);
    EXPECT_TRUE(inside[0] && !inside[1] && !inside[2] && inside[3] && inside[4]);
    EXPECT_TRUE(moved.contains({11, 5, 0}, 1.0) && !moved.contains({11, 5, 0}, 0.9));
}

// A vertex far away must not gather the others in one bucket: the test would take milliseconds.
TEST(PreparedPolygon, IsAsFastWithAVertexFarAway) {
    std::vector<geo_nee> v = {{0, 0, 0}};
    for (int i = 0; i < 200000; ++i) {
        v.push_back({5.8e6 + std::cos(i * PI / 1e5), 3.5e5 + std::sin(i * PI / 1e5), 0});
    }
    const basalt::PreparedPolygon polygon(v);
    int inside = 0;
    for (int i = 0; i < 100000; ++i) {
        inside += polygon.contains({5.8e6 - 1.0 + i * 2e-5, 3.5e5 + 0.01, 0}) ? 1 : 0;
    }
    EXPECT_GT(inside, 99000);
}

TEST(LocalFrame, HasTheBitsOfTheSingleCallAndReturns) {
    Random random(8);
    for (int round = 0; round < 500; ++round) {
        const auto place = [&] { return geo_llh{random.real(-1.57, 1.57), random.real(-PI, PI), 200}; };
        const geo_llh origin = place();
        const geo_llh at = {origin.latitude * 0.99, origin.longitude + 0.01, random.real(-100, 9000)};
        geo_vector origin_xyz = {}, xyz = {};
        _llh2xyz(&origin, &origin_xyz);
        _llh2xyz(&at, &xyz);
        geo_nee expected = {};
        _xyz2nez(&origin_xyz, &xyz, &expected);
        const basalt::LocalFrame frame(origin);
        const geo_nee local = frame.to_local(at);
        ASSERT_TRUE(frame.valid() && local.north == expected.north && local.east == expected.east &&
                    local.elevation == expected.elevation);
        ASSERT_LT(geo_vector_length(frame.to_cartesian(local), xyz), 1e-8);
        ASSERT_EQ(llh_equal(frame.to_geodetic(local), at), 1);
    }
    for (const geo_llh& bad : {geo_llh{0, 0, 0}, {NOT_A_NUMBER, 0, 0}, {0, INF, 0}, {0.0033, 0, -6335137}}) {
        const basalt::LocalFrame none(bad);
        EXPECT_FALSE(none.valid());
        EXPECT_TRUE(basalt::is_null(none.to_local(geo_llh{0.1, 0, 0}).north) &&
                    basalt::is_null(none.to_geodetic({1, 2, 3}).latitude) &&
                    basalt::is_null(none.to_cartesian({1, 2, 3}).x));
    }
}

TEST(Arrays, CountWhatIsRefusedAndLeaveIt) {
    const geo_llh places[] = {{0.5, 1, 2}, {0, 0, 0}, {0.6, 1, 2}};
    geo_vector xyz[3] = {{}, {7, 8, 9}, {}};
    EXPECT_TRUE(basalt::to_cartesian(places, xyz, 3) == 1 && xyz[1].y == 8.0);
    xyz[1] = {};
    geo_llh back[3] = {{}, {7, 8, 9}, {}};
    EXPECT_TRUE(basalt::to_geodetic(xyz, back, 3, 5e-10) == 1 && back[1].longitude == 8.0);
    EXPECT_TRUE(llh_equal(back[0], places[0]) == 1 && llh_equal(back[2], places[2]) == 1);
    geo_nee local[3] = {};
    EXPECT_EQ(basalt::LocalFrame(places[0]).to_local(places, local, 3), 1U);
    EXPECT_TRUE(local[0].north == 0.0 && basalt::is_null(local[1].north) && local[2].north > 6e5);
    const geo_llh bad[] = {{0.5, NOT_A_NUMBER, 2}, {2, 0, 0}, {0.6, 1, 2}};
    basalt::GeodesicInverse lines[3] = {};
    EXPECT_TRUE(basalt::inverse(places, bad, lines, 3) == 2 && lines[2].distance == 0.0);
}

}  // namespace
