#include <gtest/gtest.h>

#include <cmath>

#include "basalt/geo.h"
#include "tests/geo/plain_forms.h"

namespace {

using namespace plain;

TEST(ArcConversions, AreProductAndQuotient) {
    EXPECT_DOUBLE_EQ(geo_arc_angle_to_length(PI / 2, 100.0), 50.0 * PI);
    EXPECT_EQ(geo_arc_angle_to_length(-2.0, 3.0), -6.0);
    EXPECT_DOUBLE_EQ(geo_arc_length_to_angle(50.0 * PI, 100.0), PI / 2);
    EXPECT_EQ(geo_arc_length_to_angle(10.0, GEO_INFINITY), 5e-100);
    EXPECT_EQ(geo_arc_length_to_angle(1.0, 0.0005), 2000.0);
    EXPECT_EQ(geo_arc_length_to_angle(1.0, -0.0005), -2000.0);
    for (const double radius : {0.0004, -0.0004, 0.0, GEO_NULL}) {
        EXPECT_EQ(geo_arc_length_to_angle(10.0, radius), GEO_NULL) << radius;
    }
    EXPECT_EQ(geo_arc_length_to_angle(GEO_NULL, 10.0), GEO_NULL);
    EXPECT_EQ(geo_arc_angle_to_length(GEO_NULL, 10.0), GEO_NULL);
    EXPECT_EQ(geo_arc_angle_to_length(10.0, GEO_NULL), GEO_NULL);
    EXPECT_TRUE(std::isnan(geo_arc_length_to_angle(1.0, NOT_A_NUMBER)));
}

TEST(ArcToChord, IsHalfTheChordUpToTheRadius) {
    struct Fact {
        double radius, separation, chord;
    };
    const Fact facts[] = {
        {100, 1, std::sqrt(199.0)},
        {13, 8, 12},
        {5, 0, 0},
        {100, 100, 200},
        {100, 150, 200},
        {100, -1, -201},
        {-5, 1, -10},
        {GEO_INFINITY, 1, GEO_NULL},
        {GEO_NULL, 1, GEO_NULL},
        {100, GEO_NULL, GEO_NULL},
        {0, 0, 0},
        {100, INF, 200},
    };
    for (const Fact& fact : facts) {
        EXPECT_EQ(geo_arc_to_chord(fact.radius, fact.separation), fact.chord)
            << fact.radius << ' ' << fact.separation;
    }
    EXPECT_NEAR(geo_arc_to_chord(100.0, std::nextafter(100.0, 0.0)), 100.0, 1e-12);
    EXPECT_TRUE(std::isnan(geo_arc_to_chord(NOT_A_NUMBER, 1.0)));
}

TEST(SpiralDeflection, IsTheSquareOverTheConstant) {
    EXPECT_EQ(geo_spiral_deflection(50.0, 20000.0), 0.125);
    EXPECT_EQ(geo_spiral_deflection(50.0, -20000.0), -0.125);
    EXPECT_EQ(geo_spiral_deflection(-50.0, 20000.0), 0.0);
    EXPECT_EQ(geo_spiral_deflection(50.0, 0.0), INF);
    EXPECT_TRUE(std::isnan(geo_spiral_deflection(NOT_A_NUMBER, 20000.0)));
}

TEST(SpiralDeltas, HaveTheirPublishedValues) {
    double x = 0.0;
    double y = 0.0;
    geo_spiral_deltas(50.0, 20000.0, 1e-9, x, y);
    EXPECT_NEAR(x, 49.9219314937, 5e-11);
    EXPECT_NEAR(y, 2.0810093402, 5e-11);
}

TEST(SpiralDeltas, TakeNineTermsAtMost) {
    // The ninth terms are l turn^18 / (18! 37) and l turn^19 / (19! 39), and the test against them is strict.
    const double turn = 2.0;
    const double length = 100.0;
    const double ninth_x = length * std::pow(turn, 18) / (std::tgamma(19.0) * 37.0);
    double x = 0.0;
    double y = 0.0;
    geo_spiral_deltas(length, length * length / turn, ninth_x * (1.0 + 1e-9), x, y);
    EXPECT_GT(x, 60.0);
    geo_spiral_deltas(length, length * length / turn, ninth_x * (1.0 - 1e-9), x, y);
    EXPECT_EQ(x, GEO_NULL);
    EXPECT_EQ(y, GEO_NULL);
}

TEST(SpiralDeltas, GiveNothingWhenOnlyTheOffsetFails) {
    // At a turn of 25 the terms grow: the first of x is 62.5 lengths, that of y 372 lengths.
    double x = 0.0;
    double y = 0.0;
    geo_spiral_deltas(1.0, 1.0 / 25.0, 100.0, x, y);
    EXPECT_EQ(x, GEO_NULL);
    EXPECT_EQ(y, GEO_NULL);
    geo_spiral_deltas(1.0, 1.0 / 25.0, 400.0, x, y);
    EXPECT_NEAR(x, 1.0 - 62.5, 1e-12);
}

TEST(SpiralDeltas, GiveNothingWhereTheSeriesCannotSettle) {
    struct Fact {
        double length, constant, tolerance;
    };
    const Fact facts[] = {
        {50, 20000, 0},
        {300, 20000, 1e-9},
        {50, 20000, -1},
        {50, 0, 1e-9},
        {0, 0, 1e-9},
        {0, 20000, 0},
        {NOT_A_NUMBER, 20000, 1},
        {50, NOT_A_NUMBER, 1},
        {INF, 20000, 1},
        {50, 20000, NOT_A_NUMBER},
        {1e200, 20000, INF},
    };
    for (const Fact& fact : facts) {
        double x = 1.0;
        double y = 2.0;
        geo_spiral_deltas(fact.length, fact.constant, fact.tolerance, x, y);
        EXPECT_EQ(x, GEO_NULL) << fact.length << ' ' << fact.constant;
        EXPECT_EQ(y, GEO_NULL) << fact.length << ' ' << fact.constant;
    }
    double x = 1.0;
    double y = 2.0;
    geo_spiral_deltas(0.0, 20000.0, 1e-300, x, y);
    EXPECT_EQ(x, 0.0);
    EXPECT_EQ(y, 0.0);
    geo_spiral_deltas(50.0, GEO_INFINITY, 1e-9, x, y);
    EXPECT_EQ(x, 50.0);
    EXPECT_NEAR(y, 0.0, 1e-90);
}

}  // namespace
