/// @file
/// Arcs and transition spirals of horizontal alignments.
#ifndef BASALT_GEO_CURVES_H
#define BASALT_GEO_CURVES_H

#include "basalt/export.h"
#include "basalt/geo/records.h"

#endif
