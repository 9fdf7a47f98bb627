/// @file
/// Support utilities: timers.
#ifndef BASALT_UTIL_H
#define BASALT_UTIL_H

#include "basalt/util/timers.h"

#endif
