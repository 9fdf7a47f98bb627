/// @file
/// The search behind geo_vincenty_crosstrack().
#ifndef BASALT_SRC_GEO_CROSS_TRACK_H
#define BASALT_SRC_GEO_CROSS_TRACK_H

#include "basalt/geo/records.h"

namespace basalt::geo {

/// Radius of the sphere distances are measured on, metres.
inline constexpr double SPHERE_RADIUS = 6371000.0;

/// geo_vincenty_crosstrack(), with the count of feet it tried.
double cross_track(const geo_llh& a, const geo_llh& b, const geo_llh& p, int& passes);

}  // namespace basalt::geo

#endif
