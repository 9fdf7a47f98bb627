// Angles and coordinates as field books and reports write them.
#ifndef FIELDBOOK_ANGLES_H
#define FIELDBOOK_ANGLES_H

#include <basalt/geo.h>

#include <cstddef>
#include <string>

#include "csv_reader.h"

inline constexpr double PI = 3.141592653589793;
inline constexpr double RADIANS_PER_DEGREE = PI / 180.0;
inline constexpr double RADIANS_PER_SECOND = PI / 648000.0;
inline constexpr double LARGEST_COORDINATE = 1e8;  // metres

/// A field in radians: decimal degrees (`123.5`) or degrees, minutes and seconds (`123-30-00.0`) in [0, 360).
/// InputError for anything else; `what` names it there.
double read_angle(const CsvReader& csv, std::size_t index, const std::string& what);

/// Three fields from `index` on: north, east and elevation in metres.
geo_nee read_coordinates(const CsvReader& csv, std::size_t index);

/// `123-30-00.0` of an angle from 0 to 360 degrees, with so many decimals of a second; 360 degrees become 0.
std::string dms_text(double radians, int decimals);

#endif
