/// @file
/// Conversions on the WGS84 ellipsoid. Common rules (units, bad input, threads): basalt/geo.h.
///
/// Cartesian coordinates are earth-centred and earth-fixed: x towards latitude 0, longitude 0; y towards
/// longitude pi/2; z towards the north pole. Longitudes given may lie in any range.
#ifndef BASALT_GEO_ELLIPSOID_H
#define BASALT_GEO_ELLIPSOID_H

#include "basalt/export.h"
#include "basalt/geo/records.h"

/// @name Ellipsoid
/// @{

/// Geodetic point of a Cartesian one, by iteration on the latitude.
/// @param xyz Cartesian point, metres
/// @param[out] llh geodetic point: latitude in [-pi/2, pi/2], longitude in [-pi, pi], 0 on the
/// axis (pi or -pi, as y is signed, for an x of -0)
/// @param tolerance radians: the iteration ends when two passes agree within it. The library itself uses
/// 5e-10; 0 demands exact agreement; from 10 on, or NaN, the first estimate is kept (right at height 0; up to
/// 34 m off at 10 km).
/// @return 1; 0 with llh untouched at the earth's centre, for NaN coordinates (but 1 and NaN where the first
/// estimate is kept), and for a latitude that has not settled in ten passes: with 5e-10, at places within
/// 291 km of the centre
///
/// Accuracy: with 5e-10 and heights from -11 km to 20,000 km, 4e-12 radians (0.021 mm) and 0.011 mm in
/// height; about 1/150 of other tolerances. Coordinates beyond 1e154 m count as infinite, x and y below
/// 1e-162 m as 0.
///
/// Source: W. Heiskanen, H. Moritz, Physical Geodesy, 1967, section 5-3.
BASALT_API int _xyz2llh(const geo_vector* xyz, geo_llh* llh, double tolerance);

/// Cartesian point of a geodetic one.
/// @param llh geodetic point, radians and metres
/// @param[out] xyz Cartesian point, metres
/// @return 1; 0 with xyz untouched when latitude, longitude and height are all exactly 0: the point on the
/// equator at longitude 0 and height 0 is refused as a record never set
///
/// Bad input: NaN, or an infinite latitude or longitude, gives NaN in what depends on it, with 1.
///
/// Accuracy: 6 nm up to heights of 1000 km, 11 nm at 20,000 km.
///
/// Source: W. Heiskanen, H. Moritz, Physical Geodesy, 1967, eq. 5-3.
BASALT_API int _llh2xyz(const geo_llh* llh, geo_vector* xyz);

/// A point in the local frame of an origin: north and east in its tangent plane, elevation along the
/// ellipsoid's outward normal. All three are 0 at the origin. The elevation is not a height: it drops with
/// the earth's curvature, 0.08 m at 1 km.
/// @param origin Cartesian point, metres
/// @param point Cartesian point, metres
/// @param[out] out local point, metres
/// @return always 1; out is untouched when the origin cannot be converted, see _xyz2llh()
///
/// Bad input: a point that is not finite, or nearly overflows, may give NaN.
BASALT_API int _xyz2nez(const geo_vector* origin, const geo_vector* point, geo_nee* out);

/// Principal radii of curvature.
/// @param latitude radians
/// @param[out] meridianRadius radius along the meridian, metres
/// @param[out] primeVerticalRadius radius across it, metres
///
/// Source: W. Torge, Geodesy, 2001, section 4.1.
BASALT_API void _wgs84curvature(double latitude, double& meridianRadius, double& primeVerticalRadius);

/// Whether two geodetic points are less than 0.5 mm apart in space. Longitudes a turn apart are equal, as are
/// all longitudes at a pole; the all-zero point is the point on the equator.
/// @return 1 or 0
BASALT_API int llh_equal(const geo_llh& a, const geo_llh& b);

/// @}

#endif
