#include "src/platform/heap_regions.h"

#include <algorithm>
#include <memory>

#include "src/platform/pages.h"

namespace basalt::platform {

RegionTable::~RegionTable() {
    if (m_regions != m_inline.data()) {
        unmap_pages(reinterpret_cast<std::byte*>(m_regions), m_capacity * sizeof(Region));
    }
}

const Region* RegionTable::search(const std::byte* address) const {
    const Region* first = m_regions;
    const Region* after =
        std::upper_bound(first, first + m_count, address,
                         [](const std::byte* a, const Region& region) { return a < region.begin; });
    if (after == first || address >= (after - 1)->begin + (after - 1)->size) {
        return nullptr;
    }
    m_recent = static_cast<std::size_t>(after - 1 - first);
    return after - 1;
}

bool RegionTable::reserve_one() {
    if (m_count < m_capacity) {
        return true;
    }
    // A capacity of whole pages: page_size() regions take sizeof(Region) pages.
    const std::size_t capacity = std::max(2 * m_capacity, page_size());
    std::byte* pages = map_pages(capacity * sizeof(Region), page_size());
    if (pages == nullptr) {
        return false;
    }
    auto* table = reinterpret_cast<Region*>(pages);
    std::uninitialized_copy_n(m_regions, m_count, table);
    if (m_regions != m_inline.data()) {
        unmap_pages(reinterpret_cast<std::byte*>(m_regions), m_capacity * sizeof(Region));
    }
    m_regions = table;
    m_capacity = capacity;
    return true;
}

void RegionTable::insert(const Region& region) {
    Region* end = m_regions + m_count;
    Region* place = std::upper_bound(m_regions, end, region.begin,
                                     [](const std::byte* a, const Region& other) { return a < other.begin; });
    std::move_backward(place, end, end + 1);
    *place = region;
    ++m_count;
    m_recent = static_cast<std::size_t>(place - m_regions);
}

void RegionTable::erase(const std::byte* begin) {
    Region* end = m_regions + m_count;
    Region* place = std::lower_bound(m_regions, end, begin,
                                     [](const Region& other, const std::byte* a) { return other.begin < a; });
    std::move(place + 1, end, place);
    --m_count;
}

}  // namespace basalt::platform
