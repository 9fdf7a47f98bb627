#include "src/platform/heap/part.h"

#include <mutex>

#include "src/platform/pages.h"

namespace basalt::platform {
namespace {

// Smaller blocks share regions, and freeing makes no system call; larger ones are unmapped at once.
constexpr std::size_t SINGLE_FROM = std::size_t{1} << 20;
// Heaps with a maximum up to this have one region of that size, so that none of it is lost between regions.
constexpr std::size_t ONE_REGION_UP_TO = std::size_t{64} << 20;

// The quick lists hold up to this: a bound on the time that one call spends on emptying them.
constexpr std::size_t MOST_QUICK = std::size_t{256} << 10;

constexpr std::size_t ATTEMPTS_BEFORE_GROWTH = 8;
constexpr std::size_t ALL = ~std::size_t{0};

// Every block that can be formed in one region must have a list.
static_assert(ONE_REGION_UP_TO < FreeLists::SIZE_LIMIT);

// Different from the tags of blocks that are not live, and from most other heaps'.
std::uint64_t tag_for(const void* part) {
    const auto address = reinterpret_cast<std::uintptr_t>(part);
    return (((address >> 12) * 0x9E37'79B9'7F4A'7C15) & TAG_BITS) | LIVE_BIT;
}

}  // namespace

HeapPart::HeapPart(std::size_t maximum, std::size_t most_idle)
    : m_tag(tag_for(this)),
      m_single_from(maximum != 0 && maximum <= ONE_REGION_UP_TO ? ALL : SINGLE_FROM),
      m_maximum(maximum != 0 ? maximum : ALL),
      m_most_idle(most_idle) {}

HeapPart::~HeapPart() {
    for (const Region& region : m_regions.all()) {
        leave_region(region.begin, region.size);
        unmap_pages(region.begin, region.size);
    }
}

void* HeapPart::allocate(std::size_t size) {
    const std::size_t need = block_size_for(size);
    if (need == 0) {
        return nullptr;
    }
    const std::lock_guard guard(m_lock);
    Block* block = need < QuickLists::SIZE_LIMIT ? m_quick.take(need, m_tag) : nullptr;
    if (block != nullptr) {
        m_live_shared += need;
    } else {
        block = need < m_single_from ? allocate_shared(need) : allocate_single(need);
    }
    if (block == nullptr) {
        return nullptr;
    }
    permit_access(payload_of(block), size);
    return payload_of(block);
}

DWORD HeapPart::release(void* payload) {
    // The head is often not in the cache: its miss overlaps with the lock and the search.
    __builtin_prefetch(static_cast<std::byte*>(payload) - HEAD_BYTES);
    const std::lock_guard guard(m_lock);
    const Region* region = region_of_live(payload);
    if (region == nullptr) {
        return ERROR_INVALID_PARAMETER;
    }
    Block* block = block_of(payload);
    if (!region->single) {
        free_shared(block);
        return ERROR_SUCCESS;
    }
    if (!unmap_region(*region)) {
        permit_access(payload, size_of(head_of(block)) - HEAD_BYTES);
        return ERROR_NOT_ENOUGH_MEMORY;
    }
    return ERROR_SUCCESS;
}

void* HeapPart::resize(void* payload, std::size_t size, std::size_t& old_size, DWORD& error) {
    const std::size_t need = block_size_for(size);
    const std::lock_guard guard(m_lock);
    const Region* region = region_of_live(payload);
    if (region == nullptr) {
        error = ERROR_INVALID_PARAMETER;
        return nullptr;
    }
    error = ERROR_NOT_ENOUGH_MEMORY;
    Block* block = block_of(payload);
    old_size = size_of(head_of(block)) - HEAD_BYTES;
    if (need == 0 || !(region->single ? resize_single(block, need, *region) : resize_in_place(block, need))) {
        return nullptr;
    }
    forbid_access(payload_of(block), size_of(head_of(block)) - HEAD_BYTES);
    permit_access(payload_of(block), size);
    return payload_of(block);
}

std::size_t HeapPart::compact(bool keeps_last_region) {
    const std::lock_guard guard(m_lock);
    empty_quick_lists(0);
    // Smaller blocks hold no whole page between their links and their end.
    for (unsigned level = FreeLists::place_of(page_size()).level; level < FreeLists::LEVELS; ++level) {
        for (unsigned list = 0; list < FreeLists::LISTS; ++list) {
            Block* next = nullptr;
            for (Block* block = m_free.first({level, list}); block != nullptr; block = next) {
                next = next_of(block);
                const std::size_t size = size_of(head_of(block));
                const bool is_last_region = m_mapped_shared == size + REGION_OVERHEAD;
                if (!(keeps_last_region && is_last_region) && drop_free_region(block)) {
                    continue;
                }
                discard_pages(bytes_of(block) + MIN_BLOCK, bytes_of(block) + size - HEAD_BYTES);
            }
        }
    }
    const std::size_t largest = m_free.largest();
    return largest == 0 ? 0 : largest - HEAD_BYTES - GUARD_BYTES;
}

// The region is looked up before the head is read, so any pointer is safe.
const Region* HeapPart::region_of_live(void* payload) const {
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

Block* HeapPart::find_free(std::size_t need) {
    Block* block = m_free.find(need);
    return block != nullptr ? block : m_free.find_in_own_list(need, ATTEMPTS_BEFORE_GROWTH);
}

// A block of a shared region that is in no quick list.
Block* HeapPart::allocate_shared(std::size_t need) {
    Block* block = find_free(need);
    if (block == nullptr && m_quick.bytes() != 0) {
        empty_quick_lists(0);
        block = find_free(need);
    }
    if (block == nullptr) {
        block = add_shared_region(need);
    }
    if (block == nullptr) {
        // No more can be mapped: now a longer search pays.
        block = m_free.find_in_own_list(need, ALL);
    }
    if (block != nullptr) {
        split(block, need);
    }
    return block;
}

// Frees a live block of a shared region.
void HeapPart::free_shared(Block* block) {
    const std::size_t size = size_of(head_of(block));
    m_live_shared -= size;
    if (size >= QuickLists::SIZE_LIMIT) {
        coalesce(block);
        return;
    }
    forbid_access(block, size);
    if (size >= QuickLists::SMALL_LIMIT) {
        if (Block* before = m_quick.take_first(QuickLists::LARGE)) {
            coalesce(before);
        }
    }
    m_quick.insert(block, size);
    // Blocks in quick lists hide idle regions: no more of them than may be kept. One region is not idle
    // before its last block is freed.
    const bool hide_none = has_one_region() && m_live_shared != 0;
    const std::size_t most = hide_none || m_mapped_shared - m_live_shared <= m_most_idle ? MOST_QUICK : 0;
    if (m_quick.bytes() > most) {
        empty_quick_lists(most);
    }
}

// Coalesces blocks of the quick lists until they hold at most so many bytes.
void HeapPart::empty_quick_lists(std::size_t most) {
    while (m_quick.bytes() > most) {
        coalesce(m_quick.take_any());
    }
}

}  // namespace basalt::platform
