// Freed blocks that are not yet coalesced with their neighbours: most are allocated again soon, without a
// split. Small ones are in a list for each size; of larger ones only the last is kept, for callers that free
// and allocate in turn.
#ifndef BASALT_SRC_PLATFORM_HEAP_QUICK_LISTS_H
#define BASALT_SRC_PLATFORM_HEAP_QUICK_LISTS_H

#include <array>
#include <cstddef>

#include "src/platform/heap/block.h"

namespace basalt::platform {

// Their heads have QUICK_TAG: neither live nor, to their neighbours, free.
class QuickLists {
public:
    static constexpr std::size_t LISTS = 34;
    static constexpr std::size_t SMALL_LIMIT = LISTS * BLOCK_ALIGNMENT;  // not included
    static constexpr std::size_t SIZE_LIMIT = std::size_t{32} << 10;     // not included
    static constexpr std::size_t LARGE = 0;                              // the list of the larger ones

    static std::size_t list_of(std::size_t size) {
        return size < SMALL_LIMIT ? size / BLOCK_ALIGNMENT : LARGE;
    }

    // The list of larger ones must be empty before one is inserted.
    void insert(Block* block, std::size_t size) {
        Block*& first = m_first[list_of(size)];
        set_head(block, (head_of(block) & ~TAG_BITS) | QUICK_TAG);
        set_next(block, first);
        first = block;
        m_bytes += size;
    }

    // The block of exactly this size that was freed last, made live with the tag; null without any.
    Block* take(std::size_t size, std::uint64_t tag) {
        const std::size_t list = list_of(size);
        Block* block = m_first[list];
        if (block != nullptr && (list != LARGE || size_of(head_of(block)) == size)) {
            m_first[list] = next_of(block);
            set_head(block, (head_of(block) & ~TAG_BITS) | tag);
            m_bytes -= size;
            return block;
        }
        return nullptr;
    }

    // Some block, the lists in turn; there must be one. Its head is left as it is.
    Block* take_any() {
        while (m_first[m_turn] == nullptr) {
            m_turn = (m_turn + 1) % LISTS;
        }
        Block* block = take_first(m_turn);
        m_turn = (m_turn + 1) % LISTS;
        return block;
    }

    // The first of a list, or null. Its head is left as it is.
    Block* take_first(std::size_t list) {
        Block* block = m_first[list];
        if (block != nullptr) {
            m_first[list] = next_of(block);
            m_bytes -= size_of(head_of(block));
        }
        return block;
    }

    std::size_t bytes() const { return m_bytes; }

    // First block of a list; next_of() gives the others.
    Block* first(std::size_t list) const { return m_first[list]; }

private:
    std::size_t m_bytes = 0;
    std::size_t m_turn = 0;
    std::array<Block*, LISTS> m_first{};
};

}  // namespace basalt::platform

#endif
