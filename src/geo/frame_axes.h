/// @file
/// North, east and up at a place, as directions in earth-centred coordinates.
#ifndef BASALT_SRC_GEO_FRAME_AXES_H
#define BASALT_SRC_GEO_FRAME_AXES_H

#include <optional>

#include "basalt/geo/records.h"

namespace basalt::geo {

/// Tolerance of an origin's conversion by _xyz2llh(), radians.
inline constexpr double LOCAL_FRAME_TOLERANCE = 5e-10;

struct FrameAxes {
    geo_vector north, east, up;

    /// From the sines and cosines of latitude and longitude.
    FrameAxes(double sin_lat, double cos_lat, double sin_lon, double cos_lon)
        : north{-sin_lat * cos_lon, -sin_lat * sin_lon, cos_lat},
          east{-sin_lon, cos_lon, 0.0},
          up{cos_lat * cos_lon, cos_lat * sin_lon, sin_lat} {}
};

/// Component of a vector along an axis, by the sum in the order x, y, z from 0.
inline double along(const geo_vector& axis, const geo_vector& d) {
    return 0.0 + axis.x * d.x + axis.y * d.y + axis.z * d.z;
}

/// Axes at a Cartesian point; nothing when it cannot be converted.
std::optional<FrameAxes> axes_at(const geo_vector& xyz);

}  // namespace basalt::geo

#endif
