/// @file
/// The platform's types and calls that a host uses.
#ifndef BASALT_PLATFORM_H
#define BASALT_PLATFORM_H

#include "basalt/platform/automation_date.h"
#include "basalt/platform/bitmap.h"
#include "basalt/platform/calendar.h"
#include "basalt/platform/cstring.h"
#include "basalt/platform/device_context.h"
#include "basalt/platform/drawing.h"
#include "basalt/platform/error.h"
#include "basalt/platform/graphics_objects.h"
#include "basalt/platform/graphics_types.h"
#include "basalt/platform/rectangles.h"
#include "basalt/platform/region.h"
#include "basalt/platform/text_types.h"
#include "basalt/platform/types.h"

#endif
