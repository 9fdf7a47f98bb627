// A part of a private heap: blocks of any size from regions of mapped pages, under one lock.
#ifndef BASALT_SRC_PLATFORM_HEAP_PART_H
#define BASALT_SRC_PLATFORM_HEAP_PART_H

#include <cstddef>
#include <cstdint>

#include "basalt/platform/error.h"
#include "src/platform/heap/free_lists.h"
#include "src/platform/heap/quick_lists.h"
#include "src/platform/heap/regions.h"
#include "src/platform/system/lock.h"

namespace basalt::platform {

// Threads: thread-safe except construction and destruction.
class HeapPart {
public:
    // At most `maximum` bytes are mapped for blocks (a multiple of the page size, 0 for no limit), and
    // regions without a live block are kept up to `most_idle` bytes.
    HeapPart(std::size_t maximum, std::size_t most_idle);
    HeapPart(const HeapPart&) = delete;
    HeapPart& operator=(const HeapPart&) = delete;
    // Unmaps every region.
    ~HeapPart();

    // A block of at least size bytes, 16-byte aligned, or null.
    void* allocate(std::size_t size);

    // Frees a block. Error code: ERROR_INVALID_PARAMETER for anything but a live block of this part.
    DWORD release(void* payload);

    // Resizes a block without copying it, perhaps to another address. Null on failure with the error code,
    // and the block's size in old_size unless it is no live block of this part (ERROR_INVALID_PARAMETER).
    void* resize(void* payload, std::size_t size, std::size_t& old_size, DWORD& error);

    // Returns free memory to the system, except for the last region if keeps_last_region. Size of the largest
    // free block, 0 without any.
    std::size_t compact(bool keeps_last_region);

private:
    friend class HeapInspection;

    const Region* region_of_live(void* payload) const;

    // Not inlined: the usual calls end in the quick lists and stay short.
    [[gnu::noinline]] Block* allocate_shared(std::size_t need);
    [[gnu::noinline]] Block* allocate_single(std::size_t need);
    [[gnu::noinline]] void empty_quick_lists(std::size_t most);
    [[gnu::noinline]] void coalesce(Block* block);
    [[gnu::noinline]] bool unmap_region(const Region& region);
    Block* add_shared_region(std::size_t need);
    bool make_room(std::size_t bytes);
    bool has_one_region() const { return m_single_from == ~std::size_t{0}; }
    Block* add_region(std::byte* begin, std::size_t size, bool single);

    Block* find_free(std::size_t need);
    void split(Block* block, std::size_t need);
    void free_shared(Block* block);
    bool resize_in_place(Block* block, std::size_t need);
    bool resize_single(Block*& block, std::size_t need, const Region& region);

    bool is_idle_region(const Block* block) const;
    void keep_idle_region(Block* block, std::size_t bytes);
    bool drop_idle_regions();
    bool drop_free_region(Block* block);

    // The members that every allocation uses come first.
    std::uint64_t m_tag;  // of this heap's live blocks
    Lock m_lock;
    std::size_t m_live_shared = 0;    // bytes of the live blocks in shared regions
    std::size_t m_mapped_shared = 0;  // bytes of the regions that many blocks share
    QuickLists m_quick;
    FreeLists m_free;
    std::size_t m_idle = 0;     // bytes of the idle regions
    std::size_t m_single_from;  // blocks of this size and above have a region of their own
    std::size_t m_maximum;
    std::size_t m_most_idle;
    std::size_t m_mapped = 0;  // bytes of all regions
    RegionTable m_regions;
};

}  // namespace basalt::platform

#endif
