/// @file
/// Calendar time and its tick count.
#ifndef BASALT_PLATFORM_CALENDAR_H
#define BASALT_PLATFORM_CALENDAR_H

#include "basalt/export.h"
#include "basalt/platform/types.h"

#endif
