/// @file
/// Sine, cosine, tangent and arctangents from + - * / alone: the same bits under any compiler, on any
/// processor and with any C library. The C library's own depend on whether the processor has fused
/// multiply-add.
///
/// Errors over all arguments, in units in the last place: sine and cosine at most 0.62, tangent 0.66,
/// arctangents 0.58. Signed zeros, infinities, NaN and subnormals as in C's Annex F; errno and exception
/// flags are unspecified. Rounding must be to nearest. All functions are thread-safe.
#ifndef BASALT_SRC_GEO_ELEMENTARY_ELEMENTARY_H
#define BASALT_SRC_GEO_ELEMENTARY_ELEMENTARY_H

namespace basalt::geo::elementary {

struct SineCosine {
    double sine, cosine;
};

/// Angles in radians, of any size: fast up to 102,943, some hundred nanoseconds beyond.
SineCosine sin_cos(double angle);
double sin(double angle);
double cos(double angle);
double tan(double angle);

/// Angle in [-pi/2, pi/2].
double atan(double slope);
/// Angle of the direction (x, y) from the x axis, in [-pi, pi].
double atan2(double y, double x);

// Two at a time, each with the bits of the single function, in little more time than one. Four are in four.h.

struct SineCosineTwo {
    SineCosine first, second;
};
struct AngleTwo {
    double first, second;
};

SineCosineTwo sin_cos_two(double first, double second);
AngleTwo atan2_two(double first_y, double first_x, double second_y, double second_x);

}  // namespace basalt::geo::elementary

#endif
