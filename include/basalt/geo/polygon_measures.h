/// @file
/// Area and perimeter of a polygon in the plane.
#ifndef BASALT_GEO_POLYGON_MEASURES_H
#define BASALT_GEO_POLYGON_MEASURES_H

#include <cstddef>

#include "basalt/export.h"
#include "basalt/geo/records.h"

namespace basalt {

/// Area enclosed by a polygon in the plane of north and east, by the shoelace formula.
/// @param vertices without a repeated closing vertex
/// @param count of vertices; fewer than 3 enclose 0
/// @return square metres: positive where the vertices run clockwise (from north towards east), else negative.
/// Parts that an outline crossing itself runs round the other way are subtracted.
///
/// Bad input: NaN gives NaN.
///
/// Accuracy: coordinates count as differences from the first vertex, so large grid coordinates cost no
/// digits.
///
/// Threads: thread-safe. Never throws.
BASALT_API double polygon_area(const geo_nee* vertices, std::size_t count) noexcept;

/// The same of coordinates in arrays of their own.
BASALT_API double polygon_area(const double* norths, const double* easts, std::size_t count) noexcept;

/// Length of the outline in the plane of north and east, the closing edge included.
/// @return metres, not negative; 0 for fewer than 2 vertices
///
/// Bad input: NaN gives NaN.
/// Threads: thread-safe. Never throws.
BASALT_API double polygon_perimeter(const geo_nee* vertices, std::size_t count) noexcept;

}  // namespace basalt

#endif
