/// @file
/// The operating-system codes from which a way of drawing can be had.
#ifndef BASALT_SRC_GRAPHICS_OS_CODES_H
#define BASALT_SRC_GRAPHICS_OS_CODES_H

#include "basalt/frame.h"

namespace basalt::graphics {

inline constexpr basalt_os OS_WITH_MASKS = 2;      ///< contexts copy between depths
inline constexpr basalt_os OS_WITH_GRADIENTS = 5;  ///< gradients and transparent copies are the platform's

}  // namespace basalt::graphics

#endif
