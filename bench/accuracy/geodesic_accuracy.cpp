#include <algorithm>
#include <cmath>
#include <cstdio>
#include <numbers>

#include "basalt/geo/ellipsoid.h"
#include "basalt/geo/geodesic.h"
#include "bench/accuracy/accuracy.h"
#include "bench/accuracy/error_table.h"

namespace accuracy {

namespace {

const std::vector<std::string> DISTANCE_BANDS = {
    "1 to 10 m",      "10 to 100 m",       "100 m to 1 km",       "1 to 10 km",         "10 to 100 km",
    "100 to 1000 km", "1000 to 10,000 km", "10,000 to 19,000 km", "19,000 to 20,004 km"};
const std::vector<double> DISTANCE_BOUNDS = {1.0, 10.0, 100.0, 1e3, 1e4, 1e5, 1e6, 1e7, 1.9e7, 2.0004e7};

constexpr long double SEMI_MAJOR = 6378137.0L;  // metres

/// A point whose foot and distance are known: from the middle of the line, a tenth of its length to the
/// right.
void crosstrack(const ReferenceRow& row, const geo_llh& start, const geo_llh& end, ErrorTable& table) {
    const auto length = static_cast<double>(row[3]);
    const double offset = length / 10.0;
    double azimuth = 0.0;
    geo_llh middle = {};
    geo_llh point = {};
    geo_vincenty_direct(start, static_cast<double>(radians_of(row[2])), length / 2.0, azimuth, middle);
    geo_vincenty_direct(middle, azimuth + std::numbers::pi / 2.0, offset, azimuth, point);
    table.add(length, {(geo_vincenty_crosstrack(start, end, point) + offset) / offset});
}

}  // namespace

void measure_geodesic(const std::vector<ReferenceRow>& rows) {
    ErrorTable direct(DISTANCE_BANDS, DISTANCE_BOUNDS,
                      {"end point, m", "end point, rad", "azimuth there, rad x cos latitude"});
    ErrorTable across({DISTANCE_BANDS.begin(), DISTANCE_BANDS.end() - 2},
                      {DISTANCE_BOUNDS.begin(), DISTANCE_BOUNDS.end() - 2}, {"distance, of its length"});
    ErrorTable sphere(DISTANCE_BANDS, DISTANCE_BOUNDS,
                      {"distance, of its length", "bearing, rad x cos latitude"});
    for (const ReferenceRow& row : rows) {
        const geo_llh start = {static_cast<double>(radians_of(row[0])),
                               static_cast<double>(radians_of(row[1])), 0.0};
        const auto distance = static_cast<double>(row[3]);
        double azimuth = 0.0;
        geo_llh end = {};
        geo_vincenty_direct(start, static_cast<double>(radians_of(row[2])), distance, azimuth, end);
        double meridian = 0.0;
        double prime_vertical = 0.0;
        _wgs84curvature(end.latitude, meridian, prime_vertical);
        const long double cosine = std::cos(radians_of(row[4]));
        const long double north = end.latitude - radians_of(row[4]);
        const long double east = angle_difference(end.longitude, radians_of(row[5])) * cosine;
        // Beside a pole the azimuth turns with the longitude, which the cosine makes up for.
        direct.add(distance, {std::hypot(north * meridian, east * prime_vertical), std::hypot(north, east),
                              angle_difference(azimuth, radians_of(row[6])) * cosine});

        const geo_llh there = {static_cast<double>(radians_of(row[4])),
                               static_cast<double>(radians_of(row[5])), 0.0};
        crosstrack(row, start, there, across);
        const long double shortest = row[8];
        sphere.add(static_cast<double>(shortest),
                   {(geo_vincenty_distance(start, there) - shortest) / shortest,
                    angle_difference(geo_vincenty_bearing(start, there), radians_of(row[7])) *
                        std::cos(radians_of(row[0]))});
    }
    std::printf("### Direct geodesic, `geo_vincenty_direct`\n");
    direct.print("distance");
    std::printf("### Distance and bearing on the sphere, `geo_vincenty_distance`, `geo_vincenty_bearing`\n");
    sphere.print("distance");
    std::printf(
        "### Cross-track distance, `geo_vincenty_crosstrack`, of a point a tenth of the line's length beside "
        "its middle\n");
    across.print("length of the line");
}

void measure_inverse(const std::vector<ReferenceRow>& rows) {
    std::vector<std::string> bands = DISTANCE_BANDS;
    std::vector<double> bounds = DISTANCE_BOUNDS;
    bands.insert(bands.begin(), "below 1 m");
    bounds.insert(bounds.begin(), 0.0);
    ErrorTable table(bands, bounds, {"distance, m", "azimuths, m aside"});
    for (const ReferenceRow& row : rows) {
        double angles[6];
        for (std::size_t i = 0; i < 6; ++i) {
            angles[i] = static_cast<double>(radians_of(row[i]));
        }
        const basalt::GeodesicInverse line =
            basalt::geodesic_inverse({angles[0], angles[1], 0.0}, {angles[2], angles[3], 0.0});
        // What an azimuth's error moves the other end, nearly. On the equator two lines may be as short.
        const long double lever =
            SEMI_MAJOR * std::sin(std::min(row[6] / SEMI_MAJOR, std::numbers::pi_v<long double>));
        const bool is_mirrored = row[0] == 0.0L && row[2] == 0.0L &&
                                 std::cos(line.azimuth_from) * std::cos(radians_of(row[4])) < 0.0L;
        const auto turned = [=](double azimuth) {
            return is_mirrored ? std::numbers::pi - azimuth : azimuth;
        };
        const long double from = std::abs(angle_difference(turned(line.azimuth_from), radians_of(row[4])));
        const long double to = std::abs(angle_difference(turned(line.azimuth_to), radians_of(row[5])));
        table.add(static_cast<double>(row[6]),
                  {line.distance - row[6], std::max(from, to) * std::abs(lever)});
    }
    std::printf("### Inverse geodesic, `geodesic_inverse`\n");
    table.print("distance");
}

}  // namespace accuracy
