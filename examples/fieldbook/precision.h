// Precision of points, from the precision of angles and distances.
#ifndef FIELDBOOK_PRECISION_H
#define FIELDBOOK_PRECISION_H

#include <basalt/geo.h>

#include <cstddef>

#include "traverse.h"

/// Symmetric covariance in the frame of the grid, square metres.
struct Covariance {
    double nn, ee, uu, ne, nu, eu;
};

/// @name Covariances of points
/// By the first-order law of propagation from the first station on, for an instrument of 3", 2 mm and 2 ppm.
/// Angles, zenith angles and distances are independent; control points count as exact. The closing condition
/// is not used: these are the uncertainties before the adjustment.
/// @{
/// Of a station that is no control point.
Covariance station_covariance(const Traverse& traverse, std::size_t setup);
/// Of a point observed from a station.
Covariance target_covariance(const Traverse& traverse, std::size_t setup, const geo_hvd& observation,
                             const geo_nee& point);
/// @}

#endif
