/// @file
/// Bearings of angles and directions, and arcs of a sphere.
#ifndef BASALT_SRC_GEO_DIRECTIONS_H
#define BASALT_SRC_GEO_DIRECTIONS_H

#include "src/geo/constants.h"
#include "src/geo/elementary/four.h"

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

/// Bearing of the direction (north, east), or of four.
template <typename Lane>
BASALT_INLINE Lane bearing_of(const Lane& north, const Lane& east) {
    const Lane angle = elementary::atan2(east, north);
    const Lane turned = angle < 0.0 ? angle + TWO_PI : angle;
    return turned == TWO_PI ? elementary::all_of<Lane>(0.0) : turned;
}

/// Bearing between points of the grid. + 0.0: a difference of -0 would reverse that of coincident points.
template <typename Lane>
BASALT_INLINE Lane grid_bearing(const Lane& north, const Lane& east) {
    return bearing_of<Lane>(north + 0.0, east + 0.0);
}

/// Bearing on a sphere from the sines and cosines of both latitudes and of the change of longitude.
template <typename Lane, typename SineCosine>
BASALT_INLINE Lane sphere_bearing(const SineCosine& from, const SineCosine& to, const SineCosine& change) {
    return bearing_of<Lane>(from.cosine * to.sine - from.sine * to.cosine * change.cosine,
                            change.sine * to.cosine);
}

/// Distance on a sphere from the sines of half the changes of latitude and longitude and the cosines of both
/// latitudes, metres.
template <typename Lane>
BASALT_INLINE Lane sphere_distance(const Lane& north, const Lane& east, const Lane& from_cosine,
                                   const Lane& to_cosine) {
    const Lane unclipped = north * north + from_cosine * to_cosine * (east * east);
    // At the antipode it may round above 1, and the other root would be NaN.
    const Lane h = unclipped > 1.0 ? elementary::all_of<Lane>(1.0) : unclipped;
    return 2.0 * elementary::atan2(elementary::root(h), elementary::root(1.0 - h)) * SPHERE_RADIUS;
}

}  // namespace basalt::geo

#endif
