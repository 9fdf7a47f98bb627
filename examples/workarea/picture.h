// The picture of a work area.
#ifndef WORKAREA_PICTURE_H
#define WORKAREA_PICTURE_H

#include "report.h"

/// Draws the whole grid into options.picture, with options.legend beside a legend. Selects the grid.
/// std::runtime_error when the file cannot be written.
PictureSize write_picture(const Outcome& outcome, WorkArea& area);

#endif
