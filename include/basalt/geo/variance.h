/// @file
/// Propagation of position variances from Cartesian to geodetic coordinates.
#ifndef BASALT_GEO_VARIANCE_H
#define BASALT_GEO_VARIANCE_H

#include "basalt/export.h"
#include "basalt/geo/records.h"

#endif
