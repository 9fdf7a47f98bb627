/// @file
/// Survey geometry and geodesy.
///
/// Units: metres and radians. A bearing is counted clockwise from grid north towards east; a normalised one
/// lies in [0, 2 pi). Points may be passed twice, and a record written may be one of those read.
///
/// Bad input: unless a function says otherwise, NaN in a value it reads gives NaN (a measure) or 0 (a
/// predicate), infinities and overflow follow IEEE arithmetic, and a field equal to #GEO_NULL takes part as
/// the number it is. Every call ends after a bounded number of steps, none throws or allocates.
///
/// Accuracy: results follow the stated formulas in double precision, operation by operation except on the
/// ellipsoid (conversions, frames, geodesics, variances), where shorter ways to the same values may end in
/// the last places otherwise; those without trigonometry are the same bit for bit on every compiler and
/// processor.
///
/// Threads: every function is reentrant.
#ifndef BASALT_GEO_H
#define BASALT_GEO_H

#include "basalt/geo/curves.h"
#include "basalt/geo/ellipsoid.h"
#include "basalt/geo/geodesic.h"
#include "basalt/geo/observations.h"
#include "basalt/geo/plane.h"
#include "basalt/geo/records.h"
#include "basalt/geo/time_scales.h"
#include "basalt/geo/units.h"
#include "basalt/geo/variance.h"

#endif
