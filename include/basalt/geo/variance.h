/// @file
/// Propagation of the covariance of a Cartesian position. Common rules (units, bad
/// input, threads): basalt/geo.h.
///
/// A symmetric covariance travels as six numbers: the variances of components 0, 1, 2, then the covariances
/// of 0 and 1, 0 and 2, 1 and 2. Input and output may be the same six.
#ifndef BASALT_GEO_VARIANCE_H
#define BASALT_GEO_VARIANCE_H

#include "basalt/export.h"
#include "basalt/geo/records.h"

/// Covariance of latitude, longitude and height from that of x, y, z, to first order: J Q J^T.
/// @param position Cartesian point, metres
/// @param covariance six numbers over x, y, z; square metres
/// @param[out] out six numbers over latitude, longitude, height: rad^2, rad^2, m^2, rad^2, rad m, rad m
/// @return always 1. Six #GEO_NULL for a position that cannot be converted: near the earth's centre, NaN, see
/// _xyz2llh().
///
/// Accuracy: 3e-10 of the standard deviations, down to a kilometre from the earth's axis; 2e-8 at some
/// metres from it. At a pole the longitude, and so its terms, is undefined.
///
/// Source: J. Leick, GPS Satellite Surveying, 1995, section 5.3.
BASALT_API int Varxyz2varllh(const geo_vector* position, const double* covariance, double* out);

/// Covariance of north, east and up at a position from that of x, y, z: R Q R^T.
/// @param position Cartesian point, metres
/// @param covariance six numbers over x, y, z; square metres
/// @param[out] out six numbers over north, east, up; square metres
/// @return always 1. Six #GEO_NULL for a position that cannot be converted, see _xyz2llh().
///
/// Accuracy: 3e-10 of the standard deviations.
BASALT_API int Varxyz2varneu(const geo_vector* position, const double* covariance, double* out);

#endif
