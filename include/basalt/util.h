/// @file
/// Support utilities: file log, hardware addresses, hexadecimal text, timers and version information.
#ifndef BASALT_UTIL_H
#define BASALT_UTIL_H

#include "basalt/util/file_logger.h"
#include "basalt/util/hardware_addresses.h"
#include "basalt/util/hex.h"
#include "basalt/util/timers.h"
#include "basalt/util/version_info.h"

#endif
