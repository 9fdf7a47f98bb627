// From rows of elevations to stored cells.
#ifndef WORKAREA_TERRAIN_LOADER_H
#define WORKAREA_TERRAIN_LOADER_H

#include "terrain_source.h"
#include "work_area.h"

struct LoadTimes {
    double read = 0.0;   ///< seconds in the source
    double store = 0.0;  ///< seconds for slopes and insertion
};

/// Stores every cell of the source that has an elevation. Three rows are held at a time, so beyond the work
/// area itself memory does not depend on the number of rows.
///
/// Slopes are central differences over the four neighbours, the scheme of Fleming and Hoffer (1979) and of
/// Zevenbergen and Thorne (1987); at an edge or beside a missing cell the difference is taken to one side.
LoadTimes load_terrain(TerrainSource& source, WorkArea& area);

#endif
