// Memory that a benchmark's process holds.
#ifndef BASALT_BENCH_RESIDENT_MEMORY_H
#define BASALT_BENCH_RESIDENT_MEMORY_H

#include <malloc.h>

#include <fstream>

#include "basalt/memory.h"

namespace bench {

// Resident bytes of this process, with what the heaps keep free given back first.
inline double resident_bytes() {
    malloc_trim(0);
    vex_lib::vlSharedMemoryHeap::Compact();
    std::ifstream status("/proc/self/statm");
    long total = 0;
    long resident = 0;
    status >> total >> resident;
    return static_cast<double>(resident) * 4096.0;
}

}  // namespace bench

#endif
