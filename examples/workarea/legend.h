// What stands around the map: degrees at its frame, and what its colours and lines mean.
#ifndef WORKAREA_LEGEND_H
#define WORKAREA_LEGEND_H

#include "canvas.h"
#include "drawing.h"
#include "map.h"

/// Where the map lies on a page with a legend, pixels.
inline constexpr int MAP_TOP = 16;
int map_left(const Map& map);

/// An empty page for the map and its legend.
Canvas page_for(const Map& map);

/// Draws frame and legend on the page.
void draw_legend(const Map& map, Drawing& page);

#endif
