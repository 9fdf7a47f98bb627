#include <algorithm>
#include <cmath>
#include <cstdio>

#include "basalt/geo/ellipsoid.h"
#include "bench/accuracy/accuracy.h"
#include "bench/accuracy/error_table.h"

namespace accuracy {

namespace {

const std::vector<std::string> HEIGHT_BANDS = {"-6350 to -6200 km", "-6200 to -6100 km", "-6100 to -6000 km",
                                               "-6000 to -1000 km", "-1000 to -11 km",   "-11 to 0 km",
                                               "0 to 1 km",         "1 to 10 km",        "10 to 100 km",
                                               "100 to 1000 km",    "1000 to 20,000 km"};
const std::vector<double> HEIGHT_BOUNDS = {-6350e3, -6200e3, -6100e3, -6000e3, -1000e3, -11e3,
                                           0.0,     1e3,     10e3,    100e3,   1000e3,  20000e3};
const std::vector<std::string> LATITUDE_BANDS = {"0 to 1 degrees",   "1 to 45 degrees",  "45 to 79 degrees",
                                                 "79 to 80 degrees", "80 to 81 degrees", "81 to 89 degrees",
                                                 "89 to 90 degrees"};
const std::vector<double> LATITUDE_BOUNDS = {0.0, 1.0, 45.0, 79.0, 80.0000000001, 81.0, 89.0, 90.0};
/// Heights a survey meets; the table by latitude leaves the inner earth out.
constexpr double LOWEST = -11e3;

geo_llh point_of(const ReferenceRow& row) {
    return {static_cast<double>(radians_of(row[0])), static_cast<double>(radians_of(row[1])),
            static_cast<double>(row[2])};
}

void forward(const std::vector<ReferenceRow>& rows) {
    ErrorTable table(HEIGHT_BANDS, HEIGHT_BOUNDS, {"position, m"});
    for (const ReferenceRow& row : rows) {
        const geo_llh llh = point_of(row);
        geo_vector xyz = {};
        if (_llh2xyz(&llh, &xyz) == 0) {
            table.add_refusal(llh.height);
        } else {
            table.add(llh.height, {std::hypot(xyz.x - row[3], xyz.y - row[4], xyz.z - row[5])});
        }
    }
    std::printf("### Geodetic to Cartesian, `_llh2xyz`\n");
    table.print("height");
}

void backward(const std::vector<ReferenceRow>& rows, double tolerance, const char* tolerance_text) {
    const std::vector<std::string> quantities = {"latitude, rad", "longitude, rad x cos latitude",
                                                 "horizontal, m", "height, m"};
    ErrorTable by_height(HEIGHT_BANDS, HEIGHT_BOUNDS, quantities);
    ErrorTable by_latitude(LATITUDE_BANDS, LATITUDE_BOUNDS, quantities);
    long double outermost_refused = 0.0L;
    for (const ReferenceRow& row : rows) {
        const geo_vector xyz = {static_cast<double>(row[3]), static_cast<double>(row[4]),
                                static_cast<double>(row[5])};
        const auto height = static_cast<double>(row[2]);
        const auto latitude = static_cast<double>(std::abs(row[0]));
        geo_llh llh = {};
        if (_xyz2llh(&xyz, &llh, tolerance) == 0) {
            by_height.add_refusal(height);
            outermost_refused = std::max(outermost_refused, std::hypot(row[3], row[4], row[5]));
            if (height >= LOWEST) {
                by_latitude.add_refusal(latitude);
            }
            continue;
        }
        double meridian = 0.0;
        double prime_vertical = 0.0;
        _wgs84curvature(llh.latitude, meridian, prime_vertical);
        const long double north = llh.latitude - radians_of(row[0]);
        // At a pole every longitude is the same place.
        const bool pole = latitude == 90.0;
        const long double east = pole ? 0.0L : angle_difference(llh.longitude, radians_of(row[1]));
        const long double from_axis = (prime_vertical + row[2]) * std::cos(radians_of(row[0]));
        const std::vector<long double> errors = {
            north, east, std::hypot(north * (meridian + row[2]), east * from_axis), llh.height - row[2]};
        by_height.add(height, errors);
        if (height >= LOWEST) {
            by_latitude.add(latitude, errors);
        }
    }
    std::printf("### Cartesian to geodetic, `_xyz2llh`, tolerance %s\n", tolerance_text);
    by_height.print("height");
    std::printf("The outermost point refused lies %.0Lf km from the centre.\n\n",
                outermost_refused / 1000.0L);
    std::printf("By latitude, heights from -11 km to 20,000 km:\n");
    by_latitude.print("latitude, either side");
}

}  // namespace

void measure_ellipsoid(const std::vector<ReferenceRow>& rows) {
    forward(rows);
    backward(rows, 5e-10, "5e-10");
    backward(rows, 5e-9, "5e-9");
    backward(rows, 0.0, "0");
}

}  // namespace accuracy
