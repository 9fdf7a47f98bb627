/// @file
/// Geodesics: direct problem, distance, bearing, cross-track distance.
#ifndef BASALT_GEO_GEODESIC_H
#define BASALT_GEO_GEODESIC_H

#include "basalt/export.h"
#include "basalt/geo/records.h"

#endif
