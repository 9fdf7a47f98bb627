/// The measurements behind docs/accuracy.md. Each prints its tables.
#ifndef BASALT_BENCH_ACCURACY_ACCURACY_H
#define BASALT_BENCH_ACCURACY_ACCURACY_H

#include <vector>

#include "tests/support/reference_rows.h"

namespace accuracy {

/// Latitude, longitude (degrees), height; over the whole globe, from a fixed seed.
void print_points(int count);
/// Latitude, longitude, azimuth (degrees), distance.
void print_lines(int count);
/// Latitudes and longitudes (degrees) of pairs; of every eight: anywhere, near, nearly opposite, along a
/// meridian, along the equator, from a pole, up to 1400 km, nearly opposite beside the equator.
void print_pairs(int count);

/// Rows: latitude, longitude (degrees), height, x, y, z (metres).
void measure_ellipsoid(const std::vector<ReferenceRow>& rows);
void measure_variance(const std::vector<ReferenceRow>& rows);
/// Rows: start latitude, longitude, azimuth (degrees), distance (metres), end latitude, longitude, azimuth;
/// then azimuth at the start and distance of the shortest line to that end.
void measure_geodesic(const std::vector<ReferenceRow>& rows);
/// Rows: both latitudes and longitudes, azimuths at both (degrees), distance (metres).
void measure_inverse(const std::vector<ReferenceRow>& rows);
/// Needs no rows: the clothoid's integrals are taken here.
void measure_spiral();

}  // namespace accuracy

#endif
