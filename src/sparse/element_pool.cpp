#include "src/sparse/element_pool.h"

#include <algorithm>
#include <limits>
#include <new>

#include "basalt/memory.h"

namespace vex_util {

void ElementPool::AddChunk() {
    if (m_elementsPerChunk > std::numeric_limits<std::size_t>::max() / m_elementSize) {
        throw std::bad_alloc();
    }
    // Room in the lists first: what follows must not have to be undone.
    const std::size_t slots = (m_chunks.size() + 1) * m_elementsPerChunk;
    if (slots > FreeRoom()) {
        // Nothing to take over: no slot is free when a chunk is wanted.
        m_freeMemory = Slab(std::max(slots, 2 * FreeRoom()) * sizeof(void*));
        m_free = reinterpret_cast<void**>(m_freeMemory.Begin());
    }
    m_chunks.push_back(nullptr);
    void* const chunk = vex_lib::vlSharedMemoryHeap::Alloc(m_elementSize * m_elementsPerChunk);
    if (chunk == nullptr) {
        m_chunks.pop_back();
        throw std::bad_alloc();
    }
    m_chunks.back() = chunk;
    m_unused = m_elementsPerChunk;
}

void ElementPool::Clear() noexcept {
    for (void* const chunk : m_chunks) {
        vex_lib::vlSharedMemoryHeap::Free(chunk);
    }
    m_chunks.clear();
    m_freeMemory = {};
    m_free = nullptr;
    m_freeCount = 0;
    m_unused = 0;
}

}  // namespace vex_util
