// Results have the same bits under every compiler, at every optimisation, on every processor: thousands of
// them are folded into one number each.
#include <gtest/gtest.h>

#include <bit>
#include <cstdint>
#include <vector>

#include "basalt/geo.h"
#include "tests/geo/plain_forms.h"

namespace {

/// FNV-1a over whole 64-bit words.
class Fold {
public:
    template <class... Results>
    void add(Results... results) {
        ((m_value = (m_value ^ std::bit_cast<std::uint64_t>(static_cast<double>(results))) * 1099511628211U),
         ...);
    }
    std::uint64_t value() const { return m_value; }

private:
    std::uint64_t m_value = 14695981039346656037U;
};

TEST(ExactResults, AreTheSameOnEveryCompiler) {
    plain::Random random(1);
    Fold fold;
    std::vector<geo_nee> v(24);
    for (int round = 0; round < 4000; ++round) {
        const bool coarse = round % 2 == 0;
        const auto coordinate = [&](double origin) {
            return coarse ? random.below(7) : origin + random.real(-300.0, 300.0);
        };
        for (geo_nee& p : v) {
            p = {coordinate(5.8e6), coordinate(3.5e5), coordinate(40.0)};
        }
        const geo_nee a = v[0], b = v[1], c = v[2];
        const geo_vector p = {a.east, a.north, a.elevation};
        const geo_vector q = {b.east, b.north, b.elevation};
        const double t = random.real(-130.0, 130.0);
        const double u = random.real(-7.0, 7.0);
        const double tolerance = coarse ? random.real(0.0, 2.0) : random.real(0.0, 50.0);
        geo_nee middle = {};
        geo_grid_centroid(a, b, middle);
        fold.add(geo_normalised_bearing(t), geo_horz_dist(a, b), geo_horz_distSq(a, b), geo_slope_dist(a, b),
                 geo_gradient2(a, b), geo_grid_divergence(t, u), geo_bisected_bearing(t, u),
                 geo_vector_length(p, q), geo_vector_len(p), geo_triangle_area(a, b, c), middle.north,
                 middle.east, middle.elevation, geo_point_in_poly(23, v.data(), &v[23]),
                 geo_point_on_polyline(23, v.data(), &v[23], tolerance),
                 geo_lines_cross(v[0], v[1], v[2], v[3]));
    }
    EXPECT_EQ(fold.value(), 8501370816125177454U);
}

TEST(ExactResults, OfCurvesAreTheSameOnEveryCompiler) {
    plain::Random random(2);
    Fold fold;
    for (int round = 0; round < 4000; ++round) {
        // Some arcs stand off their chord by more than the radius, some spirals are too long for K.
        const double radius = random.real(5.0, 300.0);
        const double separation = random.real(0.0, 50.0);
        const double length = random.real(-20.0, 200.0);
        const double k = radius * 40.0;
        double x = 0.0, y = 0.0;
        geo_spiral_deltas(length, k, 1e-9, x, y);
        fold.add(geo_arc_angle_to_length(length / 30.0, radius), geo_arc_length_to_angle(length, radius),
                 geo_arc_to_chord(radius, separation), geo_spiral_deflection(length, k), x, y);
    }
    EXPECT_EQ(fold.value(), 14889729433225187223U);
}

TEST(ExactResults, OfAnglesAreTheSameOnEveryCompiler) {
    plain::Random random(3);
    Fold fold;
    for (int round = 0; round < 4000; ++round) {
        const auto point = [&] {
            return geo_nee{random.real(-90.0, 90.0), random.real(-90.0, 90.0), random.real(0.0, 9.0)};
        };
        const geo_nee a = point(), b = point(), c = point();
        const geo_vector v = {b.east, b.north, b.elevation};
        const double t = random.real(-7.0, 7.0), u = random.real(-7.0, 7.0);
        geo_nee met = {}, reduced = {}, followed = {};
        geo_hvd seen = {};
        const int meets = geo_grid_bb_intersect(a, b, t, u, met);
        geo_reduce_obs({t, u, c.elevation}, a, 1.5, reduced, 0.9996);
        geo_calc_obs(a, 1.5, b, 1.6, seen, 0.9996);
        geo_grid_follow(a, t, c.north, u, followed);
        fold.add(geo_grid_bearing(a, b), geo_gradient(a, b), geo_grid_divergence(a, b, b, c),
                 geo_vector_direction(v), geo_vector_gradient(v), geo_vector_x_component_gradient(v),
                 geo_vector_y_component_gradient(v), geo_point_on_line(a, b, c, 40.0), meets, met.north,
                 met.east, reduced.north, reduced.east, reduced.elevation, seen.horizontal, seen.vertical,
                 seen.distance, followed.north, followed.east, followed.elevation);
    }
    EXPECT_EQ(fold.value(), 5454054674292647459U);
}

TEST(ExactResults, OnTheEllipsoidAreTheSameOnEveryCompiler) {
    plain::Random random(4);
    Fold fold;
    for (int round = 0; round < 4000; ++round) {
        const auto place = [&] {
            return geo_llh{random.real(-1.57, 1.57), random.real(-3.1, 3.1), random.real(-400.0, 9000.0)};
        };
        const geo_llh a = place(), b = place(), near = {a.latitude + 0.001, a.longitude - 0.002, 5.0};
        geo_vector xyz = {};
        geo_llh back = {}, end = {};
        geo_nee local = {};
        double meridian = 0.0, prime = 0.0, azimuth = 0.0, variance[12] = {};
        const double covariance[6] = {4e-4, 9e-4, 1e-4, 1e-5, -2e-5, 3e-5};
        _llh2xyz(&a, &xyz);
        _xyz2llh(&xyz, &back, 5e-10);
        const geo_vector origin = {xyz.x + 100.0, xyz.y - 200.0, xyz.z};
        _xyz2nez(&origin, &xyz, &local);
        _wgs84curvature(a.latitude, meridian, prime);
        geo_vincenty_direct(a, b.longitude, 1e3 * b.height, azimuth, end);
        Varxyz2varllh(&xyz, covariance, variance);
        Varxyz2varneu(&xyz, covariance, variance + 6);
        const basalt::GeodesicInverse inverse = basalt::geodesic_inverse(a, b);
        fold.add(xyz.x, xyz.y, xyz.z, back.latitude, back.longitude, back.height, local.north, local.east,
                 local.elevation, meridian, prime, end.latitude, end.longitude, azimuth,
                 geo_vincenty_distance(a, b), geo_vincenty_bearing(a, b),
                 geo_vincenty_crosstrack(a, end, near), inverse.distance, inverse.azimuth_from,
                 inverse.azimuth_to);
        for (const double v : variance) {
            fold.add(v);
        }
    }
    EXPECT_EQ(fold.value(), 11646124839276931258U);
}

}  // namespace
