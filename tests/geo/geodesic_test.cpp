#include <gtest/gtest.h>

#include <cmath>
#include <string>

#include "basalt/geo.h"
#include "tests/geo/plain_forms.h"
#include "tests/geo/plain_geodesy.h"

namespace {

using namespace plain;

TEST(DirectGeodesic, RunsAlongEquatorAndMeridian) {
    double azimuth = 0;
    geo_llh end = {};
    const double quadrant = 10001965.7293;                              // of the WGS84 meridian
    geo_vincenty_direct({0, 0.4, 0}, 0.0, 2 * quadrant, azimuth, end);  // over the pole
    EXPECT_NEAR(end.latitude, 0.0, 1e-10);
    EXPECT_NEAR(std::remainder(end.longitude - 0.4 - PI, 2 * PI), 0.0, 1e-10);
    EXPECT_NEAR(std::abs(azimuth), PI, 1e-15);
    geo_vincenty_direct({0, 3.1, 0}, PI / 2, 1e6, azimuth, end);  // over the antimeridian, not wrapped
    EXPECT_NEAR(end.longitude, 3.1 + 1e6 / 6378137.0, 1e-11);
    geo_vincenty_direct({0, 0, 0}, 0.0, -quadrant, azimuth, end);
    EXPECT_NEAR(end.latitude, -PI / 2, 1e-10);
}

TEST(DirectGeodesic, StandsStillOverNoDistance) {
    for (const double azimuth : {0.0, 1.0, 4.0, -2.0, 7.0}) {
        double final_azimuth = 0;
        geo_llh end = {};
        geo_vincenty_direct({-0.7, 5.0, 1}, azimuth, 0.0, final_azimuth, end);
        EXPECT_NEAR(end.latitude, -0.7, 2e-16);
        EXPECT_NEAR(end.longitude, 5.0, 1e-15);
        EXPECT_NEAR(final_azimuth, std::remainder(azimuth, 2 * PI), 1e-15);
    }
}

TEST(DirectGeodesic, FollowsThePlainSeries) {
    const std::uint64_t seed = 21;
    SCOPED_TRACE("seed " + std::to_string(seed));
    Random random(seed);
    for (int i = 0; i < 50000; ++i) {
        const geo_llh start = {random.real(-PI / 2, PI / 2), random.real(-PI, PI), 0};
        const double azimuth = random.real(-7, 7);
        const double distance = std::pow(10.0, random.real(0, 7.4));
        double final_azimuth = 0;
        double expected_azimuth = 0;
        geo_llh end = {};
        geo_llh expected = {};
        geo_vincenty_direct(start, azimuth, distance, final_azimuth, end);
        plain::direct(start, azimuth, distance, expected_azimuth, expected);
        // A pass more or less would show as up to 1e-12.
        ASSERT_NEAR(end.latitude, expected.latitude, 1.5e-15);
        const double shrink = std::cos(end.latitude);
        ASSERT_NEAR(std::remainder(end.longitude - expected.longitude, 2 * PI) * shrink, 0.0, 3e-15);
        ASSERT_NEAR(std::remainder(final_azimuth - expected_azimuth, 2 * PI) * shrink, 0.0, 3e-15);
    }
}

TEST(DirectGeodesic, EndsForAnyInput) {
    const double values[] = {0.0, 1.0, GEO_NULL, -PI / 2, 1e300, INF, std::nan("")};
    for (const double latitude : values) {
        for (const double azimuth : values) {
            for (const double distance : {0.0, 1.0, GEO_NULL, 1e12, 1e300, INF, std::nan("")}) {
                double final_azimuth = 0;
                geo_llh end = {};
                geo_vincenty_direct({latitude, 0, 3}, azimuth, distance, final_azimuth, end);
                const bool finite =
                    std::isfinite(latitude) && std::isfinite(azimuth) && std::isfinite(distance);
                EXPECT_EQ(std::isnan(end.latitude), !finite) << latitude << " " << azimuth << " " << distance;
                EXPECT_EQ(std::isnan(end.longitude), !finite);
                EXPECT_EQ(end.height, 3.0);
            }
        }
    }
}

TEST(GreatCircle, DistanceAndBearingFacts) {
    EXPECT_NEAR(geo_vincenty_distance({0, 0, 9}, {0, PI / 180, 1}), 111194.92664455874, 1e-8);
    EXPECT_EQ(geo_vincenty_distance({0.7, 3, 0}, {0.7, 3, 0}), 0.0);
    EXPECT_NEAR(geo_vincenty_bearing({0, 0, 0}, {0, -0.01, 0}), 1.5 * PI, 1e-15);
    EXPECT_EQ(geo_vincenty_bearing({0.3, 1, 0}, {0.3, 1, 0}), 0.0);
    EXPECT_TRUE(std::isnan(geo_vincenty_distance({std::nan(""), 0, 0}, {0, 0, 0})));
    EXPECT_TRUE(std::isnan(geo_vincenty_bearing({0, 0, 0}, {0, INF, 0})));
}

TEST(GreatCircle, IsNeverLostAtTheAntipode) {
    Random random(9);
    for (int i = 0; i < 20000; ++i) {
        const geo_llh a = {random.real(-PI / 2, PI / 2), random.real(-PI, 0), 0};
        ASSERT_NEAR(geo_vincenty_distance(a, {-a.latitude, a.longitude + PI, 0}), 6371000.0 * PI, 0.3);
    }
}

TEST(GreatCircle, AgreesWithVectorsOnTheSphere) {
    Random random(10);
    for (int i = 0; i < 5000; ++i) {
        const geo_llh a = {random.real(-1.5, 1.5), random.real(-PI, PI), 0};
        const geo_llh b = {random.real(-1.5, 1.5), random.real(-PI, PI), 0};
        const auto unit = [](const geo_llh& g) {
            return geo_vector{std::cos(g.latitude) * std::cos(g.longitude),
                              std::cos(g.latitude) * std::sin(g.longitude), std::sin(g.latitude)};
        };
        geo_vector u = unit(a);
        geo_vector v = unit(b);
        const double angle = 2 * std::asin(geo_vector_length(u, v) / 2);
        ASSERT_NEAR(geo_vincenty_distance(a, b), 6371000.0 * angle, 0.01);
        const double east = -std::sin(a.longitude) * v.x + std::cos(a.longitude) * v.y;
        const double north = (v.z - std::cos(angle) * u.z) / std::cos(a.latitude);
        const double bearing = geo_vincenty_bearing(a, b);
        ASSERT_NEAR(std::sin(bearing) * std::sin(angle), east, 1e-10);
        ASSERT_NEAR(std::cos(bearing) * std::sin(angle), north, 1e-10);
    }
}

}  // namespace
