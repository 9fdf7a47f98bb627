/// @file
/// Angle and unit conversions.
#ifndef BASALT_GEO_UNITS_H
#define BASALT_GEO_UNITS_H

#include "basalt/export.h"
#include "basalt/geo/records.h"

#endif
