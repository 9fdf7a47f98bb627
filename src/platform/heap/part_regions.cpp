// Mapping and unmapping the regions of a private heap.
#include <algorithm>
#include <bit>
#include <cstdint>

#include "src/platform/heap/part.h"
#include "src/platform/pages.h"

namespace basalt::platform {
namespace {

constexpr std::size_t SMALLEST_REGION = std::size_t{64} << 10;
constexpr std::size_t LARGEST_REGION = std::size_t{32} << 20;

// Aligned to large pages where it holds any, so that the system can use them.
std::byte* map_region(std::size_t size) {
    return map_pages(size, size >= LARGE_PAGE ? LARGE_PAGE : page_size());
}

}  // namespace

// Whether so many bytes may be mapped under the maximum, perhaps after unmapping idle regions.
bool HeapPart::make_room(std::size_t bytes) {
    const auto fits = [&] { return bytes <= m_maximum - m_mapped; };
    return fits() || (drop_idle_regions() && fits());
}

// A listed free block of at least this size in a new region, or null. Each region doubles the heap.
Block* HeapPart::add_shared_region(std::size_t need) {
    const std::size_t least = whole_pages(need + REGION_OVERHEAD);
    if (!make_room(least) || !m_regions.reserve_one()) {
        return nullptr;
    }
    std::size_t size = has_one_region()
                           ? m_maximum
                           : std::clamp(std::bit_ceil(m_mapped_shared), SMALLEST_REGION, LARGEST_REGION);
    size = std::min(std::max(size, least), m_maximum - m_mapped);
    std::byte* begin = map_region(size);
    if (begin == nullptr && size > least) {
        size = least;
        begin = map_region(size);
    }
    if (begin == nullptr) {
        return nullptr;
    }
    // No large page at the start of the first region: a heap with a high maximum may hold very little.
    const std::size_t frugal = m_mapped_shared == 0 ? LARGE_PAGE : 0;
    if (size >= LARGE_PAGE + frugal) {
        prefer_large_pages(begin + frugal, size - frugal);
    }
    Block* block = add_region(begin, size, false);
    m_mapped_shared += size;
    m_idle += size;
    set_head(block, (size - REGION_OVERHEAD) | LAST_OF_REGION);
    m_free.insert(block, size - REGION_OVERHEAD);
    return block;
}

// A live block in a region of its own, or null.
Block* HeapPart::allocate_single(std::size_t need) {
    const std::size_t size = whole_pages(need + REGION_OVERHEAD);
    if (!make_room(size) || !m_regions.reserve_one()) {
        return nullptr;
    }
    std::byte* begin = map_region(size);
    if (begin == nullptr) {
        return nullptr;
    }
    if (size >= LARGE_PAGE) {
        // All of it: mremap() refuses a range with different settings.
        prefer_large_pages(begin, size);
    }
    Block* block = add_region(begin, size, true);
    set_head(block, m_tag | (size - REGION_OVERHEAD) | LAST_OF_REGION);
    return block;
}

Block* HeapPart::add_region(std::byte* begin, std::size_t size, bool single) {
    enter_region(begin, size);
    m_regions.insert({begin, size, single});
    m_mapped += size;
    return block_at(begin + HEAD_BYTES);
}

// Resizes the region of a large block; the system moves its pages instead of copying them.
bool HeapPart::resize_single(Block*& block, std::size_t need, const Region& region) {
    const Region old = region;
    const std::size_t size = whole_pages(need + REGION_OVERHEAD);
    if (size == old.size) {
        return true;
    }
    if (size > old.size && !make_room(size - old.size)) {
        return false;
    }
    leave_region(old.begin, old.size);
    std::byte* begin = remap_pages(old.begin, old.size, size);
    if (begin == nullptr) {
        enter_region(old.begin, old.size);
        permit_access(payload_of(block), old.size - REGION_OVERHEAD - HEAD_BYTES);
        // To shrink is always possible: the block stays as large as it was.
        return size < old.size;
    }
    m_regions.erase(old.begin);
    m_mapped -= old.size;
    block = add_region(begin, size, true);
    set_head(block, m_tag | (size - REGION_OVERHEAD) | LAST_OF_REGION);
    return true;
}

// Whether a free block fills its region. Only the first block of a region lies at this offset in a page.
bool HeapPart::is_idle_region(const Block* block) const {
    const std::uint64_t head = head_of(block);
    if (!is_free(head) || !is_last(head) ||
        (reinterpret_cast<std::uintptr_t>(block) & (SMALLEST_PAGE - 1)) != HEAD_BYTES) {
        return false;
    }
    return size_of(head) == m_regions.find(block)->size - REGION_OVERHEAD;
}

void HeapPart::keep_idle_region(Block* block, std::size_t bytes) {
    m_idle += bytes;
    if (m_idle > m_most_idle) {
        drop_free_region(block);
    }
}

// False when there is none, or the system refuses to unmap any.
bool HeapPart::drop_idle_regions() {
    empty_quick_lists(0);
    const std::size_t idle_before = m_idle;
    for (std::size_t i = m_regions.all().size(); i > 0 && m_idle > 0; --i) {
        const Region& region = m_regions.all()[i - 1];
        Block* first = block_at(region.begin + HEAD_BYTES);
        if (!region.single && is_free(head_of(first))) {
            drop_free_region(first);
        }
    }
    return m_idle < idle_before;
}

// Unmaps the region of a listed free block if the block fills it.
bool HeapPart::drop_free_region(Block* block) {
    if (!is_idle_region(block)) {
        return false;
    }
    const std::size_t size = size_of(head_of(block));
    m_free.remove(block, size);
    const std::size_t bytes = size + REGION_OVERHEAD;
    if (!unmap_region(*m_regions.find(block))) {
        m_free.insert(block, size);
        return false;
    }
    m_mapped_shared -= bytes;
    m_idle -= bytes;
    return true;
}

bool HeapPart::unmap_region(const Region& region) {
    const Region old = region;
    leave_region(old.begin, old.size);
    if (!unmap_pages(old.begin, old.size)) {
        enter_region(old.begin, old.size);
        return false;
    }
    m_regions.erase(old.begin);
    m_mapped -= old.size;
    return true;
}

}  // namespace basalt::platform
