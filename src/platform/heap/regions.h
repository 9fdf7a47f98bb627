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

    // The region that holds a pointer, or null.
    const Region* find(const void* pointer) const {
        if (m_count == 0) {
            return nullptr;
        }
        // Binary search without branches, which blocks freed in random order would mispredict.
        const auto* const address = static_cast<const std::byte*>(pointer);
        const Region* region = m_regions;
        for (std::size_t rest = m_count; rest > 1;) {
            const std::size_t half = rest / 2;
            region = region[half].begin <= address ? region + half : region;
            rest -= half;
        }
        return address >= region->begin && address < region->begin + region->size ? region : nullptr;
    }

    // Makes space for the next insert(); false when out of memory.
    bool reserve_one();
    void insert(const Region& region);
    void erase(const std::byte* begin);

private:
    static constexpr std::size_t INLINE_REGIONS = 32;  // shared regions of 736 MiB in all

    std::array<Region, INLINE_REGIONS> m_inline{};
    Region* m_regions = m_inline.data();
    std::size_t m_count = 0;
    std::size_t m_capacity = INLINE_REGIONS;
};

}  // namespace basalt::platform

#endif
