#include "local_plane.h"

#include <cmath>

namespace {

constexpr double SEMI_MAJOR_AXIS = 6378137.0;           // WGS84, metres
constexpr double FLATTENING = 1.0 / 298.257223563;      // WGS84
constexpr double E2 = FLATTENING * (2.0 - FLATTENING);  // first eccentricity squared
constexpr double RADIANS_PER_DEGREE = 3.141592653589793 / 180.0;

double metres_east_per_degree(double latitude) {
    const double sine = std::sin(latitude * RADIANS_PER_DEGREE);
    const double normal_radius = SEMI_MAJOR_AXIS / std::sqrt(1.0 - E2 * sine * sine);
    return normal_radius * std::cos(latitude * RADIANS_PER_DEGREE) * RADIANS_PER_DEGREE;
}

double metres_north_per_degree(double latitude) {
    const double sine = std::sin(latitude * RADIANS_PER_DEGREE);
    const double w2 = 1.0 - E2 * sine * sine;
    const double meridian_radius = SEMI_MAJOR_AXIS * (1.0 - E2) / (w2 * std::sqrt(w2));
    return meridian_radius * RADIANS_PER_DEGREE;
}

}  // namespace

LocalPlane::LocalPlane(double longitude, double latitude)
    : m_longitude(longitude),
      m_latitude(latitude),
      m_metres_north(metres_north_per_degree(latitude)),
      m_metres_east(metres_east_per_degree(latitude)) {}

geo_nee LocalPlane::to_grid(double longitude, double latitude, double elevation) const {
    return {(latitude - m_latitude) * m_metres_north, (longitude - m_longitude) * m_metres_east, elevation};
}

double LocalPlane::east_scale_error(double latitude) const {
    return m_metres_east / metres_east_per_degree(latitude) - 1.0;
}
