// The regions of a heap in a table ordered by address.
#ifndef BASALT_SRC_PLATFORM_HEAP_REGIONS_H
#define BASALT_SRC_PLATFORM_HEAP_REGIONS_H

#include <array>
#include <cstddef>
#include <span>

namespace basalt::platform {

struct Region {
    std::byte* begin;
    std::size_t size;  // bytes
    bool single;       // holds one large block and nothing else
};

class RegionTable {
public:
    RegionTable() = default;
    RegionTable(const RegionTable&) = delete;
    RegionTable& operator=(const RegionTable&) = delete;
    ~RegionTable();

    std::span<const Region> all() const { return {m_regions, m_count}; }

    // The region that holds a pointer, or null. Consecutive calls mostly look for the same region.
    const Region* find(const void* pointer) const {
        const auto* address = static_cast<const std::byte*>(pointer);
        const Region& recent = m_regions[m_recent];
        if (m_recent < m_count && address >= recent.begin && address < recent.begin + recent.size) {
            return &recent;
        }
        return search(address);
    }

    // Makes space for the next insert(); false when out of memory.
    bool reserve_one();
    void insert(const Region& region);
    void erase(const std::byte* begin);

private:
    const Region* search(const std::byte* address) const;

    static constexpr std::size_t INLINE_REGIONS = 32;  // heaps up to about 750 MiB need no further pages

    std::array<Region, INLINE_REGIONS> m_inline{};
    Region* m_regions = m_inline.data();
    std::size_t m_count = 0;
    std::size_t m_capacity = INLINE_REGIONS;
    mutable std::size_t m_recent = 0;
};

}  // namespace basalt::platform

#endif
