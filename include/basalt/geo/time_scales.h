/// @file
/// Calendar dates, Modified Julian Date, GPS time, milliseconds since 1970.
#ifndef BASALT_GEO_TIME_SCALES_H
#define BASALT_GEO_TIME_SCALES_H

#include "basalt/export.h"
#include "basalt/geo/records.h"

#endif
