/// @file
/// Observations, their reduction to grid points, and following a bearing.
#ifndef BASALT_GEO_OBSERVATIONS_H
#define BASALT_GEO_OBSERVATIONS_H

#include "basalt/export.h"
#include "basalt/geo/records.h"

#endif
