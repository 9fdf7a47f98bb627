/// @file
/// Constants of the conversions and of Vincenty's series. Results depend on them to the bit: used as these
/// literals, never computed.
#ifndef BASALT_SRC_GEO_ELLIPSOID_CONSTANTS_H
#define BASALT_SRC_GEO_ELLIPSOID_CONSTANTS_H

namespace basalt::geo {

inline constexpr double SEMI_MAJOR_AXIS = 6378137.0;
inline constexpr double ECCENTRICITY2 = 0.00669437999014;
/// 1 - e^2, named for its use: the two differ in the last digits, and results depend on both.
inline constexpr double FIRST_ESTIMATE_FACTOR = 0.99330562000986;
inline constexpr double Z_FACTOR = 0.9933056200098587;
/// Latitude above which the height is taken along the axis; 80 degrees in radians.
inline constexpr double POLAR_LATITUDE = 1.3962634015954636;
inline constexpr int MOST_PASSES = 10;

/// 1 - e^2, and a e^2 in metres: of the passes without angles in _xyz2llh().
inline constexpr double FLAT = 1.0 - ECCENTRICITY2;
inline constexpr double AXIS_PULL = SEMI_MAJOR_AXIS * ECCENTRICITY2;

/// Of the geodesics.
inline constexpr double FLATTENING = 0.0033528106647474805;
inline constexpr double ONE_LESS_FLATTENING = 0.9966471893352525;
inline constexpr double SEMI_MINOR_AXIS = 6356752.3142;
/// a^2 - b^2 and b^2, square metres.
inline constexpr double AXES_DIFFERENCE2 = 272331606681.9453;
inline constexpr double SEMI_MINOR_AXIS2 = 40408299984087.055;
inline constexpr double FLATTENING_16TH = 0.00020955066654671753;
/// The arc has settled when it changes by no more, radians.
inline constexpr double SETTLED_ARC = 1e-12;
inline constexpr int MOST_ARC_PASSES = 100;

}  // namespace basalt::geo

#endif
