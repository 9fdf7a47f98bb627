// The colours of the map and of its legend.
#ifndef WORKAREA_MAP_COLOURS_H
#define WORKAREA_MAP_COLOURS_H

#include <basalt/platform.h>

#include <vector>

inline constexpr COLORREF PAPER = RGB(255, 255, 255);
inline constexpr COLORREF INK = RGB(38, 38, 38);
inline constexpr COLORREF NO_DATA = RGB(222, 222, 222);

/// Where cut and fill begin; their colours darken with the depth, down to a part of this at the largest.
inline constexpr COLORREF CUT = RGB(255, 138, 92);
inline constexpr COLORREF FILL = RGB(120, 178, 255);
inline constexpr float DARKENING = 2.6F;

/// Colours for elevations from the lowest to the highest, at equal distances, from the library's palette.
std::vector<COLORREF> elevation_stops();

/// Between two of the stops; `part` 0 is the first, 1 the last.
COLORREF between_stops(const std::vector<COLORREF>& stops, double part);

/// By what a hue is divided a part of the way down to the largest depth, where it is DARKENING.
float darkening_at(double part);

/// A hue at such a place.
COLORREF darkened(COLORREF hue, double part);

/// A colour under some light: 1 leaves it as it is.
COLORREF lit(COLORREF colour, double light);

#endif
