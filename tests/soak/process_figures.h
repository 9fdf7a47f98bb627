// What this process holds of the machine, as the system counts it.
#ifndef BASALT_TESTS_SOAK_PROCESS_FIGURES_H
#define BASALT_TESTS_SOAK_PROCESS_FIGURES_H

#include <malloc.h>
#include <time.h>
#include <unistd.h>

#include <algorithm>
#include <cstddef>
#include <fstream>

#include "basalt/memory.h"
#include "tests/support/heap_inspection.h"

namespace basalt::soak {

inline std::size_t resident_bytes() {
    std::ifstream status("/proc/self/statm");
    std::size_t total = 0;
    std::size_t resident = 0;
    status >> total >> resident;
    return resident * static_cast<std::size_t>(sysconf(_SC_PAGESIZE));
}

// Bytes that the general-purpose heap and the shared heap have of the system.
inline std::size_t heap_bytes() {
    const struct mallinfo2 general = mallinfo2();
    return general.arena + general.hblkhd +
           basalt::platform::inspect_heap(vex_lib::vlSharedMemoryHeap::GetHeapHandle()).mapped;
}

// Processor time of this thread: what else runs on the machine does not count.
inline double cpu_seconds() {
    timespec now = {};
    clock_gettime(CLOCK_THREAD_CPUTIME_ID, &now);
    return static_cast<double>(now.tv_sec) + static_cast<double>(now.tv_nsec) * 1e-9;
}

}  // namespace basalt::soak

#endif
