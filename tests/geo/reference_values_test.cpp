// Against rows of independent programs, see the first lines of tests/data/*.csv. How large the errors are
// over the whole globe is measured by scripts/accuracy.sh; here stands what they may be, and why.
#include <gtest/gtest.h>

#include <cmath>
#include <string>
#include <vector>

#include "basalt/geo.h"
#include "tests/support/reference_rows.h"

namespace {

constexpr double A = 6378137.0;
constexpr double E2 = 0.00669437999014;
/// Rounding of an angle up to pi to a double, and of the few operations that follow it.
constexpr long double ROUNDING = 1.5e-15L;

std::vector<ReferenceRow> rows_of(const char* name, std::size_t columns) {
    const auto rows = read_reference_rows(std::string(BASALT_TEST_DATA "/") + name, columns);
    EXPECT_GE(rows.size(), 200U) << name;
    return rows;
}

testing::Message where(const ReferenceRow& row) {
    return testing::Message() << "latitude " << row[0] << ", azimuth or height " << row[2];
}

double radians(long double degrees) {
    return static_cast<double>(radians_of(degrees));
}

TEST(ReferenceValues, GeodeticToCartesianIsRightToRounding) {
    for (const ReferenceRow& row : rows_of("cartesian_geodetic.csv", 6)) {
        const geo_llh llh = {radians(row[0]), radians(row[1]), static_cast<double>(row[2])};
        geo_vector xyz = {};
        ASSERT_EQ(_llh2xyz(&llh, &xyz), 1);
        EXPECT_LE(std::hypot(xyz.x - row[3], xyz.y - row[4], xyz.z - row[5]),
                  ROUNDING * (A + std::abs(llh.height)))
            << where(row);
    }
}

/// A pass takes an error of the latitude down to the pull e^2 N / (N + h) of it, and the last pass moved the
/// latitude by no more than the tolerance.
long double latitude_bound(double height, double primeVertical, double tolerance) {
    const long double pull = E2 * primeVertical / (primeVertical + height);
    return tolerance * pull / (1.0L - pull) + ROUNDING / 2;
}

TEST(ReferenceValues, CartesianToGeodeticIsRightWithinItsTolerance) {
    const auto rows = rows_of("cartesian_geodetic.csv", 6);
    int polar = 0;
    for (const double tolerance : {5e-10, 5e-9}) {
        for (const ReferenceRow& row : rows) {
            const geo_vector xyz = {static_cast<double>(row[3]), static_cast<double>(row[4]),
                                    static_cast<double>(row[5])};
            const auto height = static_cast<double>(row[2]);
            // Deeper down the iteration slows until it refuses.
            if (height < -5000e3) {
                continue;
            }
            SCOPED_TRACE(where(row));
            geo_llh llh = {};
            ASSERT_EQ(_xyz2llh(&xyz, &llh, tolerance), 1);
            double meridian = 0.0;
            double primeVertical = 0.0;
            _wgs84curvature(llh.latitude, meridian, primeVertical);
            const long double latitude = radians_of(row[0]);
            const long double bound = latitude_bound(height, primeVertical, tolerance);
            EXPECT_LE(std::abs(llh.latitude - latitude), bound);
            const long double fromAxis = std::hypot(row[3], row[4]);
            if (std::abs(row[0]) != 90.0L) {
                EXPECT_LE(std::abs(angle_difference(llh.longitude, radians_of(row[1]))) * fromAxis, 1e-8L);
            }
            // What an error of the latitude does to p / cos, and to z / sin near the poles.
            const bool nearPole = std::abs(llh.latitude) > radians(80.0L);
            polar += nearPole ? 1 : 0;
            const long double tangent = std::tan(std::abs(latitude));
            const long double lever = (A + std::abs(height)) * (nearPole ? 1.0L / tangent : tangent);
            EXPECT_LE(std::abs(llh.height - row[2]), lever * bound + ROUNDING * (A + std::abs(height)));
        }
    }
    EXPECT_GE(polar, 50) << "rows of the polar formula";
}

TEST(ReferenceValues, TheDirectGeodesicIsRightWithinItsSeriesAndItsConstants) {
    for (const ReferenceRow& row : rows_of("geodesics.csv", 9)) {
        SCOPED_TRACE(where(row));
        double azimuth = 0.0;
        geo_llh end = {};
        geo_vincenty_direct({radians(row[0]), radians(row[1]), 0.0}, radians(row[2]),
                            static_cast<double>(row[3]), azimuth, end);
        // The arc settles to 1e-12 rad. What grows with the distance is the semi-minor axis, written to 0.1
        // mm (7.1e-12 of it), and the terms the series leaves out; together they stayed below the first alone
        // in the 40,000 lines of docs/accuracy.md.
        const long double arc = 1.02e-12L + 7.1e-12L * row[3] / A + ROUNDING;
        const long double cosine = std::cos(radians_of(row[4]));
        const long double north = end.latitude - radians_of(row[4]);
        const long double east = angle_difference(end.longitude, radians_of(row[5])) * cosine;
        EXPECT_LE(std::hypot(north, east), arc);
        EXPECT_LE(std::abs(angle_difference(azimuth, radians_of(row[6]))) * cosine, arc);
    }
}

TEST(ReferenceValues, TheSphereIsAsFarOffAsItsRadiusIsFromTheEllipsoids) {
    // Radii of curvature run from a (1 - e^2) to a / sqrt(1 - e^2).
    constexpr double LONGEST = 6371000.0 / 6335439.327 - 1.0;
    constexpr double SHORTEST = 6371000.0 / 6399593.626 - 1.0;
    // Half of e^2 is the most a geographic latitude, taken for a sphere's, turns a short line.
    constexpr long double TURN = 0.00336L * 1.02L;
    for (const ReferenceRow& row : rows_of("geodesics.csv", 9)) {
        if (row[8] > 10000e3L) {
            continue;
        }
        SCOPED_TRACE(where(row));
        const geo_llh from = {radians(row[0]), radians(row[1]), 0.0};
        const geo_llh to = {radians(row[4]), radians(row[5]), 0.0};
        const long double relative = geo_vincenty_distance(from, to) / row[8] - 1.0L;
        EXPECT_LE(relative, LONGEST + 1e-6);
        EXPECT_GE(relative, SHORTEST - 1e-6);
        const long double turn = angle_difference(geo_vincenty_bearing(from, to), radians_of(row[7]));
        EXPECT_LE(std::abs(turn) * std::cos(radians_of(row[0])), TURN);
    }
}

}  // namespace
