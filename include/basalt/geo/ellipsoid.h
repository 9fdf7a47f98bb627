/// @file
/// Conversions on the WGS84 ellipsoid.
#ifndef BASALT_GEO_ELLIPSOID_H
#define BASALT_GEO_ELLIPSOID_H

#include "basalt/export.h"
#include "basalt/geo/records.h"

#endif
