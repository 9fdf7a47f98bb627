/// @file
/// Reduction of angles beyond 100,000 radians.
#ifndef BASALT_SRC_GEO_ELEMENTARY_HUGE_ANGLE_H
#define BASALT_SRC_GEO_ELEMENTARY_HUGE_ANGLE_H

#include "src/geo/elementary/kernels.h"

namespace basalt::geo::elementary {

/// Payne and Hanek's reduction of a finite angle of at least 2^16 in size; relative error 2^-70.
Reduced<double> reduce_huge(double angle);

}  // namespace basalt::geo::elementary

#endif
