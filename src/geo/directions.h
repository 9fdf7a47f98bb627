/// @file
/// Bearings of angles and directions, points along them, and arcs of a sphere.
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

/// to_one_turn() of an angle in (-2 pi, 2 pi), or of four.
template <typename Lane>
BASALT_INLINE Lane not_negative(const Lane& angle) {
    const Lane turned = angle < 0.0 ? angle + TWO_PI : angle;
    return turned == TWO_PI ? elementary::all_of<Lane>(0.0) : turned;
}

/// The turn either way, of one in [0, 2 pi).
template <typename Lane>
BASALT_INLINE Lane shorter_turn(const Lane& turn) {
    return turn > PI ? TWO_PI - turn : turn;
}

/// Bearing of the direction (north, east), or of four.
template <typename Lane>
BASALT_INLINE Lane bearing_of(const Lane& north, const Lane& east) {
    return not_negative<Lane>(elementary::atan2(east, north));
}

/// Bearing between points of the grid. + 0.0: a difference of -0 would reverse that of coincident points.
template <typename Lane>
BASALT_INLINE Lane grid_bearing(const Lane& north, const Lane& east) {
    return bearing_of<Lane>(north + 0.0, east + 0.0);
}

/// Differences in the grid, or four of each.
template <typename Lane>
struct Offset {
    Lane north, east;

    BASALT_INLINE Lane bearing() const { return grid_bearing<Lane>(north, east); }
    BASALT_INLINE Lane length() const { return elementary::root(east * east + north * north); }
};

/// Whether a point lies within a tolerance of a segment; both are given from the segment's start.
template <typename Lane>
BASALT_INLINE elementary::Mask<Lane> is_on_segment(const Offset<Lane>& end, const Offset<Lane>& point,
                                                   const Lane& tolerance) {
    const auto [sine, cosine] =
        elementary::sin_cos(shorter_turn<Lane>(not_negative<Lane>(end.bearing() - point.bearing())));
    const Lane distance = point.length();
    const Lane along = cosine * distance;
    const Lane off = elementary::size_of<Lane>(sine * distance);
    const Lane reach = end.length() + tolerance;
    return elementary::negated((along < -tolerance) | (along > reach)) & (off <= tolerance);
}

/// A point of the grid, or four.
template <typename Lane>
struct Point {
    Lane north, east, elevation;
};

/// How a change of height is given: by the angle of a slope, its ratio, or in metres.
enum class Rise { ANGLE, GRADE, METRES };

/// Point reached along a bearing. Slopes exactly vertical or level leave the elevation as it is.
template <Rise GIVEN, typename Lane>
BASALT_INLINE Point<Lane> followed(const Point<Lane>& start, const Lane& bearing, const Lane& distance,
                                   const Lane& rise) {
    const auto [sine, cosine] = elementary::sin_cos(bearing);
    Lane elevation = start.elevation;
    if constexpr (GIVEN == Rise::ANGLE) {
        elevation =
            elementary::size_of(rise) == HALF_PI ? elevation : elevation + elementary::tan(rise) * distance;
    } else if constexpr (GIVEN == Rise::GRADE) {
        elevation = rise == 0.0 ? elevation : elevation + distance * rise;
    } else {
        elevation = elevation + rise;
    }
    return {start.north + cosine * distance, start.east + sine * distance, elevation};
}

/// Point that an observation measures.
template <typename Lane>
BASALT_INLINE Point<Lane> reduced(const Lane& horizontal, const Lane& vertical, const Lane& distance,
                                  const Point<Lane>& station, const Lane& height_offset, const Lane& scale) {
    const auto [v, h] = elementary::sin_cos_two(vertical, horizontal);
    const Lane run = v.sine * distance * scale;
    const Lane rise = v.cosine * distance;
    return {h.cosine * run + station.north, h.sine * run + station.east,
            height_offset + station.elevation + rise};
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
