// Laws that hold for any input of a kind, on random ones.
#include <gtest/gtest.h>

#include <array>
#include <cmath>

#include "basalt/geo.h"
#include "src/geo/cross_track.h"
#include "tests/geo/calls.h"
#include "tests/geo/plain_forms.h"

namespace {

using namespace plain;
using basalt::geo::cross_track;
using geo_calls::results;

geo_vector cartesian(const geo_llh& llh) {
    const auto xyz = results<_llh2xyz>({llh.latitude, llh.longitude, llh.height});
    return {xyz[1], xyz[2], xyz[3]};
}

TEST(GeometryLaws, ABearingLiesInOneTurn) {
    Random random(11);
    for (int i = 0; i < 20000; ++i) {
        const double angle = random.real(-100.0, 100.0);
        const double bearing = geo_normalised_bearing(angle);
        ASSERT_TRUE(bearing >= 0.0 && bearing < 2 * PI) << angle;
        ASSERT_NEAR(std::remainder(bearing - angle, 2 * PI), 0.0, 2e-13) << angle;
        ASSERT_EQ(_normalisedbearing(angle), bearing);
        const double far = random.real(-1e6, 1e6) * (i % 32 == 0 ? 1e290 : 0.001);
        ASSERT_TRUE(_normalisedbearing(far) >= 0.0 && _normalisedbearing(far) < 2 * PI) << far;
    }
}

TEST(GeometryLaws, SecondsNeverShowSixty) {
    for (int minute = 0; minute < 360 * 60; ++minute) {
        const auto dms = results<_radtodms>({_degtorad(minute / 60.0) - 1e-12});  // 2e-7 seconds short
        ASSERT_EQ(dms[0] * 60 + dms[1], minute);
        ASSERT_NEAR(dms[2], 0.0, 1e-6);
    }
}

TEST(CrossTrack, TakesAFewPassesAnywhere) {
    Random random(33);
    int passes = 0;
    for (int i = 0; i < 20000; ++i) {
        const auto anywhere = [&] { return geo_llh{std::asin(random.real(-1, 1)), random.real(-PI, PI), 0}; };
        const geo_llh start = anywhere(), towards = anywhere(), p = anywhere();
        const double d = cross_track(start, towards, p, passes);
        ASSERT_LE(passes, 20);
        // On the sphere: sine of the distance over sine of the angle. The ellipsoid's line strays from it.
        const double swing = geo_vincenty_bearing(start, p) - geo_vincenty_bearing(start, towards);
        const double sine = std::sin(geo_vincenty_distance(start, p) / 6371000.0) * std::sin(swing);
        ASSERT_NEAR(d, -6371000.0 * std::asin(sine), 90e3);
    }
}

// Distances on the sphere and on the ellipsoid differ by up to 0.7 %.
TEST(CrossTrack, IsTheDistanceFromTheLinePositiveToTheLeft) {
    Random random(34);
    for (int i = 0; i < 5000; ++i) {
        const geo_llh a = {random.real(-1.5, 1.5), random.real(-PI, PI), 0};
        const double length = std::pow(10.0, random.real(1, 5.5));
        const double right = std::pow(10.0, random.real(-5.5, 3)) * (i % 2 == 0 ? 1 : -1);
        geo_llh b = {}, p = {};
        double azimuth = 0;
        geo_vincenty_direct(a, random.real(0, 2 * PI), length, azimuth, b);
        geo_vincenty_direct(a, geo_vincenty_bearing(a, b), length * random.real(-0.5, 1.5), azimuth, p);
        geo_vincenty_direct(p, azimuth + PI / 2, right, azimuth, p);
        int passes = 0;
        ASSERT_NEAR(cross_track(a, b, p, passes), -right, 0.007 * std::abs(right) + 5e-9);
        ASSERT_LE(passes, 8);
    }
}

// The covariance d d^T of an error along one direction d becomes that of the error's own components, and
// these are the moves along circles of the radii of curvature.
TEST(GeometryLaws, VariancesFollowAnErrorAlongADirection) {
    Random random(3);
    using Six = std::array<double, 6>;
    for (int round = 0; round < 200; ++round) {
        const geo_llh llh = {random.real(-1.5, 1.5), random.real(-3.1, 3.1), random.real(-1e4, 2e7)};
        const geo_vector at = cartesian(llh);
        double m = 0.0, n = 0.0;
        _wgs84curvature(llh.latitude, m, n);
        const double east_radius = (n + llh.height) * std::cos(llh.latitude);
        const geo_nee move = {random.real(-8, 8), random.real(-8, 8), random.real(-8, 8)};
        const geo_vector moved =
            cartesian({llh.latitude + move.north / (m + llh.height), llh.longitude + move.east / east_radius,
                       llh.height + move.elevation});
        geo_nee local = {};
        _xyz2nez(&at, &moved, &local);
        EXPECT_LT(geo_horz_dist(local, move), 1.5e-4);
        EXPECT_NEAR(local.elevation, move.elevation, 3e-5);
        const geo_vector d = {moved.x - at.x, moved.y - at.y, moved.z - at.z};
        const Six q = {d.x * d.x, d.y * d.y, d.z * d.z, d.x * d.y, d.x * d.z, d.y * d.z};
        const auto expect = [&](auto* propagate, const Six& unit, double a, double b, double c) {
            Six out = {};
            ASSERT_EQ(propagate(&at, q.data(), out.data()), 1);
            const Six expected = {a * a, b * b, c * c, a * b, a * c, b * c};
            for (std::size_t i = 0; i < 6; ++i) {
                EXPECT_NEAR(out[i], expected[i], 1e-6 * unit[i]) << i;  // moves are rounded to 4e-9 m
            }
        };
        const double r = 1.0 / east_radius;  // of angles in metres
        expect(Varxyz2varneu, {1, 1, 1, 1, 1, 1}, local.north, local.east, local.elevation);
        expect(Varxyz2varllh, {r * r, r * r, 1, r * r, r, r}, local.north / (m + llh.height), local.east * r,
               local.elevation);
    }
}

}  // namespace
