// The free blocks of a heap, in lists by size (two-level segregated fit: Masmano, Ripoll, Crespo and
// Real, 2004): two bitmaps give a list with a large enough block in constant time.
#ifndef BASALT_SRC_PLATFORM_HEAP_FREE_LISTS_H
#define BASALT_SRC_PLATFORM_HEAP_FREE_LISTS_H

#include <algorithm>
#include <array>
#include <bit>
#include <cstddef>
#include <cstdint>

#include "src/platform/heap/block.h"

namespace basalt::platform {

class FreeLists {
public:
    // Level 0 has a list for each multiple of 16 below 256; each further level splits one power of two
    // into 16 lists.
    static constexpr unsigned LISTS_BITS = 4;
    static constexpr unsigned LISTS = 1U << LISTS_BITS;
    static constexpr unsigned LEVELS = 20;
    static constexpr std::size_t FIRST_SPLIT = LISTS * BLOCK_ALIGNMENT;
    static constexpr std::size_t SIZE_LIMIT = FIRST_SPLIT << (LEVELS - 1);  // 128 MiB, not included

    struct Place {
        unsigned level;
        unsigned list;
    };

    static Place place_of(std::size_t size) {
        if (size < FIRST_SPLIT) {
            return {0, static_cast<unsigned>(size / BLOCK_ALIGNMENT)};
        }
        const unsigned log = static_cast<unsigned>(std::bit_width(size)) - 1;
        return {log - FIRST_SPLIT_LOG + 1, static_cast<unsigned>(size >> (log - LISTS_BITS)) & (LISTS - 1)};
    }

    void insert(Block* block, std::size_t size) {
        const auto [level, list] = place_of(size);
        Block* first = m_first[level][list];
        set_prev(block, nullptr);
        set_next(block, first);
        if (first != nullptr) {
            set_prev(first, block);
        }
        m_first[level][list] = block;
        m_lists[level] = static_cast<std::uint16_t>(m_lists[level] | (1U << list));
        m_levels |= 1U << level;
    }

    void remove(Block* block, std::size_t size) {
        Block* next = next_of(block);
        Block* prev = prev_of(block);
        if (next != nullptr) {
            set_prev(next, prev);
        }
        if (prev != nullptr) {
            set_next(prev, next);
            return;
        }
        const auto [level, list] = place_of(size);
        m_first[level][list] = next;
        if (next == nullptr) {
            m_lists[level] = static_cast<std::uint16_t>(m_lists[level] & ~(1U << list));
            if (m_lists[level] == 0) {
                m_levels &= ~(1U << level);
            }
        }
    }

    // A block from the lists whose every block is large enough, or null. Constant time; does not search the
    // list that the size itself belongs to.
    Block* find(std::size_t size) const {
        if (size >= FIRST_SPLIT) {
            const unsigned log = static_cast<unsigned>(std::bit_width(size)) - 1;
            size += (std::size_t{1} << (log - LISTS_BITS)) - 1;
        }
        const auto [level, list] = place_of(size);
        if (level >= LEVELS) {
            return nullptr;
        }
        const unsigned lists = m_lists[level] & (~0U << list);
        if (lists != 0) {
            return m_first[level][static_cast<unsigned>(std::countr_zero(lists))];
        }
        const unsigned levels = m_levels & (~0U << level << 1);
        if (levels == 0) {
            return nullptr;
        }
        const auto higher = static_cast<unsigned>(std::countr_zero(levels));
        return m_first[higher][static_cast<unsigned>(std::countr_zero(unsigned{m_lists[higher]}))];
    }

    // The first fit among the first blocks of the list that the size itself belongs to, or null.
    Block* find_in_own_list(std::size_t size, std::size_t attempts) const {
        const Place place = place_of(size);
        Block* block = place.level < LEVELS ? first(place) : nullptr;
        for (; block != nullptr && attempts != 0; block = next_of(block), --attempts) {
            if (size_of(head_of(block)) >= size) {
                return block;
            }
        }
        return nullptr;
    }

    // Size of the largest block, 0 without any.
    std::size_t largest() const {
        if (m_levels == 0) {
            return 0;
        }
        const unsigned level = static_cast<unsigned>(std::bit_width(m_levels)) - 1;
        const unsigned list = static_cast<unsigned>(std::bit_width(unsigned{m_lists[level]})) - 1;
        std::size_t size = 0;
        for (Block* block = first({level, list}); block != nullptr; block = next_of(block)) {
            size = std::max(size, size_of(head_of(block)));
        }
        return size;
    }

    // First block of a list; next_of() gives the others.
    Block* first(Place place) const { return m_first[place.level][place.list]; }

private:
    friend class HeapInspection;

    static constexpr unsigned FIRST_SPLIT_LOG = std::bit_width(FIRST_SPLIT) - 1;

    std::uint32_t m_levels = 0;
    std::array<std::uint16_t, LEVELS> m_lists{};
    std::array<std::array<Block*, LISTS>, LEVELS> m_first{};
};

}  // namespace basalt::platform

#endif
