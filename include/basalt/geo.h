/// @file
/// Survey geometry and geodesy.
///
/// Units: metres and radians. Bearings run clockwise from grid north towards east; a normalised one lies in
/// [0, 2 pi). Arguments may alias: a record written may be one of those read.
///
/// Bad input: unless a function says otherwise, NaN gives NaN (a measure) or 0 (a predicate), infinities and
/// overflow follow IEEE arithmetic, and a field equal to #GEO_NULL counts as the number it is. Every call
/// ends after a bounded number of steps. None throws or allocates but the constructor of
/// basalt::PreparedPolygon and basalt::format_angle().
///
/// Accuracy: results follow the stated formulas in double precision, operation by operation. On the ellipsoid
/// (conversions, frames, geodesics, variances) shorter formulas may differ in the last digits. All results
/// are the same bit for bit under every compiler, on every processor and with any C library.
///
/// Threads: every function is reentrant.
#ifndef BASALT_GEO_H
#define BASALT_GEO_H

#include "basalt/geo/angle_text.h"
#include "basalt/geo/arrays.h"
#include "basalt/geo/curves.h"
#include "basalt/geo/ellipsoid.h"
#include "basalt/geo/geodesic.h"
#include "basalt/geo/local_frame.h"
#include "basalt/geo/observations.h"
#include "basalt/geo/plane.h"
#include "basalt/geo/polygon_measures.h"
#include "basalt/geo/prepared_polygon.h"
#include "basalt/geo/records.h"
#include "basalt/geo/time_scales.h"
#include "basalt/geo/units.h"
#include "basalt/geo/variance.h"

#endif
