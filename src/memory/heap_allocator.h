// Allocator over the process's general-purpose heap.
#ifndef BASALT_SRC_MEMORY_HEAP_ALLOCATOR_H
#define BASALT_SRC_MEMORY_HEAP_ALLOCATOR_H

#include <cstdint>

#include "basalt/memory.h"

namespace vex_lib {

// malloc and free behind the allocator interface; failures are null and not reported.
// Threads: thread-safe.
class vlHeapAllocator : public vlAllocator {
public:
    ~vlHeapAllocator() override;
    void* Alloc(std::uint64_t size) override;
    void Free(void* block) override;
};

}  // namespace vex_lib

#endif
