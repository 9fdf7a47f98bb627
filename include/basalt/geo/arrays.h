/// @file
/// Conversions, geodesics, measures and observations of whole arrays, with the bits of the single calls.
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

/// As geo_vector_direction().
BASALT_API std::size_t bearings(const geo_vector* in, double* out, std::size_t count);

/// As geo_horz_dist().
BASALT_API std::size_t distances(const geo_nee* from, const geo_nee* to, double* out, std::size_t count);
/// As geo_vincenty_distance(), on a sphere.
BASALT_API std::size_t distances(const geo_llh* from, const geo_llh* to, double* out, std::size_t count);

/// As geo_point_on_line(), for the segments between `from` and `to`.
BASALT_API void on_segments(const geo_nee* from, const geo_nee* to, const geo_nee* points,
                            const double* tolerances, bool* out, std::size_t count);

/// As geo_grid_follow(): points reached on slopes given as angles. Refused are those whose north is NaN.
BASALT_API std::size_t follow(const geo_nee* starts, const double* bearings, const double* distances,
                              const double* slope_angles, geo_nee* out, std::size_t count);
/// As geo_grid_follow2(), on slopes given as ratios.
BASALT_API std::size_t follow_grade(const geo_nee* starts, const double* bearings, const double* distances,
                                    const double* grades, geo_nee* out, std::size_t count);
/// As geo_grid_follow3(), with changes of height in metres.
BASALT_API std::size_t follow_height_change(const geo_nee* starts, const double* bearings,
                                            const double* distances, const double* height_changes,
                                            geo_nee* out, std::size_t count);

/// As geo_reduce_obs(). Refused are also those with a field of #GEO_NULL, which become #GEO_NULL.
BASALT_API std::size_t reduce(const geo_hvd* observations, const geo_nee* stations,
                              const double* height_offsets, const double* scale_factors, geo_nee* out,
                              std::size_t count);

}  // namespace basalt

#endif
