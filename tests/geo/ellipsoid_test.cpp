#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <string>

#include "basalt/geo.h"
#include "tests/geo/plain_forms.h"
#include "tests/geo/plain_geodesy.h"

namespace {

using namespace plain;

geo_vector cartesian(const geo_llh& llh) {
    geo_vector xyz = {};
    EXPECT_EQ(_llh2xyz(&llh, &xyz), 1);
    return xyz;
}

TEST(Ellipsoid, FactsOnTheEquatorAndAtThePole) {
    const double a = 6378137.0;
    const double b = 6356752.314245179;  // a (1 - f)
    const geo_vector exact = {a, 0, 0};
    geo_llh llh = {9, 9, 9};
    ASSERT_EQ(_xyz2llh(&exact, &llh, 0.0), 1);
    EXPECT_TRUE(llh.latitude == 0.0 && llh.longitude == 0.0 && llh.height == 0.0);
    double meridian = 0;
    double prime = 0;
    _wgs84curvature(0.0, meridian, prime);
    EXPECT_EQ(meridian, 6335439.327292829);
    EXPECT_EQ(prime, a);
    _wgs84curvature(PI / 2, meridian, prime);  // both are a^2 / b
    EXPECT_NEAR(meridian, a * a / b, 1e-7);
    EXPECT_NEAR(prime, a * a / b, 1e-7);
}

TEST(Ellipsoid, RefusesWhatIsNoPlaceAndWritesNothing) {
    geo_llh llh = {1, 2, 3};
    geo_vector xyz = {0, -0.0, 0};
    EXPECT_EQ(_xyz2llh(&xyz, &llh, 5e-10), 0);
    const geo_vector bad_places[] = {
        {NOT_A_NUMBER, 1, 1}, {1, NOT_A_NUMBER, 1}, {1, 1, NOT_A_NUMBER}, {43e3, 0, 1}, {0, -60e3, 20e3}};
    for (const geo_vector& bad : bad_places) {
        EXPECT_EQ(_xyz2llh(&bad, &llh, 5e-10), 0) << bad.x << " " << bad.y << " " << bad.z;
    }
    EXPECT_TRUE(llh.latitude == 1.0 && llh.longitude == 2.0 && llh.height == 3.0);
    const geo_llh nothing = {0, -0.0, 0};
    xyz = {4, 5, 6};
    EXPECT_EQ(_llh2xyz(&nothing, &xyz), 0);
    EXPECT_TRUE(xyz.x == 4.0 && xyz.y == 5.0 && xyz.z == 6.0);
    geo_nee out = {7, 8, 9};
    const geo_vector centre = {0, 0, 0};
    EXPECT_EQ(_xyz2nez(&centre, &xyz, &out), 1);
    EXPECT_TRUE(out.north == 7.0 && out.east == 8.0 && out.elevation == 9.0);
}

TEST(Ellipsoid, TakesExtremesAsNumbers) {
    geo_llh llh = {};
    geo_vector xyz = {GEO_NULL, 5e-324, -GEO_NULL};  // the squares vanish: on the axis
    ASSERT_EQ(_xyz2llh(&xyz, &llh, 5e-10), 1);
    EXPECT_EQ(llh.latitude, -PI / 2);
    EXPECT_NEAR(llh.height, -6356752.3142, 1e-4);
    xyz = {INF, 0, 0};
    ASSERT_EQ(_xyz2llh(&xyz, &llh, 5e-10), 1);
    EXPECT_EQ(llh.latitude, 0.0);
    EXPECT_EQ(llh.height, INF);
    xyz = {0, 0, -INF};
    ASSERT_EQ(_xyz2llh(&xyz, &llh, 5e-10), 1);
    EXPECT_EQ(llh.latitude, -PI / 2);
    const geo_llh marker = {GEO_NULL, 0, 0};  // not all zero
    EXPECT_EQ(cartesian(marker).x, 6378137.0);
    EXPECT_TRUE(std::isnan(cartesian({INF, 0, 0}).x));
    EXPECT_TRUE(std::isnan(cartesian({0, NOT_A_NUMBER, 0}).y));
}

// Were a single pass more or less made, the latitudes would differ by a tenth of the tolerance and more.
TEST(Ellipsoid, DecidesAsThePlainIteration) {
    const std::uint64_t seed = 11;
    SCOPED_TRACE("seed " + std::to_string(seed));
    Random random(seed);
    for (int i = 0; i < 40000; ++i) {
        const double heights[] = {0.0, random.real(-11e3, 20e3), random.real(0, 20e6),
                                  random.real(-6.4e6, 0)};
        const geo_llh llh = {random.real(-PI / 2, PI / 2), random.real(-PI, PI), heights[i % 4]};
        const geo_vector xyz = cartesian(llh);
        const double tolerances[] = {5e-10, 5e-9, std::pow(10.0, random.real(-14, 1.1)), 0.0};
        const double tolerance = tolerances[random.below(4)];
        geo_llh back = {};
        geo_llh expected = {};
        int passes = 0;
        ASSERT_EQ(_xyz2llh(&xyz, &back, tolerance), plain::xyz2llh(xyz, expected, tolerance, passes))
            << tolerance << " " << llh.height;
        ASSERT_NEAR(back.latitude, expected.latitude, 1e-15);
        ASSERT_EQ(back.longitude, expected.longitude);
        ASSERT_NEAR(back.height, expected.height, 3e-8);
    }
}

TEST(Ellipsoid, KeepsTheFirstEstimateForWideTolerances) {
    const geo_vector xyz = cartesian({0.8, 0.1, 10000});
    for (const double tolerance : {10.0, INF, NOT_A_NUMBER}) {
        geo_llh once = {};
        ASSERT_EQ(_xyz2llh(&xyz, &once, tolerance), 1);
        EXPECT_EQ(once.latitude, std::atan2(xyz.z, std::hypot(xyz.x, xyz.y) * 0.99330562000986)) << tolerance;
    }
}

TEST(Ellipsoid, LocalFramePointsNorthEastAndUp) {
    for (const geo_llh at : {geo_llh{0.7, 2.0, 300}, {-1.2, -3.0, 0}, {1.5, 0.5, 8000}, {0.0, 0.0, 10}}) {
        const geo_vector origin = cartesian(at);
        geo_nee out = {1, 1, 1};
        ASSERT_EQ(_xyz2nez(&origin, &origin, &out), 1);
        EXPECT_TRUE(out.north == 0.0 && out.east == 0.0 && out.elevation == 0.0);
        const auto local = [&](const geo_llh& llh) {
            const geo_vector point = cartesian(llh);
            _xyz2nez(&origin, &point, &out);
            return out;
        };
        const double step = 1e-6;  // radians; along circles of the radii of curvature
        double m = 0;
        double n = 0;
        _wgs84curvature(at.latitude, m, n);
        EXPECT_NEAR(local({at.latitude, at.longitude, at.height + 1}).elevation, 1.0, 1e-8);
        EXPECT_LT(std::hypot(out.north, out.east), 1e-8);
        EXPECT_NEAR(local({at.latitude + step, at.longitude, at.height}).north, (m + at.height) * step, 1e-7);
        EXPECT_LT(std::abs(out.east), 1e-8);
        EXPECT_NEAR(local({at.latitude, at.longitude + step, at.height}).east,
                    (n + at.height) * std::cos(at.latitude) * step, 1e-8);
        EXPECT_LT(std::abs(out.north), 1e-5);
    }
    // On the axis every direction is south; the meridian of Greenwich decides.
    const geo_vector pole = {0, 0, 6356752.3142};
    const geo_vector point = {-3, 4, pole.z + 5};
    geo_nee out = {};
    ASSERT_EQ(_xyz2nez(&pole, &point, &out), 1);
    EXPECT_NEAR(out.north, 3.0, 1e-8);
    EXPECT_NEAR(out.east, 4.0, 1e-8);
    EXPECT_NEAR(out.elevation, 5.0, 1e-8);
}

TEST(Ellipsoid, EqualWithinHalfAMillimetreOfSpace) {
    const geo_llh at = {0.9, 3.0, 100};
    EXPECT_EQ(llh_equal(at, {0.9, 3.0, 100.0004}), 1);
    EXPECT_EQ(llh_equal(at, {0.9, 3.0, 100.0006}), 0);
    EXPECT_EQ(llh_equal(at, {0.9, 3.0 - 2 * PI, 100}), 1);
    EXPECT_EQ(llh_equal({PI / 2, 1, 5}, {PI / 2, -2, 5}), 1);
    EXPECT_EQ(llh_equal(at, {NOT_A_NUMBER, 3.0, 100}), 0);
    // The all-zero point is the place on the equator.
    EXPECT_EQ(llh_equal({0, 0, 0}, {0, 0, 0.0004}), 1);
    EXPECT_EQ(llh_equal({0, 0, 0}, {0, 2 * PI, 0}), 1);
    EXPECT_EQ(llh_equal({0, 0, 0}, at), 0);
}

}  // namespace
