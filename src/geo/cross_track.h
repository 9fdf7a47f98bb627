/// @file
/// The search behind geo_vincenty_crosstrack(), with its number of passes.
#ifndef BASALT_SRC_GEO_CROSS_TRACK_H
#define BASALT_SRC_GEO_CROSS_TRACK_H

#include "basalt/geo/records.h"

namespace basalt::geo {

/// As geo_vincenty_crosstrack().
/// @param[out] passes feet tried, at most 100
double cross_track(const geo_llh& a, const geo_llh& b, const geo_llh& p, int& passes);

}  // namespace basalt::geo

#endif
