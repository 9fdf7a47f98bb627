#include <gtest/gtest.h>

#include <cmath>

#include "basalt/geo.h"
#include "tests/geo/plain_forms.h"

namespace {

using namespace plain;

void expect_observation(const geo_hvd& actual, const geo_hvd& expected, double tolerance) {
    EXPECT_NEAR(actual.horizontal, expected.horizontal, tolerance);
    EXPECT_NEAR(actual.vertical, expected.vertical, tolerance);
    EXPECT_NEAR(actual.distance, expected.distance, tolerance);
}

void expect_point(const geo_nee& actual, const geo_nee& expected, double tolerance) {
    EXPECT_NEAR(actual.north, expected.north, tolerance);
    EXPECT_NEAR(actual.east, expected.east, tolerance);
    EXPECT_NEAR(actual.elevation, expected.elevation, tolerance);
}

TEST(NormaliseObs, FoldsTheSecondFaceOntoTheFirst) {
    struct Fact {
        geo_hvd face2, face1;
    };
    const Fact facts[] = {
        {{6.0, 3.5, 10.0}, {6.0 - PI, 2 * PI - 3.5, 10.0}},
        {{150.0, 7.0, 10.0}, {150.0 + PI, 2 * PI - 7.0, 10.0}},
    };
    for (const Fact& fact : facts) {
        geo_hvd obs = fact.face2;
        EXPECT_EQ(&geo_normalise_obs(obs), &obs);
        expect_observation(obs, fact.face1, 1e-15 * (1.0 + std::abs(fact.face1.horizontal)));
    }
    geo_hvd null = {GEO_NULL, 4.0, 1.0};
    EXPECT_EQ(geo_normalise_obs(null).horizontal, GEO_NULL);
}

TEST(NormaliseObs, LeavesTheFirstFaceAlone) {
    for (const double vertical : {0.0, 1.0, 3.141592653589793, GEO_NULL, -4.0, -INF}) {
        geo_hvd obs = {7.0, vertical, 2.0};
        EXPECT_EQ(geo_normalise_obs(obs).horizontal, 7.0);
        EXPECT_EQ(obs.vertical, vertical);
    }
    geo_hvd just_beyond = {1.0, std::nextafter(PI, 4.0), 2.0};
    EXPECT_EQ(geo_normalise_obs(just_beyond).horizontal, 1.0 + PI);
    geo_hvd unknown = {1.0, NOT_A_NUMBER, 2.0};
    EXPECT_EQ(geo_normalise_obs(unknown).horizontal, 1.0 + PI);
    EXPECT_TRUE(std::isnan(unknown.vertical));
}

TEST(ReduceObs, GivesThePointMeasured) {
    const geo_nee station = {1000.0, 2000.0, 50.0};
    geo_nee out = {};
    geo_reduce_obs({0.0, PI / 2, 100.0}, station, 1.5, out, 0.9996);
    expect_point(out, {1099.96, 2000.0, 51.5}, 1e-12);
    // 3, 4, 12, 13: east by north, up. The scale leaves the height alone.
    geo_reduce_obs({std::atan2(3.0, -4.0), std::atan2(5.0, 12.0), 13.0}, station, -1.0, out, 2.0);
    expect_point(out, {992.0, 2006.0, 61.0}, 1e-12);
    geo_nee same = station;
    geo_reduce_obs({PI, PI / 2, 100.0}, same, 0.0, same, 1.0);
    expect_point(same, {900.0, 2000.0, 50.0}, 1e-12);
}

TEST(ReduceObs, GivesNothingForAnIncompleteObservation) {
    const geo_nee station = {GEO_NULL, 2000.0, 50.0};
    for (const geo_hvd& obs : {geo_hvd{GEO_NULL, 1.0, 1.0}, {1.0, GEO_NULL, 1.0}, {1.0, 1.0, GEO_NULL}}) {
        geo_nee out = {1.0, 2.0, 3.0};
        geo_reduce_obs(obs, station, 0.0, out, 1.0);
        EXPECT_TRUE(out.north == GEO_NULL && out.east == GEO_NULL && out.elevation == GEO_NULL);
    }
    geo_nee out = {};
    geo_reduce_obs({0.0, PI / 2, 100.0}, station, 0.0, out, 1.0);
    EXPECT_EQ(out.north, 100.0);
}

TEST(CalcObs, LooksFromTheInstrumentToTheTarget) {
    geo_hvd out = {};
    geo_calc_obs({10, 20, 30}, 1.0, {6, 17, 41.5}, 1.5, out, 1.0);
    expect_observation(out, {PI + std::atan2(3.0, 4.0), std::atan2(5.0, 12.0), 13.0}, 1e-14);
    geo_calc_obs({0, 0, 0}, 0.0, {8, 6, -24}, 0.0, out, 0.7);
    expect_observation(out, {std::atan2(6.0, 8.0), PI - std::atan2(7.0, 24.0), 25.0}, 1e-14);
    geo_calc_obs({1, 2, 3}, 0.0, {1, 2, 9}, 0.0, out, 1.0);
    expect_observation(out, {0.0, 0.0, 6.0}, 0.0);
    geo_calc_obs({1, 2, 3}, 0.0, {1, 2, 3}, 0.0, out, 1.0);
    expect_observation(out, {0.0, PI / 2, 0.0}, 1e-16);
}

TEST(CalcObs, LeavesTheResultAloneWhenAnythingIsMissing) {
    for (int missing = 0; missing < 8; ++missing) {
        double value[8] = {1, 2, 3, 4, 5, 6, 7, 8};
        value[missing] = GEO_NULL;
        geo_hvd out = {-1.0, -2.0, -3.0};
        geo_calc_obs({value[0], value[1], value[2]}, value[6], {value[3], value[4], value[5]}, value[7], out,
                     1.0);
        const bool untouched = out.horizontal == -1.0 && out.vertical == -2.0 && out.distance == -3.0;
        EXPECT_EQ(untouched, missing != 7) << missing;
    }
}

TEST(GridFollow, GoesAlongTheBearingWithTheSlopeGiven) {
    const geo_nee start = {0.0, 0.0, 10.0};
    const double along = std::atan2(3.0, 4.0);
    geo_nee out = {};
    geo_grid_follow(start, along, 50.0, PI / 4, out);
    expect_point(out, {40.0, 30.0, 60.0}, 1e-13);
    geo_grid_follow2(start, along, 100.0, 0.02, out);
    expect_point(out, {80.0, 60.0, 12.0}, 1e-13);
    geo_grid_follow3(start, along, 100.0, -3.0, out);
    expect_point(out, {80.0, 60.0, 7.0}, 1e-13);
    out = {1.0, 2.0, 3.0};
    geo_grid_follow3(out, PI / 2, 5.0, 0.5, out);
    expect_point(out, {1.0, 7.0, 3.5}, 1e-14);
}

TEST(GridFollow, KeepsTheElevationOnTheVerticalAndOnTheLevel) {
    const geo_nee start = {0.0, 0.0, 10.0};
    geo_nee out = {};
    for (const double slope : {1.5707963267948966, -1.5707963267948966}) {
        geo_grid_follow(start, 0.0, 100.0, slope, out);
        expect_point(out, {100.0, 0.0, 10.0}, 0.0);
    }
    geo_grid_follow(start, 0.0, 100.0, std::nextafter(PI / 2, 0.0), out);
    EXPECT_GT(out.elevation, 1e17);
    geo_grid_follow2(start, 0.0, INF, -0.0, out);
    EXPECT_EQ(out.elevation, 10.0);
    geo_grid_follow(start, 0.0, INF, 0.0, out);
    EXPECT_TRUE(std::isnan(out.elevation));
}

}  // namespace
