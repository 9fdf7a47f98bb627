#include <gtest/gtest.h>

#include <array>
#include <cmath>
#include <vector>

#include "basalt/geo.h"

namespace {

using Six = std::array<double, 6>;

Six local(const geo_vector& p, const Six& q) {
    Six out = {};
    EXPECT_EQ(Varxyz2varneu(&p, q.data(), out.data()), 1);
    return out;
}

Six geodetic(const geo_vector& p, const Six& q) {
    Six out = {};
    EXPECT_EQ(Varxyz2varllh(&p, q.data(), out.data()), 1);
    return out;
}

const std::vector<geo_vector> POSITIONS = {
    {4e6, 6e5, 4.9e6}, {-2.7e6, -4.3e6, 3.8e6}, {-4.6e6, 2.5e6, -3.6e6}, {1.5e7, -2e7, 3e6}};

TEST(Variance, OnTheEquatorAtLongitude0) {
    const geo_vector p = {6378137.0, 0.0, 0.0};
    const double m = 6335439.327292829;
    EXPECT_EQ(local(p, {1, 0, 0, 0, 0, 0}), (Six{0, 0, 1, 0, 0, 0}));
    EXPECT_EQ(geodetic(p, {1, 0, 0, 0, 0, 0}), (Six{0, 0, 1, 0, 0, 0}));
    EXPECT_DOUBLE_EQ(geodetic(p, {0, 0, 1, 0, 0, 0})[0], 1.0 / (m * m));
    // Each covariance has its own place: y is east, z is north, x is up.
    EXPECT_EQ(local(p, {2, 3, 5, 7, 11, 13}), (Six{5, 3, 2, 13, 11, 7}));
}

TEST(Variance, IsotropicStaysIsotropic) {
    for (const geo_vector& p : POSITIONS) {
        const Six out = local(p, {4, 4, 4, 0, 0, 0});
        for (std::size_t i = 0; i < 6; ++i) {
            EXPECT_NEAR(out[i], i < 3 ? 4.0 : 0.0, 1e-14);
        }
    }
}

TEST(Variance, AgreesWithNumericalDerivatives) {
    const Six q = {0.9, 1.3, 2.1, 0.2, -0.4, 0.3};
    const double full[3][3] = {{0.9, 0.2, -0.4}, {0.2, 1.3, 0.3}, {-0.4, 0.3, 2.1}};
    const int place[6][2] = {{0, 0}, {1, 1}, {2, 2}, {0, 1}, {0, 2}, {1, 2}};
    for (const geo_vector& p : POSITIONS) {
        double j[3][3] = {};
        const double step = 100.0;
        for (int axis = 0; axis < 3; ++axis) {
            geo_vector low = p, high = p;
            (axis == 0 ? low.x : axis == 1 ? low.y : low.z) -= step;
            (axis == 0 ? high.x : axis == 1 ? high.y : high.z) += step;
            geo_llh a = {}, b = {};
            ASSERT_EQ(_xyz2llh(&low, &a, 1e-12), 1);
            ASSERT_EQ(_xyz2llh(&high, &b, 1e-12), 1);
            j[0][axis] = (b.latitude - a.latitude) / (2 * step);
            j[1][axis] = (b.longitude - a.longitude) / (2 * step);
            j[2][axis] = (b.height - a.height) / (2 * step);
        }
        const Six out = geodetic(p, q);
        for (std::size_t i = 0; i < 6; ++i) {
            const int r = place[i][0], c = place[i][1];
            double expected = 0.0;
            for (int k = 0; k < 3; ++k) {
                for (int l = 0; l < 3; ++l) {
                    expected += j[r][k] * full[k][l] * j[c][l];
                }
            }
            // An angle's unit is a radian, some 1e-7 of a metre's.
            const double unit = (r < 2 ? 1.5e-7 : 1.0) * (c < 2 ? 1.5e-7 : 1.0);
            EXPECT_NEAR(out[i], expected, 1e-7 * unit) << p.x << " " << i;
        }
    }
}

TEST(Variance, WithoutAPositionIsNull) {
    const Six q = {1, 1, 1, 0, 0, 0};
    const Six none = {GEO_NULL, GEO_NULL, GEO_NULL, GEO_NULL, GEO_NULL, GEO_NULL};
    for (const geo_vector& p : {geo_vector{0, 0, 0}, {NAN, 1, 1}, {15000, 0, 15100}}) {
        EXPECT_EQ(local(p, q), none);
        EXPECT_EQ(geodetic(p, q), none);
    }
    Six both = {2, 3, 5, 7, 11, 13};
    const geo_vector p = {6378137.0, 0.0, 0.0};
    Varxyz2varneu(&p, both.data(), both.data());
    EXPECT_EQ(both, (Six{5, 3, 2, 13, 11, 7}));
}

}  // namespace
