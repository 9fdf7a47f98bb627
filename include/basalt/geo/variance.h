/// @file
/// Propagation of position variances from Cartesian to geodetic coordinates. What holds for all of survey
/// geometry is said in basalt/geo.h.
///
/// A symmetric 3 x 3 covariance of components a, b, c travels as six numbers: aa, bb, cc, ab, ac, bc.
#ifndef BASALT_GEO_VARIANCE_H
#define BASALT_GEO_VARIANCE_H

#include "basalt/export.h"
#include "basalt/geo/records.h"

/// @name Variance propagation
/// @{

/// Covariance of latitude, longitude and height from that of the Cartesian coordinates, to first order.
/// @param position earth-centred Cartesian point, metres
/// @param covariance six values over x, y, z; square metres
/// @param[out] out six values over latitude, longitude, height: radians squared, square metres for the
/// height's variance, radian metres for the height's covariances; may be `covariance` itself
/// @return always 1
///
/// Bad input: six #GEO_NULL at a position _xyz2llh() refuses at 5e-9. Towards a pole the longitude's values
/// grow without bound.
///
/// Source: E. Mikhail, Observations and Least Squares, 1976, section 4.3.
BASALT_API int Varxyz2varllh(const geo_vector* position, const double* covariance, double* out);

/// Covariance in the local north, east, up frame from that of the Cartesian coordinates.
/// @param position earth-centred Cartesian point, metres
/// @param covariance six values over x, y, z; square metres
/// @param[out] out six values over north, east, up; square metres; may be `covariance` itself
/// @return always 1
///
/// Bad input: six #GEO_NULL at a position _xyz2llh() refuses at 5e-9.
///
/// Source: as for Varxyz2varllh().
BASALT_API int Varxyz2varneu(const geo_vector* position, const double* covariance, double* out);

/// @}

#endif
