// Slots for the elements of one sparse array, allocated in chunks from the shared heap.
#ifndef BASALT_SRC_SPARSE_ELEMENT_POOL_H
#define BASALT_SRC_SPARSE_ELEMENT_POOL_H

#include <algorithm>
#include <cstddef>
#include <utility>
#include <vector>

#include "src/sparse/slab.h"

namespace vex_util {

// The slot freed last is used first; without free slots, a chunk's slots are used from its last to its first.
// Unused slots are a count and free ones a list beside the chunks, so that no slot is touched before its use.
class ElementPool {
public:
    static constexpr std::size_t SMALLEST_ELEMENT = sizeof(void*);

    ElementPool(std::size_t elementSize, std::size_t elementsPerChunk) noexcept
        : m_elementSize(elementSize < SMALLEST_ELEMENT ? SMALLEST_ELEMENT : elementSize),
          m_elementsPerChunk(elementsPerChunk == 0 ? 1 : elementsPerChunk) {}
    ~ElementPool() { Clear(); }
    ElementPool(const ElementPool&) = delete;
    ElementPool& operator=(const ElementPool&) = delete;

    std::size_t ElementSize() const noexcept { return m_elementSize; }
    std::size_t ElementsPerChunk() const noexcept { return m_elementsPerChunk; }
    // Slots in use.
    std::size_t Size() const noexcept { return m_opened * m_elementsPerChunk - m_unused - m_freeCount; }

    // Makes the next `slots` calls of Take() sure to succeed. Throws std::bad_alloc; some chunks may then be
    // reserved.
    void Reserve(std::size_t slots) {
        while (m_freeCount + m_unused + (m_chunks.size() - m_opened) * m_elementsPerChunk < slots) {
            AddChunk();
        }
    }

    // Returns the chunks that no slot was taken of to the shared heap.
    void ReleaseReserved() noexcept;

    // A slot with undefined contents. Throws std::bad_alloc, with the pool unchanged.
    void* Take() {
        if (m_freeCount != 0) {
            return m_free[--m_freeCount];
        }
        if (m_unused == 0) {
            OpenChunk();
        }
        return m_chunk + --m_unused * m_elementSize;
    }

    // Takes reserved slots in the order of Take(), the first one for the last place.
    void TakeRow(void** slots, std::size_t count) noexcept;

    // The list has space for every slot of the pool.
    void Give(void* slot) noexcept { m_free[m_freeCount++] = slot; }

    // Gives those that are not null, by ascending index.
    void GiveRow(void* const* slots, std::size_t count) noexcept {
        void** const end = std::copy_if(slots, slots + count, m_free + m_freeCount,
                                        [](void* slot) { return slot != nullptr; });
        m_freeCount = static_cast<std::size_t>(end - m_free);
    }

    // Returns every chunk to the shared heap, in the order of allocation.
    void Clear() noexcept;

    void Swap(ElementPool& other) noexcept {
        std::swap(m_elementSize, other.m_elementSize);
        std::swap(m_elementsPerChunk, other.m_elementsPerChunk);
        m_freeMemory.Swap(other.m_freeMemory);
        std::swap(m_free, other.m_free);
        std::swap(m_freeCount, other.m_freeCount);
        std::swap(m_chunk, other.m_chunk);
        std::swap(m_unused, other.m_unused);
        std::swap(m_opened, other.m_opened);
        m_chunks.swap(other.m_chunks);
    }

private:
    friend struct SparseInspector;

    void AddChunk();
    void OpenChunk();
    std::size_t FreeCapacity() const noexcept { return m_freeMemory.Bytes() / sizeof(void*); }

    std::size_t m_elementSize;
    std::size_t m_elementsPerChunk;
    Slab m_freeMemory;
    void** m_free = nullptr;
    std::size_t m_freeCount = 0;
    char* m_chunk = nullptr;   // the chunk opened last
    std::size_t m_unused = 0;  // its slots 0 .. m_unused - 1 have never been used
    std::size_t m_opened = 0;  // chunks behind these are reserved
    std::vector<void*> m_chunks;
};

}  // namespace vex_util

#endif
