/// @file
/// Arcs and transition spirals of horizontal alignments. Common rules (units, bad input,
/// threads): basalt/geo.h.
///
/// The spiral is a clothoid: its curvature grows with the length along it. Its constant K, square metres, is
/// the one for which the tangent has turned by l^2 / K at length l: 2 R L for a spiral of length L that ends
/// at radius R. A negative K bends the other way.
#ifndef BASALT_GEO_CURVES_H
#define BASALT_GEO_CURVES_H

#include "basalt/export.h"
#include "basalt/geo/records.h"

/// Length of a circular arc: angle times radius.
/// @param angle central angle, radians
/// @param radius metres
/// @return metres, with the sign of the product
///
/// Bad input: #GEO_NULL if either is.
BASALT_API double geo_arc_angle_to_length(double angle, double radius);

/// Central angle of a circular arc: length over radius.
/// @param length along the arc, metres
/// @param radius metres; #GEO_INFINITY, a straight, gives an angle next to 0
/// @return radians, with the sign of the quotient
///
/// Bad input: #GEO_NULL if either is, or if the radius is smaller than 0.5 mm.
BASALT_API double geo_arc_length_to_angle(double length, double radius);

/// Half the chord of an arc with a given sagitta: sqrt(2 r h - h^2).
/// @param radius r, metres
/// @param separation h, the sagitta: greatest distance between arc and chord, metres
/// @return metres. For h < r half the chord, which approaches r as h does; from h = r on the diameter 2 r.
/// The jump is part of the function: double the result for a chord only where h < r.
///
/// Bad input: #GEO_NULL if either is, or for a straight (radius #GEO_INFINITY); 2 r h - h^2 itself, negative
/// and no length, for a negative h.
BASALT_API double geo_arc_to_chord(double radius, double separation);

/// Angle the tangent of a spiral has turned by: length^2 / spiralConstant.
/// @param length along the spiral from its straight end, metres
/// @param spiralConstant K, square metres
/// @return radians; 0 for a negative length
///
/// Bad input: K = 0 gives infinity (NaN for length 0).
BASALT_API double geo_spiral_deflection(double length, double spiralConstant);

/// Local coordinates of a point on a spiral.
/// @param length along the spiral from its straight end, metres. A negative one mirrors both coordinates.
/// @param spiralConstant K, square metres
/// @param tolerance metres, above 0: each series ends with its first term below this
/// @param[out] x along the initial tangent, metres
/// @param[out] y offset from it to the side of the bend, metres
///
/// Bad input: both are #GEO_NULL when either series has not settled after nine further terms: tolerance 0 or
/// less, NaN, K = 0, a deflection too large (2.3 radians for 50 m at 1e-9 m).
///
/// Accuracy: below `tolerance` plus rounding up to a deflection of 3 radians, where the terms alternate and
/// shrink; at 1e-9 within 2e-11 m, at 1e-4 within 4e-6 m (lengths to 1 km).
///
/// Source: series of the Fresnel integrals, M. Abramowitz and I. Stegun, 1964, 7.3.11 and 7.3.13.
BASALT_API void geo_spiral_deltas(double length, double spiralConstant, double tolerance, double& x,
                                  double& y);

#endif
