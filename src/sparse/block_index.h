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

// Hash table with open addressing and linear probing, a power of two large and at most half full. Blocks are
// never removed one by one.
class BlockIndex {
public:
    // The block, or null.
    CellBlock Find(BlockKey key) const noexcept {
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

    void Prefetch(BlockKey key) const noexcept {
        if (!m_entries.empty()) {
            __builtin_prefetch(&m_entries[Home(packed(key))]);
        }
    }

    // Grows the table for `count` more blocks. Throws std::bad_alloc, with the index unchanged.
    void Reserve(std::size_t count);
    // Adds a block that is not in the index; space must be reserved.
    void Add(BlockKey key, CellBlock block) noexcept;
    std::size_t Count() const noexcept { return m_count; }

    void Swap(BlockIndex& other) noexcept {
        m_entries.swap(other.m_entries);
        std::swap(m_count, other.m_count);
        std::swap(m_shift, other.m_shift);
    }

private:
    struct Entry {
        std::uint64_t key = 0;
        CellBlock block;
    };

    void Place(const Entry& added) noexcept;

    std::size_t Home(std::uint64_t key) const noexcept {
        // Multiplicative hashing of the folded key. Unfolded, the blocks of a slanted line would have one
        // stride in the table, for some slopes next to none: hundreds of probes.
        const std::uint64_t folded = key ^ key >> 32;
        return static_cast<std::size_t>((folded * 0x9E3779B97F4A7C15U) >> m_shift);
    }

    std::vector<Entry> m_entries;
    std::size_t m_count = 0;
    unsigned m_shift = 64;
};

}  // namespace vex_util

#endif
