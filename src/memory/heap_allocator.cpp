#include "src/memory/heap_allocator.h"

#include <cstdlib>

namespace vex_lib {

vlHeapAllocator::~vlHeapAllocator() = default;

void* vlHeapAllocator::Alloc(std::uint64_t size) {
    return std::malloc(size);
}

void vlHeapAllocator::Free(void* block) {
    std::free(block);
}

}  // namespace vex_lib
