/// @file
/// Constants of the survey geometry. Results depend on them to the bit: used as these literals, never
/// computed.
#ifndef BASALT_SRC_GEO_CONSTANTS_H
#define BASALT_SRC_GEO_CONSTANTS_H

namespace basalt::geo {

inline constexpr double PI = 3.141592653589793;
inline constexpr double TWO_PI = 6.283185307179586;
inline constexpr double HALF_PI = 1.5707963267948966;
inline constexpr double RADIANS_PER_DEGREE = 0.017453292519943295;

/// Angles beyond +- this are not reduced to a bearing; radians.
inline constexpr double REDUCTION_LIMIT = 100.0;
/// Coordinates and distances closer than this are equal; metres.
inline constexpr double EQUALITY_TOLERANCE = 0.0005;
/// A horizontal run shorter than this is vertical; metres.
inline constexpr double VERTICAL_RUN = 0.0001;
/// 0.1 arc-second in radians. The intersection of rays uses it as a distance in metres too.
inline constexpr double RAY_TOLERANCE = 4.848136811095359e-07;
/// Radius of the sphere of geo_vincenty_distance(), metres.
inline constexpr double SPHERE_RADIUS = 6371000.0;

}  // namespace basalt::geo

#endif
