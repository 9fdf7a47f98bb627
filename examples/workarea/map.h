// The work area seen from above, north up.
#ifndef WORKAREA_MAP_H
#define WORKAREA_MAP_H

#include <basalt/platform.h>

#include <vector>

#include "drawing.h"
#include "relief.h"
#include "report.h"

inline constexpr COLORREF PAPER = RGB(255, 255, 255);
inline constexpr COLORREF INK = RGB(38, 38, 38);

/// Where cut and fill begin; their colours darken with the depth.
inline constexpr COLORREF CUT = RGB(255, 138, 92);
inline constexpr COLORREF FILL = RGB(120, 178, 255);

/// Colours for elevations from the lowest to the highest, at equal distances, from the library's palette.
std::vector<COLORREF> elevation_stops();

/// By what the channels of a hue are divided a part of the way down to the largest depth.
float darkening_at(double part);

/// What a map shows, and to what scale.
struct Map {
    const Outcome& outcome;
    const Relief& relief;
    int width;  ///< pixels
    int height;
    double metres_per_pixel;
    double largest_cut = 0.0;   ///< metres above the grade among the pixels that count; 0 when there is none
    double largest_fill = 0.0;  ///< metres below it
};

/// A map whose longer side has so many pixels.
Map lay_out_map(const Outcome& outcome, const Relief& relief, int longer_side);

/// Ground, boundary and view; the cells that count show cut and fill, the others their elevation.
Canvas draw_map(const Map& map);

#endif
