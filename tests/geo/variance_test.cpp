#include <gtest/gtest.h>

#include <array>
#include <cmath>

#include "basalt/geo.h"
#include "tests/geo/plain_forms.h"

namespace {

using Six = std::array<double, 6>;

Six to_llh(const geo_vector& at, const Six& covariance) {
    Six out = {};
    EXPECT_EQ(Varxyz2varllh(&at, covariance.data(), out.data()), 1);
    return out;
}

Six to_neu(const geo_vector& at, const Six& covariance) {
    Six out = {};
    EXPECT_EQ(Varxyz2varneu(&at, covariance.data(), out.data()), 1);
    return out;
}

TEST(Variance, TurnsTheAxesAtTheEquator) {
    const geo_vector at = {6378137.0, 0.0, 0.0};
    EXPECT_EQ(to_llh(at, {1.0, 0.0, 0.0, 0.0, 0.0, 0.0}), (Six{0.0, 0.0, 1.0, 0.0, 0.0, 0.0}));
    // x is up, y east, z north: each covariance has a place of its own.
    EXPECT_EQ(to_neu(at, {1.0, 2.0, 3.0, 0.4, 0.5, 0.6}), (Six{3.0, 2.0, 1.0, 0.6, 0.5, 0.4}));
    const double m = 6335439.327292829;
    const Six out = to_llh(at, {0.0, 0.0, 1.0, 0.0, 0.0, 0.0});
    EXPECT_DOUBLE_EQ(out[0], 1.0 / (m * m));
    EXPECT_EQ(out[2], 0.0);
}

// The covariance d d^T of an error along one direction d becomes that of the error's own components.
TEST(Variance, FollowsAnErrorAlongADirection) {
    plain::Random random(3);
    SCOPED_TRACE("seed 3");
    for (int round = 0; round < 200; ++round) {
        const geo_llh llh = {random.real(-1.5, 1.5), random.real(-3.1, 3.1), random.real(-1e4, 2e7)};
        geo_vector at = {};
        _llh2xyz(&llh, &at);
        const geo_vector d = {random.real(-8.0, 8.0), random.real(-8.0, 8.0), random.real(-8.0, 8.0)};
        const Six q = {d.x * d.x, d.y * d.y, d.z * d.z, d.x * d.y, d.x * d.z, d.y * d.z};
        const geo_vector moved = {at.x + d.x, at.y + d.y, at.z + d.z};
        geo_nee local = {};
        _xyz2nez(&at, &moved, &local);
        double m = 0.0;
        double n = 0.0;
        _wgs84curvature(llh.latitude, m, n);
        const double latitude = local.north / (m + llh.height);
        const double longitude = local.east / ((n + llh.height) * std::cos(llh.latitude));
        const auto expect = [](const Six& out, double a, double b, double c, double ab) {
            const Six expected = {a * a, b * b, c * c, a * b, a * c, b * c};
            const Six unit = {ab * ab, ab * ab, 1.0, ab * ab, ab, ab};  // of angles in metres
            for (std::size_t i = 0; i < 6; ++i) {
                EXPECT_NEAR(out[i], expected[i], 1e-6 * unit[i]) << i;  // the move is rounded to 4e-9 m
            }
        };
        expect(to_neu(at, q), local.north, local.east, local.elevation, 1.0);
        expect(to_llh(at, q), latitude, longitude, local.elevation,
               1.0 / ((n + llh.height) * std::cos(llh.latitude)));
    }
}

TEST(Variance, AnswersAPositionThatIsNone) {
    const Six none = {GEO_NULL, GEO_NULL, GEO_NULL, GEO_NULL, GEO_NULL, GEO_NULL};
    const Six some = {1.0, 1.0, 1.0, 0.0, 0.0, 0.0};
    for (const geo_vector& at : {geo_vector{0.0, 0.0, 0.0}, {std::nan(""), 1.0, 1.0}, {5e4, 0.0, 1e4}}) {
        EXPECT_EQ(to_llh(at, some), none);
        EXPECT_EQ(to_neu(at, some), none);
    }
}

TEST(Variance, MayBeWrittenOverItsInput) {
    const geo_vector at = {4.0e6, -1.5e6, 4.7e6};
    Six covariance = {2.0, 3.0, 5.0, 0.7, -0.4, 1.1};
    const Six apart = to_neu(at, covariance);
    Varxyz2varneu(&at, covariance.data(), covariance.data());
    EXPECT_EQ(covariance, apart);
}

}  // namespace
