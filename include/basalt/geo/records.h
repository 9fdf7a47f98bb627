/// @file
/// Coordinate records and the markers their fields may hold.
#ifndef BASALT_GEO_RECORDS_H
#define BASALT_GEO_RECORDS_H

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

/// No value: a field never set, or a result that cannot be formed. Compared by exact equality. It is a
/// subnormal number, so it is lost on a thread that flushes subnormals to zero.
inline constexpr double GEO_NULL = 2e-308;
/// Infinite: the gradient ratio of a vertical line, the radius of a straight. Compared by exact equality.
inline constexpr double GEO_INFINITY = 2e100;

#endif
