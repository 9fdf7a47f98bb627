#include <gtest/gtest.h>

#include <cmath>
#include <string>

#include "basalt/geo.h"
#include "tests/geo/plain_forms.h"

namespace {

using namespace plain;

TEST(RayIntersection, FactsOfMeetingAndMissing) {
    struct Fact {
        const char* what;
        geo_nee p1, p2;
        double bearing1, bearing2;
        int met;
        double north, east;
    };
    const Fact facts[] = {
        {"north and east", {0, 0, 1}, {10, -10, 2}, 0, PI / 2, 1, 10, 0},
        {"second points away", {0, 0, 1}, {10, -10, 2}, 0, 1.5 * PI, 0, 0, 0},
        {"first points away", {0, 0, 1}, {10, -10, 2}, PI, PI / 2, 0, 0, 0},
        {"second runs south, first oblique from an easting", {0, 3, 0}, {20, 10, 0}, PI / 4, PI, 1, 7, 10},
        {"diagonals", {0, 0, 0}, {0, 10, 0}, PI / 4, 1.75 * PI, 1, 5, 5},
        {"bearings of several turns", {0, 0, 0}, {0, 10, 0}, PI / 4 + 8 * PI, -PI / 4, 1, 5, 5},
        {"equal bearings", {0, 0, 0}, {10, 10, 0}, 1, 1, 0, 0, 0},
        {"opposite bearings", {0, 0, 0}, {10, 0, 0}, 0, PI, 0, 0, 0},
        {"behind ray 2, but at the start of ray 1", {5, 5, 0}, {5, 15, 0}, PI / 4, PI / 2, 1, 5, 5},
        {"behind ray 1, but at the start of ray 2", {5, 15, 0}, {5, 5, 0}, PI / 2, PI / 4, 1, 5, 5},
    };
    for (const Fact& fact : facts) {
        SCOPED_TRACE(fact.what);
        geo_nee out = {1, 1, 1};
        ASSERT_EQ(geo_grid_bb_intersect(fact.p1, fact.p2, fact.bearing1, fact.bearing2, out), fact.met);
        EXPECT_NEAR(out.north, fact.north, 1e-12);
        EXPECT_NEAR(out.east, fact.east, 1e-12);
        EXPECT_EQ(out.elevation, GEO_NULL);
        EXPECT_TRUE(fact.met == 1 || (out.north == GEO_NULL && out.east == GEO_NULL));
    }
}

TEST(RayIntersection, FindsATargetSightedFromTwoStations) {
    const std::uint64_t seed = 7;
    SCOPED_TRACE("seed " + std::to_string(seed));
    Random random(seed);
    for (int i = 0; i < 5000; ++i) {
        const auto point = [&] { return geo_nee{random.real(0, 1000), random.real(0, 1000), 0.0}; };
        const geo_nee p1 = point();
        const geo_nee p2 = point();
        const geo_nee target = point();
        const double angle = geo_grid_divergence(target, p1, target, p2);
        if (angle < 0.05 || angle > PI - 0.05) {
            continue;
        }
        const double bearing1 = geo_grid_bearing(p1, target);
        const double bearing2 = geo_grid_bearing(p2, target);
        geo_nee out = {};
        ASSERT_EQ(geo_grid_bb_intersect(p1, p2, bearing1, bearing2, out), 1);
        ASSERT_NEAR(out.north, target.north, 2e-7);
        ASSERT_NEAR(out.east, target.east, 2e-7);
        ASSERT_EQ(geo_grid_bb_intersect(p1, p2, bearing1 + PI, bearing2, out), 0);
    }
}

TEST(RayIntersection, RefusesBelowATenthOfAnArcSecond) {
    geo_nee out = {};
    for (const double turn : {0.0, PI}) {
        const double other = 1.0 + turn;
        EXPECT_EQ(geo_grid_bb_intersect({0, 0, 0}, {0, 1, 0}, 1.0 + 4.84e-7, other, out), 0);
        EXPECT_EQ(geo_grid_bb_intersect({0, 1, 0}, {0, 0, 0}, other, 1.0 + 4.84e-7, out), 0);
    }
    EXPECT_EQ(geo_grid_bb_intersect({0, 0, 0}, {0, 1, 0}, 1.0 + 4.86e-7, 1.0, out), 1);
}

TEST(RayIntersection, KeepsTheEastingOfARunAlongTheNorthAxis) {
    const geo_nee station = {5800000.3, 350000.1, 0};
    const double slight = 4.8e-7;
    geo_nee out = {};
    for (const double off : {0.0, slight, -slight}) {
        EXPECT_EQ(geo_grid_bb_intersect(station, {5800000.3, 349990.1, 0}, off, 0.7, out), 1);
        EXPECT_EQ(out.east, station.east);
        EXPECT_EQ(geo_grid_bb_intersect({5800000.3, 349990.1, 0}, station, 2.3, PI + off, out), 1);
        EXPECT_EQ(out.east, station.east);
    }
}

TEST(RayIntersection, RefusesBearingsThatAreNotFiniteAndWritesOverItsOwnStart) {
    geo_nee p1 = {0, 0, 0};
    const geo_nee p2 = {10, -10, 0};
    for (const double bad : {INF, -INF, NOT_A_NUMBER}) {
        geo_nee out = {};
        EXPECT_EQ(geo_grid_bb_intersect(p1, p2, bad, 1.0, out), 0);
        EXPECT_EQ(geo_grid_bb_intersect(p1, p2, 1.0, bad, out), 0);
        EXPECT_EQ(geo_grid_bb_intersect(p1, p2, bad, bad, out), 0);
        EXPECT_EQ(out.north, GEO_NULL);
    }
    EXPECT_EQ(geo_grid_bb_intersect(p1, p2, 0, PI / 2, p1), 1);
    EXPECT_EQ(p1.north, 10.0);
}

}  // namespace
