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
    // Grow the lists first: if one cannot, there is no chunk to free again.
    const std::size_t slots = (m_chunks.size() + 1) * m_elementsPerChunk;
    if (slots > FreeCapacity()) {
        Slab larger(std::max(slots, 2 * FreeCapacity()) * sizeof(void*));
        std::copy_n(m_free, m_freeCount, reinterpret_cast<void**>(larger.Begin()));
        m_freeMemory.Swap(larger);
        m_free = reinterpret_cast<void**>(m_freeMemory.Begin());
    }
    m_chunks.push_back(nullptr);
    m_chunks.back() = vex_lib::vlSharedMemoryHeap::Alloc(m_elementSize * m_elementsPerChunk);
    if (m_chunks.back() == nullptr) {
        m_chunks.pop_back();
        throw std::bad_alloc();
    }
}

void ElementPool::OpenChunk() {
    if (m_opened == m_chunks.size()) {
        AddChunk();
    }
    m_chunk = static_cast<char*>(m_chunks[m_opened++]);
    m_unused = m_elementsPerChunk;
}

void ElementPool::ReleaseReserved() noexcept {
    for (; m_chunks.size() > m_opened; m_chunks.pop_back()) {
        vex_lib::vlSharedMemoryHeap::Free(m_chunks.back());
    }
}

void ElementPool::TakeRow(void** slots, std::size_t count) noexcept {
    const std::size_t freed = std::min(count, m_freeCount);
    m_freeCount -= freed;
    count -= freed;
    std::copy_n(m_free + m_freeCount, freed, slots + count);
    while (count != 0) {
        if (m_unused == 0) {
            OpenChunk();
        }
        const std::size_t run = std::min(count, m_unused);
        const std::size_t size = m_elementSize;
        char* const first = m_chunk + (m_unused - run) * size;
        for (std::size_t i = 0; i < run; ++i) {
            slots[count - run + i] = first + i * size;
        }
        m_unused -= run;
        count -= run;
    }
}

void ElementPool::Clear() noexcept {
    for (void* const chunk : m_chunks) {
        vex_lib::vlSharedMemoryHeap::Free(chunk);
    }
    std::vector<void*>().swap(m_chunks);
    m_freeMemory = {};
    m_free = nullptr;
    m_freeCount = 0;
    m_chunk = nullptr;
    m_unused = 0;
    m_opened = 0;
}

}  // namespace vex_util
