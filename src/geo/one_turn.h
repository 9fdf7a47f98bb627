/// @file
/// What the two reductions of a bearing share.
#ifndef BASALT_SRC_GEO_ONE_TURN_H
#define BASALT_SRC_GEO_ONE_TURN_H

#include "src/geo/constants.h"

namespace basalt::geo {

/// Bearing in [0, 2 pi) of an angle, by steps of 2 pi: the rounding of each step is part of the result. Ends
/// for angles up to a million radians in 160,000 steps; NaN comes back.
inline double to_one_turn(double angle) {
    while (angle >= TWO_PI) {
        angle -= TWO_PI;
    }
    while (angle < 0.0) {
        angle += TWO_PI;
    }
    // A tiny negative angle has just been rounded up to 2 pi.
    return angle == TWO_PI ? 0.0 : angle;
}

}  // namespace basalt::geo

#endif
