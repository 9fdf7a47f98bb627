// Slots for the elements of one sparse array, taken in chunks from the shared heap.
#ifndef BASALT_SRC_SPARSE_ELEMENT_POOL_H
#define BASALT_SRC_SPARSE_ELEMENT_POOL_H

#include <cstddef>
#include <cstring>
#include <unordered_set>
#include <utility>
#include <vector>

namespace vex_util {

// Slots are handed out last freed first, and a chunk's own slots from its last down to its first. The slots
// of the newest chunk that were never used are a count, not links, so a chunk is not touched before use.
// A free slot keeps the link to the next one in its first bytes; slots need no alignment, hence memcpy.
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
        if (m_free != nullptr) {
            void* const slot = m_free;
            std::memcpy(&m_free, slot, sizeof m_free);
            return slot;
        }
        if (m_unused == 0) {
            AddChunk();
        }
        --m_unused;
        return static_cast<char*>(m_chunks.back()) + m_unused * m_elementSize;
    }

    void Give(void* slot) noexcept {
        std::memcpy(slot, &m_free, sizeof m_free);
        m_free = slot;
    }

    // Gives every chunk back to the shared heap, in the order they were taken.
    void Clear() noexcept;

    void Swap(ElementPool& other) noexcept {
        std::swap(m_elementSize, other.m_elementSize);
        std::swap(m_elementsPerChunk, other.m_elementsPerChunk);
        std::swap(m_free, other.m_free);
        std::swap(m_unused, other.m_unused);
        m_chunks.swap(other.m_chunks);
    }

    // Throws std::logic_error naming the first broken invariant, given the slots that cells hold.
    void CheckInvariants(std::size_t taken, const std::unordered_set<const void*>& takenSlots) const;

private:
    void AddChunk();

    std::size_t m_elementSize;
    std::size_t m_elementsPerChunk;
    void* m_free = nullptr;
    std::size_t m_unused = 0;  // slots 0 .. m_unused - 1 of the newest chunk were never handed out
    std::vector<void*> m_chunks;
};

}  // namespace vex_util

#endif
