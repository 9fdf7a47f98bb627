// From a rectangle in degrees to cells.
#ifndef WORKAREA_VIEW_H
#define WORKAREA_VIEW_H

#include "options.h"
#include "work_area.h"

/// All cells of the grid.
CellBox whole_grid(const GridFrame& frame);

/// The cells whose centres lie in the view, its edges included, cut to the grid. InputError when there is
/// none.
CellBox cells_in_view(const GridFrame& frame, const DegreeBox& view);

#endif
