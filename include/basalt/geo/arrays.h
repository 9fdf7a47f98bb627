/// @file
/// Conversions, geodesics, bearings and distances of whole arrays, with the bits of the single calls.
///
/// Buffers hold `count` records. An output may be the input's own buffer where the types agree, but must not
/// overlap it otherwise. Each call returns how many were refused: records left untouched where the single
/// call returns 0, and elsewhere results that are NaN.
///
/// Threads: thread-safe. None throws or allocates.
#ifndef BASALT_GEO_ARRAYS_H
#define BASALT_GEO_ARRAYS_H

#include <cstddef>

#include "basalt/export.h"
#include "basalt/geo/geodesic.h"
#include "basalt/geo/records.h"

namespace basalt {

/// As _llh2xyz().
BASALT_API std::size_t to_cartesian(const geo_llh* in, geo_vector* out, std::size_t count);

/// As _xyz2llh() with a tolerance in radians; the library itself uses 5e-10.
BASALT_API std::size_t to_geodetic(const geo_vector* in, geo_llh* out, std::size_t count, double tolerance);

/// As geo_vincenty_direct(): ends and azimuths there.
BASALT_API std::size_t direct(const geo_llh* starts, const double* azimuths, const double* distances,
                              geo_llh* ends, double* final_azimuths, std::size_t count);

/// As geodesic_inverse().
BASALT_API std::size_t inverse(const geo_llh* from, const geo_llh* to, GeodesicInverse* out,
                               std::size_t count);

/// As geo_grid_bearing().
BASALT_API std::size_t bearings(const geo_nee* from, const geo_nee* to, double* out, std::size_t count);
/// As geo_vincenty_bearing(), on a sphere.
BASALT_API std::size_t bearings(const geo_llh* from, const geo_llh* to, double* out, std::size_t count);

/// As geo_horz_dist().
BASALT_API std::size_t distances(const geo_nee* from, const geo_nee* to, double* out, std::size_t count);
/// As geo_vincenty_distance(), on a sphere.
BASALT_API std::size_t distances(const geo_llh* from, const geo_llh* to, double* out, std::size_t count);

}  // namespace basalt

#endif
