// Results made of + - * / sqrt and comparisons are the same bit for bit on every compiler and at every
// optimisation. Thousands of them are folded into one number, here and from the formulas written out beside.
#include <gtest/gtest.h>

#include <bit>
#include <cmath>
#include <vector>

#include "basalt/geo.h"
#include "tests/geo/plain_forms.h"

namespace {

/// FNV-1a over whole 64-bit words.
class Fold {
public:
    void add(double value) { m_hash = (m_hash ^ std::bit_cast<std::uint64_t>(value)) * 1099511628211U; }
    std::uint64_t value() const { return m_hash; }

private:
    std::uint64_t m_hash = 14695981039346656037U;
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
    Fold library;
    Fold formulas;
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

        library.add(geo_normalised_bearing(t));
        library.add(geo_horz_dist(a, b));
        library.add(geo_horz_distSq(a, b));
        library.add(geo_slope_dist(a, b));
        library.add(geo_gradient2(a, b));
        library.add(geo_grid_divergence(t, u));
        library.add(geo_bisected_bearing(t, u));
        library.add(geo_vector_length(p, q));
        library.add(geo_vector_len(p));
        library.add(geo_triangle_area(a, b, c));
        geo_nee middle = {};
        geo_grid_centroid(a, b, middle);
        library.add(middle.north);
        library.add(middle.east);
        library.add(middle.elevation);
        library.add(geo_point_in_poly(23, v.data(), &v[23]));
        library.add(geo_point_on_polyline(23, v.data(), &v[23], tolerance));
        library.add(geo_lines_cross(v[0], v[1], v[2], v[3]));

        formulas.add(bearing(t));
        const double run = std::sqrt(square(b.east - a.east) + square(b.north - a.north));
        const double rise = b.elevation - a.elevation;
        formulas.add(run);
        formulas.add(square(b.east - a.east) + square(b.north - a.north));
        formulas.add(std::sqrt(square(b.north - a.north) + square(b.east - a.east) + square(rise)));
        formulas.add(run < 0.0001 ? (rise > 0.0 ? 2e100 : -2e100) : rise / run);
        const double turn = bearing(t - u);
        formulas.add(turn > 3.141592653589793 ? 6.283185307179586 - turn : turn);
        double swept = bearing(u - t);
        swept = swept > 3.141592653589793 ? swept - 6.283185307179586 : swept;
        formulas.add(bearing(t + swept * 0.5));
        formulas.add(std::sqrt(square(p.x - q.x) + square(p.y - q.y) + square(p.z - q.z)));
        formulas.add(std::sqrt(square(p.x) + square(p.y) + square(p.z)));
        formulas.add(
            std::fabs((a.east - b.east) * (a.north - c.north) - (a.east - c.east) * (a.north - b.north)) *
            0.5);
        formulas.add((a.north + b.north) * 0.5);
        formulas.add((a.east + b.east) * 0.5);
        formulas.add((a.elevation + b.elevation) * 0.5);
        formulas.add(plain::point_in_poly(23, v.data(), v[23]));
        formulas.add(plain::point_on_polyline(23, v.data(), v[23], tolerance));
        formulas.add(plain::lines_cross(v[0], v[1], v[2], v[3]));
        ASSERT_EQ(library.value(), formulas.value()) << round;
    }
    EXPECT_EQ(library.value(), 8501370816125177454U);
}

TEST(ExactResults, OfCurvesAreTheSameOnEveryCompiler) {
    plain::Random random(2);
    Fold library;
    Fold formulas;
    for (int round = 0; round < 4000; ++round) {
        // Some arcs stand off their chord by more than the radius, some spirals are too long for K.
        const double radius = random.real(5.0, 300.0);
        const double separation = random.real(0.0, 50.0);
        const double length = random.real(-20.0, 200.0);
        const double k = radius * 40.0;
        double x = 0.0;
        double y = 0.0;

        library.add(geo_arc_angle_to_length(length / 30.0, radius));
        library.add(geo_arc_length_to_angle(length, radius));
        library.add(geo_arc_to_chord(radius, separation));
        library.add(geo_spiral_deflection(length, k));
        geo_spiral_deltas(length, k, 1e-9, x, y);
        library.add(x);
        library.add(y);

        formulas.add(length / 30.0 * radius);
        formulas.add(length / radius);
        formulas.add(separation >= radius ? 2.0 * radius
                                          : std::sqrt(2.0 * radius * separation - separation * separation));
        formulas.add(length < 0.0 ? 0.0 : length * length / k);
        plain::spiral_deltas(length, k, 1e-9, x, y);
        formulas.add(x);
        formulas.add(y);
        ASSERT_EQ(library.value(), formulas.value()) << round;
    }
    EXPECT_EQ(library.value(), 14889729433225187223U);
}

}  // namespace
