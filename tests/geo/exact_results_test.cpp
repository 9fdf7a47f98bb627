// Results made of + - * / sqrt and comparisons are the same bit for bit on every compiler and at every
// optimisation. Thousands of them are folded into one number, here and from the formulas written out beside.
#include <gtest/gtest.h>

#include <bit>
#include <cmath>
#include <vector>

#include "basalt/geo.h"
#include "tests/geo/plain_forms.h"

namespace {

/// The library's results, and those of the formulas, each folded by FNV-1a over whole 64-bit words.
class Folds {
public:
    void add(double result, double expected) {
        fold(m_results, result);
        fold(m_expected, expected);
    }
    bool agree() const { return m_results == m_expected; }
    std::uint64_t value() const { return m_results; }

private:
    static void fold(std::uint64_t& hash, double value) {
        hash = (hash ^ std::bit_cast<std::uint64_t>(value)) * 1099511628211U;
    }

    std::uint64_t m_results = 14695981039346656037U, m_expected = m_results;
};

double bearing(double a) {
    if (a == 2e-308 || a > 100.0 || a < -100.0) {
        return a;
    }
    for (; a >= 6.283185307179586; a = a - 6.283185307179586) {
    }
    for (; a < 0.0; a = a + 6.283185307179586) {
    }
    return a >= 6.283185307179586 ? 0.0 : a;
}

double square(double x) {
    return x * x;
}

TEST(ExactResults, AreTheSameOnEveryCompiler) {
    plain::Random random(1);
    Folds folds;
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
        geo_vector p = {a.east, a.north, a.elevation};
        geo_vector q = {b.east, b.north, b.elevation};
        const double t = random.real(-130.0, 130.0);
        const double u = random.real(-7.0, 7.0);
        const double tolerance = coarse ? random.real(0.0, 2.0) : random.real(0.0, 50.0);

        folds.add(geo_normalised_bearing(t), bearing(t));
        const double run = std::sqrt(square(b.east - a.east) + square(b.north - a.north));
        const double rise = b.elevation - a.elevation;
        folds.add(geo_horz_dist(a, b), run);
        folds.add(geo_horz_distSq(a, b), square(b.east - a.east) + square(b.north - a.north));
        folds.add(geo_slope_dist(a, b),
                  std::sqrt(square(b.north - a.north) + square(b.east - a.east) + square(rise)));
        folds.add(geo_gradient2(a, b), run < 0.0001 ? (rise > 0.0 ? 2e100 : -2e100) : rise / run);
        const double turn = bearing(t - u);
        folds.add(geo_grid_divergence(t, u), turn > 3.141592653589793 ? 6.283185307179586 - turn : turn);
        double swept = bearing(u - t);
        swept = swept > 3.141592653589793 ? swept - 6.283185307179586 : swept;
        folds.add(geo_bisected_bearing(t, u), bearing(t + swept * 0.5));
        folds.add(geo_vector_length(p, q),
                  std::sqrt(square(p.x - q.x) + square(p.y - q.y) + square(p.z - q.z)));
        folds.add(geo_vector_len(p), std::sqrt(square(p.x) + square(p.y) + square(p.z)));
        folds.add(geo_triangle_area(a, b, c), std::fabs((a.east - b.east) * (a.north - c.north) -
                                                        (a.east - c.east) * (a.north - b.north)) *
                                                  0.5);
        geo_nee middle = {};
        geo_grid_centroid(a, b, middle);
        folds.add(middle.north, (a.north + b.north) * 0.5);
        folds.add(middle.east, (a.east + b.east) * 0.5);
        folds.add(middle.elevation, (a.elevation + b.elevation) * 0.5);
        folds.add(geo_point_in_poly(23, v.data(), &v[23]), plain::point_in_poly(23, v.data(), v[23]));
        folds.add(geo_point_on_polyline(23, v.data(), &v[23], tolerance),
                  plain::point_on_polyline(23, v.data(), v[23], tolerance));
        folds.add(geo_lines_cross(v[0], v[1], v[2], v[3]), plain::lines_cross(v[0], v[1], v[2], v[3]));
        ASSERT_TRUE(folds.agree()) << round;
    }
    EXPECT_EQ(folds.value(), 8501370816125177454U);
}

TEST(ExactResults, OfCurvesAreTheSameOnEveryCompiler) {
    plain::Random random(2);
    Folds folds;
    for (int round = 0; round < 4000; ++round) {
        // Some arcs stand off their chord by more than the radius, some spirals are too long for K.
        const double radius = random.real(5.0, 300.0);
        const double separation = random.real(0.0, 50.0);
        const double length = random.real(-20.0, 200.0);
        const double k = radius * 40.0;
        folds.add(geo_arc_angle_to_length(length / 30.0, radius), length / 30.0 * radius);
        folds.add(geo_arc_length_to_angle(length, radius), length / radius);
        folds.add(geo_arc_to_chord(radius, separation),
                  separation >= radius ? 2.0 * radius
                                       : std::sqrt(2.0 * radius * separation - separation * separation));
        folds.add(geo_spiral_deflection(length, k), length < 0.0 ? 0.0 : length * length / k);
        double x = 0.0;
        double y = 0.0;
        double plain_x = 0.0;
        double plain_y = 0.0;
        geo_spiral_deltas(length, k, 1e-9, x, y);
        plain::spiral_deltas(length, k, 1e-9, plain_x, plain_y);
        folds.add(x, plain_x);
        folds.add(y, plain_y);
        ASSERT_TRUE(folds.agree()) << round;
    }
    EXPECT_EQ(folds.value(), 14889729433225187223U);
}

}  // namespace
