#include "basalt/memory.h"

namespace vex_lib {

vlAllocator::~vlAllocator() = default;

}  // namespace vex_lib
