// Against rows of independent programs, see the first lines of tests/data/*.csv. The largest errors over the
// whole globe are in docs/accuracy.md; here are their bounds, and the reasons.
#include <gtest/gtest.h>

#include <cmath>
#include <vector>

#include "basalt/geo.h"
#include "tests/support/reference_rows.h"

namespace {

constexpr double A = 6378137.0;
constexpr double E2 = 0.00669437999014;
/// Rounding of an angle up to pi to a double, and of the few operations that follow it.
constexpr long double ROUNDING = 1.5e-15L;

double radians(long double degrees) {
    return static_cast<double>(radians_of(degrees));
}

geo_llh place(long double latitude, long double longitude, long double height = 0) {
    return {radians(latitude), radians(longitude), static_cast<double>(height)};
}

template <class Check>
void for_each_row(const char* name, std::size_t columns, const Check& check) {
    const std::vector<ReferenceRow> rows = read_reference_rows(name, columns);
    EXPECT_GE(rows.size(), 200U) << name;
    for (const ReferenceRow& row : rows) {
        SCOPED_TRACE(testing::Message() << "latitude " << row[0] << ", azimuth or height " << row[2]);
        check(row);
    }
}

TEST(ReferenceValues, ConversionsAreRightToRoundingAndTheTolerance) {
    int polar = 0;
    for_each_row(BASALT_TEST_DATA "/cartesian_geodetic.csv", 6, [&](const ReferenceRow& row) {
        const geo_llh place_of_row = place(row[0], row[1], row[2]);
        const double size = A + std::abs(place_of_row.height);
        geo_vector xyz = {};
        ASSERT_EQ(_llh2xyz(&place_of_row, &xyz), 1);
        EXPECT_LE(std::hypot(xyz.x - row[3], xyz.y - row[4], xyz.z - row[5]), ROUNDING * size);
        xyz = {static_cast<double>(row[3]), static_cast<double>(row[4]), static_cast<double>(row[5])};
        for (const double tolerance : {5e-10, 5e-9}) {
            if (row[2] < -5000e3L) {
                continue;  // deeper down the iteration slows until it refuses
            }
            geo_llh llh = {};
            ASSERT_EQ(_xyz2llh(&xyz, &llh, tolerance), 1);
            double meridian = 0.0, across = 0.0;
            _wgs84curvature(llh.latitude, meridian, across);
            // A pass takes an error of the latitude down to the pull e^2 N / (N + h) of it, and the last pass
            // moved the latitude by no more than the tolerance.
            const long double pull = E2 * across / (across + place_of_row.height);
            const long double bound = tolerance * pull / (1.0L - pull) + ROUNDING / 2;
            EXPECT_LE(std::abs(llh.latitude - radians_of(row[0])), bound);
            if (std::abs(row[0]) != 90.0L) {
                EXPECT_LE(std::abs(angle_difference(llh.longitude, radians_of(row[1]))) *
                              std::hypot(row[3], row[4]),
                          1e-8L);
            }
            // What an error of the latitude does to p / cos, and to z / sin near the poles.
            const bool near_pole = std::abs(llh.latitude) > radians(80.0L);
            polar += near_pole ? 1 : 0;
            const long double tangent = std::tan(std::abs(radians_of(row[0])));
            const long double lever = size * (near_pole ? 1.0L / tangent : tangent);
            EXPECT_LE(std::abs(llh.height - row[2]), lever * bound + ROUNDING * size);
        }
    });
    EXPECT_GE(polar, 50) << "rows of the polar formula";
}

TEST(ReferenceValues, GeodesicsAreRightWithinTheirSeriesAndConstants) {
    for_each_row(BASALT_TEST_DATA "/geodesics.csv", 9, [](const ReferenceRow& row) {
        const geo_llh from = place(row[0], row[1]);
        double azimuth = 0.0;
        geo_llh end = {};
        geo_vincenty_direct(from, radians(row[2]), static_cast<double>(row[3]), azimuth, end);
        // The arc settles to 1e-12 rad. What grows with the distance is the semi-minor axis, written to 0.1
        // mm (7.1e-12 of it), and the terms the series leaves out; together they stayed below the first alone
        // in the 40,000 lines of docs/accuracy.md.
        const long double arc = 1.02e-12L + 7.1e-12L * row[3] / A + ROUNDING;
        const long double cosine = std::cos(radians_of(row[4]));
        const long double north = end.latitude - radians_of(row[4]);
        const long double east = angle_difference(end.longitude, radians_of(row[5])) * cosine;
        EXPECT_LE(std::hypot(north, east), arc);
        EXPECT_LE(std::abs(angle_difference(azimuth, radians_of(row[6]))) * cosine, arc);
        // The sphere is as far off as its radius from the radii of curvature, a (1 - e^2) to a / sqrt(1 -
        // e^2); half of e^2 is the most a geographic latitude, taken for a sphere's, turns a short line.
        if (row[8] <= 10000e3L) {
            const geo_llh to = place(row[4], row[5]);
            const long double relative = geo_vincenty_distance(from, to) / row[8] - 1.0L;
            EXPECT_LE(relative, 6371000.0 / 6335439.327 - 1.0 + 1e-6);
            EXPECT_GE(relative, 6371000.0 / 6399593.626 - 1.0 - 1e-6);
            const long double turn = angle_difference(geo_vincenty_bearing(from, to), radians_of(row[7]));
            EXPECT_LE(std::abs(turn) * std::cos(radians_of(row[0])), 0.00336L * 1.02L);
        }
    });
}

TEST(ReferenceValues, TheInverseGeodesicIsRightTo20NanometresAnywhere) {
    for_each_row(BASALT_TEST_DATA "/geodesic_inverse.csv", 7, [](const ReferenceRow& row) {
        const geo_llh from = place(row[0], row[1]);
        const geo_llh to = place(row[2], row[3]);
        const basalt::GeodesicInverse line = basalt::geodesic_inverse(from, to);
        EXPECT_LE(std::abs(line.distance - row[6]), 2e-8L);
        EXPECT_EQ(basalt::geodesic_inverse(to, from).distance, line.distance);
        // Among nearly opposite places on the equator there are two lines of a length.
        if (row[6] < 19000e3L) {
            EXPECT_LE(std::abs(angle_difference(line.azimuth_from, radians_of(row[4]))) * row[6], 3e-8L);
            EXPECT_LE(std::abs(angle_difference(line.azimuth_to, radians_of(row[5]))) * row[6], 3e-8L);
        }
        double azimuth = 0.0;
        geo_llh end = {};
        geo_vincenty_direct(from, line.azimuth_from, line.distance, azimuth, end);
        EXPECT_LE(basalt::geodesic_inverse(end, to).distance, 1.5e-4);
        if (std::abs(row[2]) < 89) {
            EXPECT_LE(std::abs(angle_difference(azimuth, line.azimuth_to)) * std::cos(to.latitude), 1e-10L);
        }
    });
}

}  // namespace
