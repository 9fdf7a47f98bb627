/// @file
/// Four records at a time, with the bits of the single calls; only where a processor has AVX2. Each function
/// returns a bit for each record that is left to the single call: special numbers, and decisions within
/// rounding.
#ifndef BASALT_SRC_GEO_FOUR_PLACES_H
#define BASALT_SRC_GEO_FOUR_PLACES_H

#include "basalt/geo/geodesic.h"
#include "basalt/geo/records.h"
#include "src/geo/directions.h"

namespace basalt::geo {

inline constexpr unsigned ALL_FOUR = 15;

unsigned to_cartesian_four(const geo_llh* in, geo_vector* out);
unsigned to_geodetic_four(const geo_vector* in, geo_llh* out, double tolerance);
unsigned direct_four(const geo_llh* starts, const double* azimuths, const double* distances, geo_llh* ends,
                     double* final_azimuths);
unsigned inverse_four(const geo_llh* from, const geo_llh* to, GeodesicInverse* out);
unsigned bearings_four(const geo_nee* from, const geo_nee* to, double* out);
unsigned bearings_four(const geo_llh* from, const geo_llh* to, double* out);
unsigned bearings_four(const geo_vector* in, double* out);
unsigned distances_four(const geo_llh* from, const geo_llh* to, double* out);
unsigned on_segments_four(const geo_nee* from, const geo_nee* to, const geo_nee* points,
                          const double* tolerances, bool* out);
unsigned follow_four(Rise given, const geo_nee* starts, const double* bearings, const double* distances,
                     const double* rises, geo_nee* out);
unsigned reduce_four(const geo_hvd* observations, const geo_nee* stations, const double* height_offsets,
                     const double* scale_factors, geo_nee* out);

}  // namespace basalt::geo

#endif
