#include "src/sparse/element_pool.h"

#include <limits>
#include <new>

#include "basalt/memory.h"

namespace vex_util {

void ElementPool::AddChunk() {
    if (m_elementsPerChunk > std::numeric_limits<std::size_t>::max() / m_elementSize) {
        throw std::bad_alloc();
    }
    m_chunks.push_back(nullptr);  // room in the list first: what follows must not have to be undone
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
    m_free = nullptr;
    m_unused = 0;
}

}  // namespace vex_util
