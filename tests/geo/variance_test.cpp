#include <gtest/gtest.h>

#include <array>
#include <cmath>
#include <numbers>

#include "basalt/geo.h"
#include "tests/geo/plain_forms.h"

namespace {

using Six = std::array<double, 6>;

constexpr double A = 6378137.0;

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

TEST(Variance, KeepsAnIsotropicOneInEveryFrame) {
    for (const geo_vector& at : {geo_vector{A, 0.0, 0.0}, {4.0e6, -1.5e6, 4.7e6}, {1.0, 2.0, -6.4e6}}) {
        const Six out = to_neu(at, {4.0, 4.0, 4.0, 0.0, 0.0, 0.0});
        for (int i = 0; i < 6; ++i) {
            EXPECT_NEAR(out[i], i < 3 ? 4.0 : 0.0, 1e-14) << i;
        }
    }
}

TEST(Variance, TurnsTheAxesAtTheEquator) {
    const geo_vector at = {A, 0.0, 0.0};
    EXPECT_EQ(to_neu(at, {1.0, 0.0, 0.0, 0.0, 0.0, 0.0}), (Six{0.0, 0.0, 1.0, 0.0, 0.0, 0.0}));
    EXPECT_EQ(to_llh(at, {1.0, 0.0, 0.0, 0.0, 0.0, 0.0}), (Six{0.0, 0.0, 1.0, 0.0, 0.0, 0.0}));
    // x is up, y east, z north: each covariance has a place of its own.
    EXPECT_EQ(to_neu(at, {1.0, 2.0, 3.0, 0.4, 0.5, 0.6}), (Six{3.0, 2.0, 1.0, 0.6, 0.5, 0.4}));
    const double m = 6335439.327292829;
    const Six out = to_llh(at, {0.0, 0.0, 1.0, 0.0, 0.0, 0.0});
    EXPECT_DOUBLE_EQ(out[0], 1.0 / (m * m));
    EXPECT_EQ(out[2], 0.0);
}

/// Column of derivatives of latitude, longitude and height along one Cartesian axis, by central differences.
std::array<double, 3> derivatives(geo_vector at, double geo_vector::*axis) {
    const double step = 200.0;
    const double middle = at.*axis;
    std::array<geo_llh, 2> llh = {};
    for (const int side : {0, 1}) {
        at.*axis = middle + (side == 0 ? -step : step);
        EXPECT_EQ(_xyz2llh(&at, &llh[static_cast<std::size_t>(side)], 1e-14), 1);
    }
    return {(llh[1].latitude - llh[0].latitude) / (2 * step),
            (llh[1].longitude - llh[0].longitude) / (2 * step), (llh[1].height - llh[0].height) / (2 * step)};
}

TEST(Variance, AgreesWithNumericalDifferentiation) {
    plain::Random random(3);
    SCOPED_TRACE("seed 3");
    for (int round = 0; round < 200; ++round) {
        const geo_llh llh = {random.real(-1.5, 1.5), random.real(-3.1, 3.1), random.real(-1e4, 2e6)};
        geo_vector at = {};
        _llh2xyz(&llh, &at);
        const std::array<std::array<double, 3>, 3> columns = {derivatives(at, &geo_vector::x),
                                                              derivatives(at, &geo_vector::y),
                                                              derivatives(at, &geo_vector::z)};
        const Six q = {2.0, 3.0, 5.0, 0.7, -0.4, 1.1};
        const double full[3][3] = {{q[0], q[3], q[4]}, {q[3], q[1], q[5]}, {q[4], q[5], q[2]}};
        const auto entry = [&](std::size_t i, std::size_t j) {
            double sum = 0.0;
            for (std::size_t k = 0; k < 3; ++k) {
                for (std::size_t l = 0; l < 3; ++l) {
                    sum += columns[k][i] * full[k][l] * columns[l][j];
                }
            }
            return sum;
        };
        const Six out = to_llh(at, q);
        const std::size_t places[6][2] = {{0, 0}, {1, 1}, {2, 2}, {0, 1}, {0, 2}, {1, 2}};
        for (std::size_t i = 0; i < 6; ++i) {
            const auto [row, column] = std::pair(places[i][0], places[i][1]);
            const double scale = std::sqrt(entry(row, row) * entry(column, column));
            // The differences leave out the third derivative: (step / distance from the axis)^2.
            const double third = std::pow(200.0 / std::hypot(at.x, at.y), 2.0);
            EXPECT_NEAR(out[i], entry(row, column), scale * (1e-6 + third)) << i;
        }
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
