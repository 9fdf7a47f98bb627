// Walks a private heap and checks every invariant of it; for tests and debugging.
#ifndef BASALT_SRC_PLATFORM_HEAP_HEAP_INSPECTION_H
#define BASALT_SRC_PLATFORM_HEAP_HEAP_INSPECTION_H

#include <cstddef>

namespace basalt::platform {

struct HeapReport {
    const char* fault = nullptr;  // the first violated invariant in words; null when all hold
    std::size_t regions = 0;
    std::size_t mapped = 0;  // bytes
    std::size_t live_blocks = 0;
    std::size_t free_blocks = 0;
    std::size_t quick_blocks = 0;  // freed and not yet joined with their neighbours
    std::size_t largest_free = 0;  // bytes that a request can have of it
};

// Takes the heap's lock; time grows with the number of blocks. The handle must be valid.
HeapReport inspect_heap(void* handle);

}  // namespace basalt::platform

#endif
