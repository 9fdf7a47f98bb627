// The bytes of a mapped block.
#ifndef BASALT_TESTS_MEMORY_MAPPED_BYTES_H
#define BASALT_TESTS_MEMORY_MAPPED_BYTES_H

#include "basalt/memory/memory_map.h"

namespace basalt::test {

inline char* bytes(const vex_util::CMemoryMap& map) {
    return static_cast<char*>(static_cast<void*>(map));
}

}  // namespace basalt::test

#endif
