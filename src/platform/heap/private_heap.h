// A private heap: blocks of any size out of regions mapped from the system, which go as a whole.
#ifndef BASALT_SRC_PLATFORM_HEAP_PRIVATE_HEAP_H
#define BASALT_SRC_PLATFORM_HEAP_PRIVATE_HEAP_H

#include <cstddef>
#include <cstdint>

#include "basalt/platform/error.h"
#include "src/platform/heap/free_lists.h"
#include "src/platform/heap/quick_lists.h"
#include "src/platform/heap/regions.h"
#include "src/platform/system/lock.h"

namespace basalt::platform {

// The record stands alone in pages of its own; a handle is its address. Threads: thread-safe but for
// create() and destroy(), one lock for everything.
class PrivateHeap {
public:
    // At most so many bytes are mapped for blocks (a multiple of the page size, 0 for no limit).
    // Null when the system has no memory for the record.
    static PrivateHeap* create(std::size_t maximum);

    // Null for what is plainly no heap: null, an odd address, a record that is none.
    static PrivateHeap* from_handle(void* handle);

    // Unmaps every region and the record.
    void destroy();

    // A block of at least size bytes, 16-byte aligned, or null.
    void* allocate(std::size_t size);

    // Error code; anything but a live block of this heap is ERROR_INVALID_PARAMETER.
    DWORD release(void* payload);

    // The block in its new size, perhaps elsewhere, contents kept up to the smaller size. On failure
    // null with the error code set, and the block as it was.
    void* resize(void* payload, std::size_t size, DWORD& error);

    // Gives free memory back to the system; size of the largest free block, 0 without any.
    std::size_t compact();

private:
    friend struct HeapReport inspect_heap(void* handle);

    explicit PrivateHeap(std::size_t maximum);

    const Region* region_of_live(void* payload) const;

    Block* take_shared(std::size_t need);
    Block* map_shared_region(std::size_t need);
    Block* map_single_region(std::size_t need);
    bool admits(std::size_t bytes) const { return bytes <= m_maximum - m_mapped; }
    bool has_one_region() const { return m_single_from == ~std::size_t{0}; }
    Block* add_region(std::byte* begin, std::size_t size, bool single);

    Block* find_free(std::size_t need);
    void carve(Block* block, std::size_t need);
    void set_aside(Block* block);
    void settle(std::size_t most);
    void put_back(Block* block);
    bool resize_in_place(Block* block, std::size_t need);
    bool resize_single(Block*& block, std::size_t need, const Region& region);

    bool is_idle_region(const Block* block) const;
    void keep_idle_region(Block* block, std::size_t bytes);
    bool drop_idle_regions();
    bool drop_free_region(Block* block);
    bool unmap_region(const Region& region);

    // Wholly free regions are kept up to this: a heap that is emptied and filled again finds its pages warm.
    // What the system hands out fresh costs more than all the rest of an allocation.
    static constexpr std::size_t MOST_IDLE = std::size_t{32} << 20;

    // Leading members are what every allocation touches.
    std::uint64_t m_magic;
    std::uint64_t m_tag;  // marks the heads of this heap's live blocks
    Lock m_lock;
    std::size_t m_live_shared = 0;    // bytes of the live blocks in shared regions
    std::size_t m_mapped_shared = 0;  // bytes of the regions that many blocks share
    QuickLists m_quick;
    FreeLists m_free;
    std::size_t m_idle = 0;     // bytes of the wholly free regions kept for the next allocations
    std::size_t m_single_from;  // blocks of this size and above get a region of their own
    std::size_t m_maximum;
    std::size_t m_mapped = 0;  // bytes of all regions
    RegionTable m_regions;
};

}  // namespace basalt::platform

#endif
