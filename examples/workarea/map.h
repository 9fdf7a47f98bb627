// The work area seen from above, north up.
#ifndef WORKAREA_MAP_H
#define WORKAREA_MAP_H

#include <vector>

#include "canvas.h"
#include "relief.h"
#include "report.h"

/// What a map shows, and to what scale.
struct Map {
    const Outcome& outcome;
    const Relief& relief;
    int width;  ///< pixels
    int height;
    double metres_per_pixel;
    double largest_cut;   ///< metres above the grade among the pixels that count; 0 when there is none
    double largest_fill;  ///< metres below it
};

/// A map whose longer side has so many pixels.
Map lay_out_map(const Outcome& outcome, const Relief& relief, int longer_side);

/// Ground, boundary and view; the cells that count show cut and fill, the others their elevation.
Canvas draw_map(const Map& map);

#endif
