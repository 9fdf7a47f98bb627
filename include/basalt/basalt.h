/// @file
/// Every family.
#ifndef BASALT_BASALT_H
#define BASALT_BASALT_H

#include "basalt/files.h"
#include "basalt/frame.h"
#include "basalt/geo.h"
#include "basalt/graphics.h"
#include "basalt/memory.h"
#include "basalt/platform.h"
#include "basalt/sparse.h"
#include "basalt/sparse_cells.h"
#include "basalt/sparse_grid.h"
#include "basalt/util.h"
#include "basalt/version.h"

#endif
