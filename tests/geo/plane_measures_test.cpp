#include <gtest/gtest.h>

#include <cmath>
#include <cstddef>
#include <cstdint>
#include <cstring>

#include "basalt/geo.h"
#include "tests/geo/plain_forms.h"

namespace {

using namespace plain;

TEST(GeoRecords, AreThreeDoublesInOrder) {
    static_assert(sizeof(geo_nee) == 24 && sizeof(geo_llh) == 24 && sizeof(geo_vector) == 24 &&
                  sizeof(geo_hvd) == 24);
    static_assert(offsetof(geo_nee, east) == 8 && offsetof(geo_llh, longitude) == 8 &&
                  offsetof(geo_vector, y) == 8 && offsetof(geo_hvd, vertical) == 8);
    std::uint64_t pattern = 0;
    std::memcpy(&pattern, &GEO_NULL, sizeof pattern);
    EXPECT_EQ(pattern, 0x000E61ACF033D1A4U);
}

TEST(NormalisedBearing, LiesInOneTurn) {
    EXPECT_EQ(geo_normalised_bearing(2 * PI), 0.0);
    EXPECT_NEAR(geo_normalised_bearing(100.0), 100.0 - 30 * PI, 1e-13);
    EXPECT_NEAR(geo_normalised_bearing(-100.0), 32 * PI - 100.0, 1e-13);
    for (const double tiny : {-5e-324, -1e-300, -4e-16}) {
        EXPECT_EQ(geo_normalised_bearing(tiny), 0.0) << tiny;
    }
    EXPECT_LT(geo_normalised_bearing(-5e-16), 2 * PI);
    Random random(11);
    for (int i = 0; i < 20000; ++i) {
        const double angle = random.real(-100.0, 100.0);
        const double bearing = geo_normalised_bearing(angle);
        ASSERT_TRUE(bearing >= 0.0 && bearing < 2 * PI) << angle;
        ASSERT_NEAR(std::remainder(bearing - angle, 2 * PI), 0.0, 2e-13) << angle;
    }
}

TEST(NormalisedBearing, LeavesMarkersAndFarAnglesAlone) {
    const double above = std::nextafter(100.0, 101.0);
    for (const double angle : {GEO_NULL, 150.0, -150.0, above, -above, 1e300, INF, -INF}) {
        EXPECT_EQ(geo_normalised_bearing(angle), angle);
    }
    EXPECT_TRUE(std::isnan(geo_normalised_bearing(NOT_A_NUMBER)));
}

TEST(Equality, IsStrictlyBelowHalfAMillimetreInEveryField) {
    const geo_nee a = {0.0, 0.0, 0.0};
    const double inside = std::nextafter(0.0005, 0.0);
    EXPECT_EQ(nee_equal(a, {inside, -inside, inside}), 1);
    EXPECT_EQ(nee_equal({5.0, 6.0, 7.0}, {5.0, 6.0, 7.0}), 1);
    for (const geo_nee& b : {geo_nee{0.0005, 0, 0}, {0, -0.0005, 0}, {0, 0, 0.0005}, {0, 0, NOT_A_NUMBER}}) {
        EXPECT_EQ(nee_equal(a, b), 0) << b.north << ' ' << b.east << ' ' << b.elevation;
    }
    EXPECT_TRUE(geo_dist_equal(1.0, 1.0 + inside / 2));
    EXPECT_FALSE(geo_dist_equal(0.0, 0.0005));
    EXPECT_TRUE(geo_dist_equal(GEO_NULL, GEO_NULL));
    EXPECT_TRUE(geo_dist_equal(GEO_NULL, 0.0001));
    EXPECT_FALSE(geo_dist_equal(GEO_NULL, 1.0));
    EXPECT_FALSE(geo_dist_equal(INF, INF));
}

TEST(GridBearing, TurnsClockwiseFromNorth) {
    const geo_nee origin = {0.0, 0.0, 0.0};
    for (int eighth = 0; eighth < 8; ++eighth) {
        const double north[] = {1, 1, 0, -1, -1, -1, 0, 1};
        const double east[] = {0, 1, 1, 1, 0, -1, -1, -1};
        EXPECT_DOUBLE_EQ(geo_grid_bearing(origin, {north[eighth], east[eighth], 9.0}), eighth * PI / 4);
        geo_vector v = {east[eighth], north[eighth], 9.0};
        EXPECT_DOUBLE_EQ(geo_vector_direction(v), eighth * PI / 4);
    }
    EXPECT_EQ(geo_grid_bearing(origin, origin), 0.0);
    EXPECT_EQ(geo_grid_bearing({0.0, 0.0, 0.0}, {-0.0, -0.0, 0.0}), 0.0);
    EXPECT_EQ(geo_grid_bearing(origin, {1.0, -1e-20, 0.0}), 0.0);
}

TEST(Gradients, AreVerticalBelowATenthOfAMillimetre) {
    const geo_nee from = {0.0, 0.0, 10.0};
    EXPECT_DOUBLE_EQ(geo_gradient(from, {3.0, 4.0, 15.0}), PI / 4);
    EXPECT_EQ(geo_gradient2(from, {3.0, 4.0, 7.5}), -0.5);
    EXPECT_EQ(geo_gradient2(from, {0.0001, 0.0, 10.0}), 0.0);
    const geo_nee up = {0.00005, 0.0, 10.05};
    const geo_nee level = {0.00005, 0.0, 10.0};
    EXPECT_EQ(geo_gradient(from, up), PI / 2);
    EXPECT_EQ(geo_gradient2(from, up), GEO_INFINITY);
    EXPECT_EQ(geo_gradient(from, level), -PI / 2);
    EXPECT_EQ(geo_gradient2(from, level), -GEO_INFINITY);
}

TEST(VectorGradients, AreVerticalUpToATenthOfAMillimetre) {
    struct Fact {
        geo_vector vector;
        double gradient, along_x, along_y;
    };
    const Fact facts[] = {
        {{-5, 0, 1}, std::atan2(1.0, 5.0), PI / 2, PI / 2},
        {{5, 0, -5}, -PI / 4, -PI / 4, -PI / 2},
        {{3, 4, 5}, PI / 4, std::atan2(5.0, 3.0), std::atan2(5.0, 4.0)},
        {{0.0001, 0.0, 0}, PI / 2, PI / 2, PI / 2},
        {{0.0, 0.00011, -0.00011}, -PI / 4, -PI / 2, -PI / 4},
        {{NOT_A_NUMBER, 1, 1}, PI / 2, PI / 2, PI / 4},
    };
    for (Fact fact : facts) {
        EXPECT_DOUBLE_EQ(geo_vector_gradient(fact.vector), fact.gradient) << fact.vector.x;
        EXPECT_DOUBLE_EQ(geo_vector_x_component_gradient(fact.vector), fact.along_x) << fact.vector.x;
        EXPECT_DOUBLE_EQ(geo_vector_y_component_gradient(fact.vector), fact.along_y) << fact.vector.x;
    }
}

TEST(Divergence, IsTheSmallerAngle) {
    EXPECT_EQ(geo_grid_divergence(0.0, PI), PI);
    EXPECT_LE(geo_grid_divergence(std::nextafter(PI, 4.0), 0.0), PI);
    EXPECT_EQ(geo_grid_divergence(GEO_NULL, 1.0), GEO_NULL);
    EXPECT_EQ(geo_grid_divergence(1.0, GEO_NULL), GEO_NULL);
    EXPECT_EQ(geo_grid_divergence(150.0, 0.0), 2 * PI - 150.0);
    EXPECT_EQ(geo_grid_divergence(0.0, 150.0), -150.0);
    const geo_nee origin = {0.0, 0.0, 0.0};
    EXPECT_DOUBLE_EQ(geo_grid_divergence(origin, {1, 0, 0}, {5, 5, 0}, {6, 4, 0}), PI / 4);
}

TEST(BisectedBearing, HalvesTheSmallerTurn) {
    EXPECT_EQ(geo_bisected_bearing(0.0, PI), PI / 2);
    EXPECT_EQ(geo_bisected_bearing(PI, 0.0), 1.5 * PI);
}

TEST(VectorArithmetic, WritesInPlace) {
    geo_vector a = {1.0, -2.0, 0.5};
    geo_vector b = {10.0, 20.0, 30.0};
    EXPECT_EQ(&geo_vector_reverse(a), &a);
    geo_vector_add(a, b, a);
    EXPECT_EQ(a.x, 9.0);
    EXPECT_EQ(a.y, 22.0);
    EXPECT_EQ(a.z, 29.5);
    geo_vector_add(a, b, b);
    EXPECT_EQ(b.y, 42.0);
}

TEST(Centroid, KeepsMarkers) {
    const geo_nee a = {10.0, 20.0, 30.0};
    geo_nee out = {0.0, 0.0, 0.0};
    const auto is = [&](double north, double east, double elevation) {
        return out.north == north && out.east == east && out.elevation == elevation;
    };
    geo_grid_centroid(a, out, out);
    EXPECT_TRUE(is(5.0, 10.0, 15.0));
    geo_grid_centroid(a, {20.0, 40.0, GEO_NULL}, out);
    EXPECT_TRUE(is(15.0, 30.0, GEO_NULL));
    geo_grid_centroid({GEO_NULL, 20.0, 30.0}, a, out);
    EXPECT_TRUE(is(GEO_NULL, GEO_NULL, GEO_NULL));
    geo_grid_centroid(a, {20.0, GEO_NULL, 30.0}, out);
    EXPECT_TRUE(is(GEO_NULL, GEO_NULL, GEO_NULL));
}

}  // namespace
