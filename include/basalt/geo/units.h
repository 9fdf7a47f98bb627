/// @file
/// Angle and unit conversions. Common rules (units, bad input, threads): basalt/geo.h.
///
/// Feet are US survey feet of 1200/3937 m, twelve inches each.
#ifndef BASALT_GEO_UNITS_H
#define BASALT_GEO_UNITS_H

#include <cstdint>

#include "basalt/export.h"
#include "basalt/geo/records.h"

/// Radians of an angle in degrees.
BASALT_API double _degtorad(double degrees);

/// Degrees, minutes and seconds of an angle.
/// @param radians the angle
/// @param[out] degrees whole degrees, with the sign of the angle; the sign is lost when they are 0
/// @param[out] minutes 0 to 59
/// @param[out] seconds from -5e-6 to below 60 - 5e-6: an angle within 5e-6 seconds below a whole minute
/// counts as that minute, so that 12.5 degrees are 12, 30, 0 and not 12, 29, 60
///
/// Bad input: beyond 2147483647 degrees, degrees and minutes are clamped to that number and the seconds hold
/// the rest. NaN gives 0, 0, NaN.
BASALT_API void _radtodms(double radians, int* degrees, int* minutes, double* seconds);

/// Radians of degrees, minutes and seconds.
/// @param degrees whole degrees; their sign is that of the angle
/// @param minutes added to the absolute value of the angle: any number, any sign
/// @param seconds likewise
/// @param[out] radians the angle
BASALT_API void _dmstorad(int degrees, int minutes, double seconds, double* radians);

/// Feet, inches and a vulgar fraction of an inch of a length.
/// @param metres the length
/// @param fractionDenominator the fraction is rounded to the nearest one over this; 0: no fraction
/// @param[out] positive whether the length is 0 or more; the other results are those of its absolute value
/// @param[out] feet whole feet
/// @param[out] inches inches within the foot, 0 to below 12, with their decimals: print only their whole part
/// beside the fraction. A fraction that rounds up to a whole inch does not carry into them.
/// @param[out] numerator numerator of the fraction, halved with the denominator while both are even
/// @param[out] denominator denominator of the fraction; 0 when the numerator is 0
///
/// Bad input: feet are clamped to 2147483647; NaN and infinities give no fraction, NaN inches, and feet of 0
/// and 2147483647. A negative denominator gives a meaningless fraction.
BASALT_API void _mtoftin(double metres, int fractionDenominator, bool* positive, int* feet, double* inches,
                         int* numerator, int* denominator);

/// Metres of feet, inches and a vulgar fraction of an inch.
/// @param feet whole feet; their sign is that of the length, so a length below a foot cannot be negative
/// @param inches added to the absolute value of the length: any number, any sign
/// @param numerator numerator of a fraction of an inch
/// @param denominator its denominator; 0: no fraction
/// @param[out] metres the length
BASALT_API void _ftintom(int feet, double inches, int numerator, int denominator, double* metres);

/// Bearing in [0, 2 pi) of any angle, by adding or subtracting 2 pi.
/// @param angle radians
/// @return the bearing; a negative angle so small that adding 2 pi rounds to 2 pi gives 0
///
/// Bad input: #GEO_NULL, infinities and NaN are returned unchanged.
///
/// Accuracy: each step of 2 pi rounds, up to 2e-6 in total at a million radians; larger angles are reduced by
/// fmod first. Within 100 radians the result is that of geo_normalised_bearing().
BASALT_API double _normalisedbearing(double angle);

/// Factorial of n in double precision: exact up to 22, infinite from 171 on.
BASALT_API double factorial(std::uint32_t n);

#endif
