// A private heap: blocks of any size from regions of mapped pages, all unmapped with the heap.
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

// The record has pages of its own; a handle is its address. Threads: thread-safe except create() and
// destroy(); one lock for everything.
class PrivateHeap {
public:
    // At most so many bytes are mapped for blocks (a multiple of the page size, 0 for no limit).
    // Null when out of memory.
    static PrivateHeap* create(std::size_t maximum);

    // Null for a handle that is plainly no heap: null, not page-aligned, not a record.
    static PrivateHeap* from_handle(void* handle);

    // Unmaps every region and the record.
    void destroy();

    // A block of at least size bytes, 16-byte aligned, or null.
    void* allocate(std::size_t size);

    // Frees a block. Error code: ERROR_INVALID_PARAMETER for anything but a live block of this heap.
    DWORD release(void* payload);

    // The block in its new size, perhaps at another address, contents kept up to the smaller size. On failure
    // null with the error code set; the block is unchanged.
    void* resize(void* payload, std::size_t size, DWORD& error);

    // Returns free memory to the system. Size of the largest free block, 0 without any.
    std::size_t compact();

private:
    friend class HeapInspection;

    explicit PrivateHeap(std::size_t maximum);

    const Region* region_of_live(void* payload) const;

    Block* allocate_shared(std::size_t need);
    Block* add_shared_region(std::size_t need);
    Block* allocate_single(std::size_t need);
    bool make_room(std::size_t bytes);
    bool has_one_region() const { return m_single_from == ~std::size_t{0}; }
    Block* add_region(std::byte* begin, std::size_t size, bool single);

    Block* find_free(std::size_t need);
    void split(Block* block, std::size_t need);
    void free_shared(Block* block);
    void empty_quick_lists(std::size_t most);
    void coalesce(Block* block);
    bool resize_in_place(Block* block, std::size_t need);
    bool resize_single(Block*& block, std::size_t need, const Region& region);

    bool is_idle_region(const Block* block) const;
    void keep_idle_region(Block* block, std::size_t bytes);
    bool drop_idle_regions();
    bool drop_free_region(Block* block);
    bool unmap_region(const Region& region);

    // Idle regions, those without a live block, are kept up to this: page faults of new ones cost more than
    // all the rest of an allocation.
    static constexpr std::size_t MOST_IDLE = std::size_t{32} << 20;

    // The members that every allocation uses come first.
    std::uint64_t m_magic;
    std::uint64_t m_tag;  // of this heap's live blocks
    Lock m_lock;
    std::size_t m_live_shared = 0;    // bytes of the live blocks in shared regions
    std::size_t m_mapped_shared = 0;  // bytes of the regions that many blocks share
    QuickLists m_quick;
    FreeLists m_free;
    std::size_t m_idle = 0;     // bytes of the idle regions
    std::size_t m_single_from;  // blocks of this size and above have a region of their own
    std::size_t m_maximum;
    std::size_t m_mapped = 0;  // bytes of all regions
    RegionTable m_regions;
};

}  // namespace basalt::platform

#endif
