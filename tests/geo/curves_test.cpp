#include <gtest/gtest.h>

#include <cmath>

#include "basalt/geo.h"
#include "tests/geo/plain_forms.h"

namespace {

using namespace plain;

TEST(ArcConversions, GiveNothingForAMarkerOrARadiusBelowHalfAMillimetre) {
    for (const double radius : {0.0004, -0.0004, 0.0, GEO_NULL}) {
        EXPECT_EQ(geo_arc_length_to_angle(10.0, radius), GEO_NULL) << radius;
    }
    EXPECT_EQ(geo_arc_length_to_angle(1.0, 0.0005), 2000.0);
    EXPECT_EQ(geo_arc_length_to_angle(1.0, -0.0005), -2000.0);
    EXPECT_EQ(geo_arc_length_to_angle(GEO_NULL, 10.0), GEO_NULL);
    EXPECT_EQ(geo_arc_angle_to_length(GEO_NULL, 10.0), GEO_NULL);
    EXPECT_EQ(geo_arc_angle_to_length(10.0, GEO_NULL), GEO_NULL);
    EXPECT_TRUE(std::isnan(geo_arc_length_to_angle(1.0, NOT_A_NUMBER)));
}

TEST(ArcToChord, IsHalfTheChordUpToTheRadius) {
    EXPECT_EQ(geo_arc_to_chord(13.0 / 256, 8.0 / 256), 12.0 / 256);  // a half chord far below a unit
    EXPECT_EQ(geo_arc_to_chord(0, 0), 0.0);
    EXPECT_EQ(geo_arc_to_chord(100, 100), 200.0);
    EXPECT_EQ(geo_arc_to_chord(100, INF), 200.0);
    EXPECT_EQ(geo_arc_to_chord(100, -1), -201.0);
    EXPECT_EQ(geo_arc_to_chord(-5, 1), -10.0);
    EXPECT_EQ(geo_arc_to_chord(GEO_INFINITY, 1), GEO_NULL);
    EXPECT_EQ(geo_arc_to_chord(GEO_NULL, 1), GEO_NULL);
    EXPECT_EQ(geo_arc_to_chord(100, GEO_NULL), GEO_NULL);
    EXPECT_NEAR(geo_arc_to_chord(100.0, std::nextafter(100.0, 0.0)), 100.0, 1e-12);
    EXPECT_TRUE(std::isnan(geo_arc_to_chord(NOT_A_NUMBER, 1.0)));
}

TEST(SpiralDeflection, IsTheSquareOverTheConstant) {
    EXPECT_EQ(geo_spiral_deflection(50.0, -20000.0), -0.125);
    EXPECT_EQ(geo_spiral_deflection(50.0, 0.0), INF);
    EXPECT_TRUE(std::isnan(geo_spiral_deflection(NOT_A_NUMBER, 20000.0)));
}

struct Deltas {
    double x = 1.0, y = 2.0;
    bool operator==(const Deltas&) const = default;
};

constexpr Deltas NOTHING = {GEO_NULL, GEO_NULL};

Deltas deltas_of(double length, double constant, double tolerance) {
    Deltas deltas;
    geo_spiral_deltas(length, constant, tolerance, deltas.x, deltas.y);
    return deltas;
}

TEST(SpiralDeltas, HaveTheirPublishedValues) {
    const Deltas deltas = deltas_of(50.0, 20000.0, 1e-9);
    EXPECT_NEAR(deltas.x, 49.9219314937, 5e-11);
    EXPECT_NEAR(deltas.y, 2.0810093402, 5e-11);
}

TEST(SpiralDeltas, TakeNineTermsAtMost) {
    // The ninth terms are l turn^18 / (18! 37) and l turn^19 / (19! 39), and the test against them is strict.
    const double turn = 2.0;
    const double length = 100.0;
    const double constant = length * length / turn;
    const double ninth_x = length * std::pow(turn, 18) / (std::tgamma(19.0) * 37.0);
    EXPECT_GT(deltas_of(length, constant, ninth_x * (1.0 + 1e-9)).x, 60.0);
    EXPECT_EQ(deltas_of(length, constant, ninth_x * (1.0 - 1e-9)), NOTHING);
    // At a turn of 25 the terms grow: the first of x is 62.5 lengths, that of y 372 lengths.
    EXPECT_EQ(deltas_of(1.0, 1.0 / 25.0, 100.0), NOTHING) << "only the offset fails";
    EXPECT_NEAR(deltas_of(1.0, 1.0 / 25.0, 400.0).x, 1.0 - 62.5, 1e-12);
}

TEST(SpiralDeltas, GiveNothingWhereTheSeriesCannotSettle) {
    for (const double tolerance : {0.0, -1.0, NOT_A_NUMBER}) {
        EXPECT_EQ(deltas_of(50, 20000, tolerance), NOTHING) << tolerance;
    }
    for (const double length : {300.0, INF, NOT_A_NUMBER}) {
        EXPECT_EQ(deltas_of(length, 20000, 1e-9), NOTHING) << length;
    }
    EXPECT_EQ(deltas_of(1e200, 20000, INF), NOTHING);
    EXPECT_EQ(deltas_of(0, 20000, 0), NOTHING);
    EXPECT_EQ(deltas_of(0, 0, 1e-9), NOTHING);
    EXPECT_EQ(deltas_of(50, 0, 1e-9), NOTHING);
    EXPECT_EQ(deltas_of(50, NOT_A_NUMBER, 1), NOTHING);
    EXPECT_EQ(deltas_of(0.0, 20000.0, 1e-300), (Deltas{0.0, 0.0}));
    const Deltas straight = deltas_of(50.0, GEO_INFINITY, 1e-9);
    EXPECT_EQ(straight.x, 50.0);
    EXPECT_NEAR(straight.y, 0.0, 1e-90);
}

}  // namespace
