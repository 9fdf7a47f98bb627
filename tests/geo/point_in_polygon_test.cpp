#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <numbers>
#include <string>
#include <vector>

#include "basalt/geo.h"
#include "src/geo/polygon_edges.h"
#include "tests/geo/plain_forms.h"

namespace {

using namespace plain;
using namespace basalt::geo;
using Polygon = std::vector<geo_nee>;

int count(const Polygon& polygon) {
    return static_cast<int>(polygon.size());
}

/// Asks every form of the test without a tolerance; -1 when they disagree with the plain loop.
int in_poly(const Polygon& polygon, const geo_nee& point) {
    const int n = count(polygon);
    const int expected = plain::point_in_poly(n, polygon.data(), point);
    bool agree = geo_point_in_poly(n, polygon.data(), &point) == expected;
    agree = agree && crossing_parity_portable<VertexTest::YES>(n, polygon.data(), point) == expected;
#if BASALT_HAS_AVX2_FORM
    if (n >= 5 && __builtin_cpu_supports("avx2")) {
        agree = agree && crossing_parity_avx2<VertexTest::YES>(n, polygon.data(), point) == expected;
    }
#endif
    return agree ? expected : -1;
}

int in_band(const Polygon& polygon, const geo_nee& point, double tolerance) {
    const int n = count(polygon);
    const int expected = plain::point_in_poly_2(n, polygon.data(), point, tolerance);
    bool agree = geo_point_in_poly_2(n, polygon.data(), &point, tolerance) == expected;
    if (tolerance >= 0.0) {
        bool band = false;
        for (int i = 1; i < n; ++i) {
            const auto at = static_cast<std::size_t>(i);
            band = band || plain::point_on_line(polygon[at], polygon[at - 1], point, tolerance) == 1;
        }
        agree = agree && is_in_a_band_portable(n, polygon.data(), point, tolerance) == band;
#if BASALT_HAS_AVX2_FORM
        if (n >= 5 && __builtin_cpu_supports("avx2")) {
            agree = agree && is_in_a_band_avx2(n, polygon.data(), point, tolerance) == band;
        }
#endif
    }
    return agree ? expected : -1;
}

Polygon star(Random& random, int n, const geo_nee& centre, double radius) {
    Polygon polygon;
    for (int i = 0; i < n; ++i) {
        const double angle = 2.0 * std::numbers::pi * i / n;
        const double r = radius * random.real(0.6, 1.0);
        polygon.push_back({centre.north + r * std::cos(angle), centre.east + r * std::sin(angle), 0.0});
    }
    return polygon;
}

TEST(PointInPolygon, SquareFacts) {
    const Polygon square = {{0, 0, 1}, {0, 10, 2}, {10, 10, 3}, {10, 0, 4}};
    EXPECT_EQ(in_poly(square, {5, 5, 99}), 1);
    EXPECT_EQ(in_poly(square, {15, 5, 1}), 0);
    for (const geo_nee& vertex : square) {
        EXPECT_EQ(in_poly(square, vertex), 1);
    }
    // On an edge: west and south edges belong to the square, east and north ones do not.
    EXPECT_EQ(in_poly(square, {5, 0, 0}), 1);
    EXPECT_EQ(in_poly(square, {0, 5, 0}), 1);
    EXPECT_EQ(in_poly(square, {5, 10, 0}), 0);
    EXPECT_EQ(in_poly(square, {10, 5, 0}), 0);
}

TEST(PointInPolygon, FewVerticesHoldThemselvesOnly) {
    const geo_nee point = {1, 1, 0};
    for (const int n : {0, -1, std::numeric_limits<int>::min()}) {
        EXPECT_EQ(geo_point_in_poly(n, nullptr, nullptr), 0);
        EXPECT_EQ(geo_point_in_poly_2(n, nullptr, nullptr, 1.0), 0);
    }
    EXPECT_EQ(in_poly({point}, point), 1);
    EXPECT_EQ(in_poly({{1, 2, 0}}, point), 0);
    EXPECT_EQ(in_band({{1, 2, 0}}, point, 1.0), 1);
    EXPECT_EQ(in_band({{0, 1.5, 0}, {2, 1.5, 0}}, point, 0.501), 1);
}

TEST(PointInPolygon, EveryFormAgreesOnAwkwardPolygons) {
    const std::uint64_t seed = 20260401;
    SCOPED_TRACE("seed " + std::to_string(seed));
    Random random(seed);
    const double tolerances[] = {0.0,  1e-300, 1e-9, 0.25, 1.0,   1e6,          1e200,
                                 -0.0, -0.1,   -INF, INF,  1e308, NOT_A_NUMBER, GEO_NULL};
    for (int round = 0; round < 60000; ++round) {
        Polygon polygon(static_cast<std::size_t>(1 + random.below(round % 16 == 0 ? 70 : 12)));
        for (geo_nee& vertex : polygon) {
            vertex = {random.awkward(), random.awkward(), NOT_A_NUMBER};
        }
        if (random.below(3) == 0) {
            polygon.push_back(polygon.front());
        }
        const geo_nee point = {random.awkward(), random.awkward(), NOT_A_NUMBER};
        ASSERT_NE(in_poly(polygon, point), -1) << round;
        ASSERT_NE(in_band(polygon, point, tolerances[random.below(14)]), -1) << round;
    }
}

TEST(PointInPolygon, EveryFormAgreesNextToEdgesAndBandLimits) {
    const std::uint64_t seed = 4711;
    SCOPED_TRACE("seed " + std::to_string(seed));
    Random random(seed);
    int in_some_band = 0;
    for (int round = 0; round < 30000; ++round) {
        const double scale = std::pow(10.0, random.below(14) - 5);
        const geo_nee centre = {random.real(-1.0, 1.0) * 6e6, random.real(-1.0, 1.0) * 5e5, 0.0};
        const Polygon polygon = star(random, 3 + random.below(60), centre, scale);
        const auto at = static_cast<std::size_t>(random.below(count(polygon)));
        const geo_nee& a = polygon[at];
        const geo_nee& b = polygon[(at + 1) % polygon.size()];
        const double length = geo_horz_dist(a, b);
        const double tolerance = random.below(4) == 0 ? 0.0 : length * std::pow(10.0, -random.below(13));
        // A point on or near a corner or side of the band's rectangle.
        const double along = random.below(2) == 0
                                 ? random.real(0.0, 1.0)
                                 : (random.below(2) == 0 ? -tolerance : length + tolerance) / length;
        const double side = random.below(3) - 1.0;
        const double beside = tolerance * side * (1.0 + 1e-15 * (random.below(9) - 4)) / length;
        const double dn = b.north - a.north;
        const double de = b.east - a.east;
        const geo_nee point = {a.north + along * dn - beside * de, a.east + along * de + beside * dn, 0.0};
        ASSERT_NE(in_poly(polygon, point), -1) << round;
        const int result = in_band(polygon, point, tolerance);
        ASSERT_NE(result, -1) << round;
        in_some_band += result;
    }
    EXPECT_GT(in_some_band, 10000);
}

TEST(PointInPolygonBand, SquareFacts) {
    const Polygon square = {{0, 0, 1}, {0, 10, 2}, {10, 10, 3}, {10, 0, 4}};
    EXPECT_EQ(in_band(square, {5, 10.0004, 0}, 0.001), 1);
    EXPECT_EQ(in_band(square, {5, 10.0004, 0}, 0.0001), 0);
    // Bands end square: the corner of the band reaches sqrt(2) tolerances.
    EXPECT_EQ(in_band(square, {10.9, 10.9, 0}, 1.0), 1);
    EXPECT_EQ(in_band(square, {11.1, 10.9, 0}, 1.0), 0);
    // Squares of tiny distances underflow, so the exact test sees a point beside a vertex as the vertex.
    EXPECT_EQ(in_band(Polygon(7, {0, 0, 0}), {1e-170, -1e-170, 0}, 0.0), 1);
    // Without a band the vertex at the north-east is outside by its crossings.
    EXPECT_EQ(in_band(square, {10, 10, 0}, -1.0), 0);
    EXPECT_EQ(in_band(square, {10, 10, 0}, NOT_A_NUMBER), 0);
    EXPECT_EQ(in_band(square, {10, 10, 0}, 0.0), 1);
}

}  // namespace
