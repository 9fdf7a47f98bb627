#include "src/platform/heap/regions.h"

#include <algorithm>
#include <memory>

#include "src/platform/pages.h"

namespace basalt::platform {

RegionTable::~RegionTable() {
    if (m_regions != m_inline.data()) {
        unmap_pages(reinterpret_cast<std::byte*>(m_regions), m_capacity * sizeof(Region));
    }
}

bool RegionTable::reserve_one() {
    if (m_count < m_capacity) {
        return true;
    }
    // Whole pages: page_size() entries take sizeof(Region) pages.
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
}

void RegionTable::erase(const std::byte* begin) {
    Region* end = m_regions + m_count;
    Region* place = std::lower_bound(m_regions, end, begin,
                                     [](const Region& other, const std::byte* a) { return other.begin < a; });
    std::move(place + 1, end, place);
    --m_count;
}

}  // namespace basalt::platform
