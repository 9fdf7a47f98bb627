/// @file
/// North, east and up at a place, as directions in earth-centred coordinates.
#ifndef BASALT_SRC_GEO_LOCAL_FRAME_H
#define BASALT_SRC_GEO_LOCAL_FRAME_H

#include "basalt/geo/records.h"

namespace basalt::geo {

struct LocalFrame {
    geo_vector north, east, up;

    /// From the sines and cosines of latitude and longitude.
    LocalFrame(double sin_lat, double cos_lat, double sin_lon, double cos_lon)
        : north{-sin_lat * cos_lon, -sin_lat * sin_lon, cos_lat},
          east{-sin_lon, cos_lon, 0.0},
          up{cos_lat * cos_lon, cos_lat * sin_lon, sin_lat} {}
};

}  // namespace basalt::geo

#endif
