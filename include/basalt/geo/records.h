/// @file
/// Coordinate records and the markers their fields may hold.
#ifndef BASALT_GEO_RECORDS_H
#define BASALT_GEO_RECORDS_H

#include <cstdint>
#include <cstring>

/// Grid point.
struct geo_nee {
    double north;      ///< grid northing, metres
    double east;       ///< grid easting, metres
    double elevation;  ///< height, metres
};

/// Geodetic point.
struct geo_llh {
    double latitude;   ///< radians, north positive
    double longitude;  ///< radians, east positive
    double height;     ///< ellipsoidal height, metres
};

/// Vector: earth-centred, earth-fixed Cartesian coordinates, or a local vector as each member says.
struct geo_vector {
    double x;  ///< metres; locally, towards east
    double y;  ///< metres; locally, towards north
    double z;  ///< metres; locally, upwards
};

/// Observation.
struct geo_hvd {
    double horizontal;  ///< bearing, radians
    double vertical;    ///< zenith angle, radians: 0 overhead, pi/2 level, pi straight down
    double distance;    ///< slope distance, metres
};

/// No value: a field never set, or a result that cannot be formed. It is a subnormal number: test for it by
/// basalt::is_null(), since == takes zeros for it on a thread that treats subnormals as zero.
inline constexpr double GEO_NULL = 2e-308;
/// Infinite: the gradient ratio of a vertical line, the radius of a straight. Compared by exact equality.
inline constexpr double GEO_INFINITY = 2e100;

namespace basalt {

/// Whether a value is #GEO_NULL, by its bits: right on every thread, whatever it does with subnormals.
/// Threads: thread-safe.
inline bool is_null(double value) noexcept {
    std::uint64_t bits = 0;
    std::memcpy(&bits, &value, sizeof bits);
    return bits == 0x000E61ACF033D1A4U;
}

}  // namespace basalt

#endif
