#include "basalt/memory.h"

namespace vex_lib {

void* vlSharedMemoryHeap::operator new(std::size_t size) noexcept {
    return m_heap.Alloc(size);
}

void* vlSharedMemoryHeap::operator new(std::size_t size, const char*, int) noexcept {
    return m_heap.Alloc(size);
}

void vlSharedMemoryHeap::operator delete(void* block) noexcept {
    m_heap.Free(block);
}

void vlSharedMemoryHeap::operator delete(void* block, const char*, int) noexcept {
    m_heap.Free(block);
}

void* vlSharedMemoryHeap::Alloc(std::size_t size) {
    return m_heap.Alloc(size);
}

void vlSharedMemoryHeap::Free(void* block) {
    m_heap.Free(block);
}

void vlSharedMemoryHeap::Compact() {
    m_heap.Compact();
}

void* vlSharedMemoryHeap::GetHeapHandle() {
    return m_heap.Handle();
}

}  // namespace vex_lib
