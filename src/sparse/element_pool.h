// Slots for the elements of one sparse array, taken in chunks from the shared heap.
#ifndef BASALT_SRC_SPARSE_ELEMENT_POOL_H
#define BASALT_SRC_SPARSE_ELEMENT_POOL_H

#include <cstddef>
#include <unordered_set>
#include <utility>
#include <vector>

#include "src/sparse/slab.h"

namespace vex_util {

// Slots are handed out last freed first, and a chunk's own slots from its last down to its first. The slots
// of the newest chunk that were never used are a count, so a chunk is not touched before use. The freed ones
// stand in a list beside the chunks, not in each other: giving a slot back need not wait for its memory, nor
// taking it for the next one's address.
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
    std::size_t ChunkCount() const noexcept { return m_chunks.size(); }

    // A slot with undefined contents. Throws std::bad_alloc, with the pool as it was.
    void* Take() {
        if (m_freeCount != 0) {
            return m_free[--m_freeCount];
        }
        if (m_unused == 0) {
            AddChunk();
        }
        --m_unused;
        return static_cast<char*>(m_chunks.back()) + m_unused * m_elementSize;
    }

    // There is room for every slot of the pool.
    void Give(void* slot) noexcept { m_free[m_freeCount++] = slot; }

    // Gives every chunk back to the shared heap, in the order they were taken.
    void Clear() noexcept;

    void Swap(ElementPool& other) noexcept {
        std::swap(m_elementSize, other.m_elementSize);
        std::swap(m_elementsPerChunk, other.m_elementsPerChunk);
        std::swap(m_freeMemory, other.m_freeMemory);
        std::swap(m_free, other.m_free);
        std::swap(m_freeCount, other.m_freeCount);
        std::swap(m_unused, other.m_unused);
        m_chunks.swap(other.m_chunks);
    }

    // Throws std::logic_error naming the first broken invariant, given the slots that cells hold.
    void CheckInvariants(std::size_t taken, const std::unordered_set<const void*>& takenSlots) const;

private:
    void AddChunk();
    std::size_t FreeRoom() const noexcept { return m_freeMemory.Bytes() / sizeof(void*); }

    std::size_t m_elementSize;
    std::size_t m_elementsPerChunk;
    Slab m_freeMemory;  // touched when slots are freed, not before
    void** m_free = nullptr;
    std::size_t m_freeCount = 0;
    std::size_t m_unused = 0;  // slots 0 .. m_unused - 1 of the newest chunk were never handed out
    std::vector<void*> m_chunks;
};

}  // namespace vex_util

#endif
