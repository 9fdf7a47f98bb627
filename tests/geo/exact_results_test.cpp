// Results made of + - * / sqrt and comparisons are the same bit for bit on every compiler and at every
// optimisation. Thousands of them are folded into one number.
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

}  // namespace
