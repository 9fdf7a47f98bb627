/// @file
/// Four records at a time with AVX2, with the bits of the single calls. Each function returns a bit for each
/// record that is left to the single call: special numbers, and decisions within rounding.
#ifndef BASALT_SRC_GEO_FOUR_PLACES_H
#define BASALT_SRC_GEO_FOUR_PLACES_H

#include "basalt/geo/geodesic.h"
#include "basalt/geo/records.h"

namespace basalt::geo {

inline constexpr unsigned ALL_FOUR = 15;

unsigned to_cartesian_four(const geo_llh* in, geo_vector* out);
unsigned to_geodetic_four(const geo_vector* in, geo_llh* out, double tolerance);
unsigned direct_four(const geo_llh* starts, const double* azimuths, const double* distances, geo_llh* ends,
                     double* final_azimuths);
unsigned inverse_four(const geo_llh* from, const geo_llh* to, GeodesicInverse* out);
unsigned bearings_four(const geo_nee* from, const geo_nee* to, double* out);
unsigned bearings_four(const geo_llh* from, const geo_llh* to, double* out);
unsigned distances_four(const geo_llh* from, const geo_llh* to, double* out);

/// Whether this processor runs them; they must not be called elsewhere.
inline bool has_four_places() {
#if defined(__x86_64__)
    return __builtin_cpu_supports("avx2") != 0;
#else
    return false;
#endif
}

}  // namespace basalt::geo

#endif
