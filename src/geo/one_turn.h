/// @file
/// Reduction of a bearing by steps, shared by geo_normalised_bearing() and _normalisedbearing().
#ifndef BASALT_SRC_GEO_ONE_TURN_H
#define BASALT_SRC_GEO_ONE_TURN_H

#include "src/geo/constants.h"

namespace basalt::geo {

/// Bearing in [0, 2 pi) of an angle by steps of 2 pi; the rounding of each step is part of the result.
/// @param angle radians, within +-1e6: 160,000 steps; NaN is returned unchanged
inline double to_one_turn(double angle) {
    while (angle >= TWO_PI) {
        angle -= TWO_PI;
    }
    while (angle < 0.0) {
        angle += TWO_PI;
    }
    // A tiny negative angle rounds up to 2 pi.
    return angle == TWO_PI ? 0.0 : angle;
}

}  // namespace basalt::geo

#endif
