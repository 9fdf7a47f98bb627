// Finds a block by its coordinates.
#ifndef BASALT_SRC_SPARSE_BLOCK_INDEX_H
#define BASALT_SRC_SPARSE_BLOCK_INDEX_H

#include <cstddef>
#include <cstdint>
#include <utility>
#include <vector>

#include "src/sparse/block_pool.h"

namespace vex_util {

struct BlockKey {
    std::int32_t bx;
    std::int32_t by;
};

inline std::uint64_t packed(BlockKey key) noexcept {
    return std::uint64_t{static_cast<std::uint32_t>(key.bx)} << 32 | static_cast<std::uint32_t>(key.by);
}

// Open addressing with linear steps over a power-of-two table, at most half full; nothing is ever removed
// singly. An entry is 16 bytes, so four tries share a cache line.
class BlockIndex {
public:
    // The block, or null.
    Block Find(BlockKey key) const noexcept {
        if (m_entries.empty()) {
            return {};
        }
        const std::uint64_t wanted = packed(key);
        for (std::size_t i = Home(wanted);; i = (i + 1) & (m_entries.size() - 1)) {
            const Entry& entry = m_entries[i];
            if (!entry.block) {
                return {};
            }
            if (entry.key == wanted) {
                return entry.block;
            }
        }
    }

    // Makes room for one more entry. Throws std::bad_alloc, with the index as it was.
    void Reserve();
    // Enters a block that is not there yet; room must have been made. Cannot fail.
    void Add(BlockKey key, Block block) noexcept;
    void Clear() noexcept;
    std::size_t Count() const noexcept { return m_count; }

    void Swap(BlockIndex& other) noexcept {
        m_entries.swap(other.m_entries);
        std::swap(m_count, other.m_count);
        std::swap(m_shift, other.m_shift);
    }

private:
    struct Entry {
        std::uint64_t key = 0;
        Block block;
    };

    void Place(const Entry& added) noexcept;

    std::size_t Home(std::uint64_t key) const noexcept {
        // Multiplicative hashing: the product's top bits depend on every bit of both coordinates, and rows,
        // columns and squares of blocks hardly meet. Without folding a slanted line has one stride in the
        // table, which for some slopes is next to none: hundreds of tries.
        const std::uint64_t folded = key ^ key >> 32;
        return static_cast<std::size_t>((folded * 0x9E3779B97F4A7C15U) >> m_shift);
    }

    std::vector<Entry> m_entries;
    std::size_t m_count = 0;
    unsigned m_shift = 64;
};

}  // namespace vex_util

#endif
