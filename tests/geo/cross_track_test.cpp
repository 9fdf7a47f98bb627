#include <gtest/gtest.h>

#include <cmath>
#include <string>

#include "basalt/geo.h"
#include "src/geo/cross_track.h"
#include "tests/geo/plain_forms.h"
#include "tests/geo/plain_geodesy.h"

namespace {

using namespace plain;

using basalt::geo::cross_track;

/// A point some metres to the right of the line from a towards b, `along` metres from a.
geo_llh beside(const geo_llh& a, const geo_llh& b, double along, double right) {
    double azimuth = 0;
    geo_llh foot = {};
    geo_vincenty_direct(a, geo_vincenty_bearing(a, b), along, azimuth, foot);
    geo_llh p = {};
    geo_vincenty_direct(foot, azimuth + PI / 2, right, azimuth, p);
    return p;
}

TEST(CrossTrack, IsPositiveOnTheLeft) {
    const geo_llh a = {0, 0, 0};
    const geo_llh b = {0, 0.01, 0};
    EXPECT_NEAR(geo_vincenty_crosstrack(a, b, {0.0001, 0.005, 0}), 637.1, 0.05);
    EXPECT_NEAR(geo_vincenty_crosstrack(a, b, {-0.0001, 0.005, 0}), -637.1, 0.05);
    EXPECT_NEAR(geo_vincenty_crosstrack(b, a, {0.0001, 0.005, 0}), -637.1, 0.05);
    EXPECT_NEAR(geo_vincenty_crosstrack(a, a, {0.3, 0.0001, 0}), -637.1 * std::cos(0.3), 0.05);  // runs north
    EXPECT_EQ(geo_vincenty_crosstrack(a, b, a), 0.0);
    EXPECT_EQ(geo_vincenty_crosstrack(a, b, {0, -0.02, 0}), 0.0);  // behind the start
    // On the line, with the first foot opposite; and at 6 mm from there, to the right.
    EXPECT_NEAR(geo_vincenty_crosstrack(a, {0.01, 0, 0}, {0, PI, 0}), 0.0, 1e-6);
    EXPECT_NEAR(geo_vincenty_crosstrack({0.1, 0.5, 0}, {0.11, 0.5, 0}, {-0.1, 0.5 - PI, 0}), 0.0, 1e-6);
    EXPECT_NEAR(geo_vincenty_crosstrack(a, {0.01, 0, 0}, {0, PI - 1e-9, 0}), -0.00637, 1e-4);
}

TEST(CrossTrack, AgreesWithTheSearchByMetres) {
    const std::uint64_t seed = 31;
    SCOPED_TRACE("seed " + std::to_string(seed));
    Random random(seed);
    int ended = 0;
    for (int i = 0; i < 150; ++i) {
        const geo_llh a = {random.real(-1.5, 1.5), random.real(-PI, PI), 0};
        const double length = std::pow(10.0, random.real(1, 5.5));
        geo_llh b = {};
        double azimuth = 0;
        geo_vincenty_direct(a, random.real(0, 2 * PI), length, azimuth, b);
        const double off = std::pow(10.0, random.real(-0.2, 3.5));
        const geo_llh p = beside(a, b, length * random.real(-0.5, 1.5), i % 2 == 0 ? off : -off);
        int steps = 60000;
        const double expected = plain::crosstrack(a, b, p, steps);
        if (std::isnan(expected)) {
            continue;
        }
        ++ended;
        int passes = 0;
        ASSERT_NEAR(cross_track(a, b, p, passes), expected, 1e-6) << length << " " << off;
        ASSERT_LE(passes, 8);
    }
    EXPECT_GT(ended, 120);
}

TEST(CrossTrack, AnswersWhereStepsOfAMetreNeverSettle) {
    Random random(32);
    for (const double off : {2e-6, 1e-4, 3e-3, 0.02, 0.1, 0.3, 0.5}) {
        for (int i = 0; i < 500; ++i) {
            const geo_llh a = {random.real(-1.4, 1.4), random.real(-PI, PI), 0};
            const geo_llh b = {a.latitude + random.real(-0.01, 0.01), a.longitude + random.real(-0.01, 0.01),
                               0};
            const double right = i % 2 == 0 ? off : -off;
            int passes = 0;
            const double d = cross_track(a, b, beside(a, b, random.real(-500, 5000), right), passes);
            // Sphere and ellipsoid differ by up to 0.7 % of the distance, coordinates resolve some
            // nanometres.
            ASSERT_NEAR(d, -right, 0.007 * off + 5e-9);
            ASSERT_LE(passes, 8);
        }
    }
    const geo_llh a = {0.6, 1, 0};
    const geo_llh b = {0.7, 1.2, 0};
    EXPECT_EQ(geo_vincenty_crosstrack(a, b, beside(a, b, 3000, 9e-7)), 0.0);
    EXPECT_NE(geo_vincenty_crosstrack(a, b, beside(a, b, 3000, 1.1e-6)), 0.0);
}

TEST(CrossTrack, TakesAFewPassesAnywhere) {
    const geo_llh a = {0.6, 0.1, 0};
    const geo_llh b = beside(a, {0.7, 0.3, 0}, 1e6, 0);
    int passes = 0;
    EXPECT_NEAR(cross_track(a, b, beside(a, b, 5e5, 5e4), passes), -5e4, 350);
    EXPECT_LE(passes, 8);
    const std::uint64_t seed = 33;
    SCOPED_TRACE("seed " + std::to_string(seed));
    Random random(seed);
    for (int i = 0; i < 20000; ++i) {
        const auto anywhere = [&] { return geo_llh{std::asin(random.real(-1, 1)), random.real(-PI, PI), 0}; };
        const geo_llh start = anywhere();
        const geo_llh towards = anywhere();
        const geo_llh p = anywhere();
        const double d = cross_track(start, towards, p, passes);
        ASSERT_LE(passes, 20);
        // On the sphere: sine of the distance over sine of the angle. The ellipsoid's line strays from it.
        const double swing = geo_vincenty_bearing(start, p) - geo_vincenty_bearing(start, towards);
        const double sine = std::sin(geo_vincenty_distance(start, p) / 6371000.0) * std::sin(swing);
        ASSERT_NEAR(d, -6371000.0 * std::asin(sine), 90e3);
    }
}

TEST(CrossTrack, EndsForAnyInput) {
    const double values[] = {0.0, 1.0, GEO_NULL, 5e-324, PI / 2, PI, INF, std::nan("")};
    for (const double v1 : values) {
        for (const double v2 : values) {
            for (const double v3 : values) {
                for (const geo_llh p :
                     {geo_llh{0.3, 0.4, 0}, {v1, v3, 0}, {-v1, v2 + PI, 0}, {PI / 2, v3, 0}}) {
                    int passes = 0;
                    const double d = cross_track({v1, v2, 0}, {v3, 0.5, 0}, p, passes);
                    EXPECT_LE(passes, 100);
                    EXPECT_FALSE(std::isfinite(v1 + v2 + v3) && std::isinf(d));
                    EXPECT_FALSE(std::isnan(v1 + v2 + v3) && !std::isnan(d));
                }
            }
        }
    }
}

}  // namespace
