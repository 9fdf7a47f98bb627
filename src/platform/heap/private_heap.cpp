#include "src/platform/heap/private_heap.h"

#include <algorithm>
#include <cstring>
#include <mutex>
#include <new>

#include "src/platform/pages.h"

namespace basalt::platform {
namespace {

constexpr std::uint64_t MAGIC = 0x6261'7361'6c74'4850;

// Below, a block shares a region and a free costs no system call; above, its memory goes back at once.
constexpr std::size_t SINGLE_FROM = std::size_t{1} << 20;
// Heaps with a maximum up to this have one region, of that very size: nothing is lost between regions.
constexpr std::size_t ONE_REGION_UP_TO = std::size_t{64} << 20;

// The quick lists hold up to this: a bound on the time that one call spends on settling them.
constexpr std::size_t MOST_QUICK = std::size_t{256} << 10;

constexpr std::size_t ATTEMPTS_BEFORE_GROWTH = 8;
constexpr std::size_t ALL = ~std::size_t{0};

// Blocks that may join up in one region must have a list.
static_assert(ONE_REGION_UP_TO < FreeLists::SIZE_LIMIT);
static_assert(sizeof(PrivateHeap) <= SMALLEST_PAGE, "an unused heap is to cost one page");

std::size_t record_bytes() {
    const std::size_t page = page_size();
    return (sizeof(PrivateHeap) + page - 1) & ~(page - 1);
}

// Unlike the marks of blocks that are not live, and different for most heaps.
std::uint64_t tag_for(const void* heap) {
    const auto address = reinterpret_cast<std::uintptr_t>(heap);
    return (((address >> 12) * 0x9E37'79B9'7F4A'7C15) & TAG_BITS) | LIVE_BIT;
}

}  // namespace

PrivateHeap::PrivateHeap(std::size_t maximum)
    : m_magic(MAGIC),
      m_tag(tag_for(this)),
      m_single_from(maximum != 0 && maximum <= ONE_REGION_UP_TO ? ALL : SINGLE_FROM),
      m_maximum(maximum != 0 ? maximum : ALL) {}

PrivateHeap* PrivateHeap::create(std::size_t maximum) {
    std::byte* record = map_pages(record_bytes(), page_size());
    return record == nullptr ? nullptr : new (record) PrivateHeap(maximum);
}

PrivateHeap* PrivateHeap::from_handle(void* handle) {
    if (handle == nullptr || (reinterpret_cast<std::uintptr_t>(handle) & (SMALLEST_PAGE - 1)) != 0) {
        return nullptr;
    }
    auto* heap = static_cast<PrivateHeap*>(handle);
    return heap->m_magic == MAGIC ? heap : nullptr;
}

void PrivateHeap::destroy() {
    for (const Region& region : m_regions.all()) {
        leave_region(region.begin, region.size);
        unmap_pages(region.begin, region.size);
    }
    m_magic = 0;
    this->~PrivateHeap();
    unmap_pages(reinterpret_cast<std::byte*>(this), record_bytes());
}

void* PrivateHeap::allocate(std::size_t size) {
    const std::size_t need = block_size_for(size);
    if (need == 0) {
        return nullptr;
    }
    const std::lock_guard guard(m_lock);
    Block* block = need < m_single_from ? take_shared(need) : map_single_region(need);
    if (block == nullptr) {
        return nullptr;
    }
    permit_access(payload_of(block), size);
    return payload_of(block);
}

DWORD PrivateHeap::release(void* payload) {
    if (payload == nullptr) {
        return ERROR_SUCCESS;
    }
    const std::lock_guard guard(m_lock);
    const Region* region = region_of_live(payload);
    if (region == nullptr) {
        return ERROR_INVALID_PARAMETER;
    }
    Block* block = block_of(payload);
    if (!region->single) {
        set_aside(block);
        return ERROR_SUCCESS;
    }
    if (!unmap_region(*region)) {
        permit_access(payload, size_of(head_of(block)) - HEAD_BYTES);
        return ERROR_NOT_ENOUGH_MEMORY;
    }
    return ERROR_SUCCESS;
}

void* PrivateHeap::resize(void* payload, std::size_t size, DWORD& error) {
    const std::size_t need = block_size_for(size);
    std::size_t old_size = 0;
    {
        const std::lock_guard guard(m_lock);
        const Region* region = payload != nullptr ? region_of_live(payload) : nullptr;
        if (region == nullptr) {
            error = ERROR_INVALID_PARAMETER;
            return nullptr;
        }
        error = ERROR_NOT_ENOUGH_MEMORY;
        if (need == 0) {
            return nullptr;
        }
        Block* block = block_of(payload);
        old_size = size_of(head_of(block)) - HEAD_BYTES;
        const bool done = region->single ? resize_single(block, need, *region) : resize_in_place(block, need);
        if (done) {
            forbid_access(payload_of(block), size_of(head_of(block)) - HEAD_BYTES);
            permit_access(payload_of(block), size);
            return payload_of(block);
        }
    }
    // The caller owns the old block and nobody knows the new one: copying needs no lock.
    void* moved = allocate(size);
    if (moved == nullptr) {
        return nullptr;
    }
    permit_access(payload, old_size);
    std::memcpy(moved, payload, std::min(old_size, size));
    release(payload);
    return moved;
}

std::size_t PrivateHeap::compact() {
    const std::lock_guard guard(m_lock);
    settle(0);
    // Blocks that hold no whole page between their links and their end have nothing to give.
    for (unsigned level = FreeLists::place_of(page_size()).level; level < FreeLists::LEVELS; ++level) {
        for (unsigned list = 0; list < FreeLists::LISTS; ++list) {
            Block* next = nullptr;
            for (Block* block = m_free.first({level, list}); block != nullptr; block = next) {
                next = next_of(block);
                const std::size_t size = size_of(head_of(block));
                // A heap that was used keeps its last region, so that it has a free block to answer with.
                if (m_mapped_shared != size + REGION_OVERHEAD && drop_free_region(block)) {
                    continue;
                }
                discard_pages(bytes_of(block) + MIN_BLOCK, bytes_of(block) + size - HEAD_BYTES);
            }
        }
    }
    const std::size_t largest = m_free.largest();
    return largest == 0 ? 0 : largest - HEAD_BYTES - GUARD_BYTES;
}

// The region is looked up before the head is read, so a pointer from anywhere is answered, not followed.
const Region* PrivateHeap::region_of_live(void* payload) const {
    const Region* region = m_regions.find(payload);
    if (region == nullptr || (reinterpret_cast<std::uintptr_t>(payload) & (BLOCK_ALIGNMENT - 1)) != 0) {
        return nullptr;
    }
    Block* block = block_of(payload);
    const auto offset = static_cast<std::size_t>(bytes_of(block) - region->begin);
    if (offset < HEAD_BYTES || offset >= region->size) {
        return nullptr;
    }
    const std::uint64_t head = head_of(block);
    const bool live = (head & TAG_BITS) == m_tag && size_of(head) <= region->size - REGION_OVERHEAD;
    return live && (!region->single || offset == HEAD_BYTES) ? region : nullptr;
}

Block* PrivateHeap::find_free(std::size_t need) {
    Block* block = m_free.find(need);
    return block != nullptr ? block : m_free.find_among_equals(need, ATTEMPTS_BEFORE_GROWTH);
}

Block* PrivateHeap::take_shared(std::size_t need) {
    if (need < QuickLists::SIZE_LIMIT) {
        if (Block* block = m_quick.take(need, m_tag)) {
            m_live_shared += need;
            return block;
        }
    }
    Block* block = find_free(need);
    if (block == nullptr && m_quick.bytes() != 0) {
        settle(0);
        block = find_free(need);
    }
    if (block == nullptr) {
        block = map_shared_region(need);
    }
    if (block == nullptr) {
        // Nothing is left to map: now a longer search is worth its time.
        block = m_free.find_among_equals(need, ALL);
    }
    if (block != nullptr) {
        carve(block, need);
    }
    return block;
}

// Frees a live block of a shared region.
void PrivateHeap::set_aside(Block* block) {
    const std::size_t size = size_of(head_of(block));
    m_live_shared -= size;
    if (size >= QuickLists::SIZE_LIMIT) {
        put_back(block);
        return;
    }
    forbid_access(block, size);
    if (size >= QuickLists::SMALL_LIMIT) {
        if (Block* before = m_quick.take_first(QuickLists::LARGE)) {
            put_back(before);
        }
    }
    m_quick.insert(block, size);
    // Wherever the blocks lie, they keep no more idle regions from being seen as such than may be kept.
    const std::size_t spare = m_mapped_shared - m_live_shared;
    settle(spare <= MOST_IDLE ? MOST_QUICK : 0);
}

// Empties the quick lists down to so many bytes.
void PrivateHeap::settle(std::size_t most) {
    while (m_quick.bytes() > most) {
        put_back(m_quick.take_any());
    }
}

}  // namespace basalt::platform
