// Blocks that were freed and not yet joined with their neighbours: most are asked for again soon, and are
// then handed out as they are. Small ones are in a list for each size; of larger ones only the last is here,
// for callers that give one back and take one in turn.
#ifndef BASALT_SRC_PLATFORM_HEAP_QUICK_LISTS_H
#define BASALT_SRC_PLATFORM_HEAP_QUICK_LISTS_H

#include <array>
#include <cstddef>

#include "src/platform/heap/block.h"

namespace basalt::platform {

// Their heads carry QUICK_TAG, so that they are neither live nor free to their neighbours.
class QuickLists {
public:
    static constexpr std::size_t LISTS = 34;
    static constexpr std::size_t SMALL_LIMIT = LISTS * BLOCK_ALIGNMENT;  // not included
    static constexpr std::size_t SIZE_LIMIT = std::size_t{32} << 10;     // not included
    static constexpr std::size_t LARGE = 0;                              // the list of the larger ones

    static std::size_t list_of(std::size_t size) {
        return size < SMALL_LIMIT ? size / BLOCK_ALIGNMENT : LARGE;
    }

    // A larger one only where there is none.
    void insert(Block* block, std::size_t size) {
        Block*& first = m_first[list_of(size)];
        set_head(block, (head_of(block) & ~TAG_BITS) | QUICK_TAG);
        set_next(block, first);
        first = block;
        m_bytes += size;
    }

    // The block of this very size that came last, live with the tag; null without any.
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

    // Some block, the sizes taking turns; there must be one. Its head is left as it is.
    Block* take_any() {
        while (m_first[m_turn] == nullptr) {
            m_turn = (m_turn + 1) % LISTS;
        }
        Block* block = take_first(m_turn);
        m_turn = (m_turn + 1) % LISTS;
        return block;
    }

    // The first of a list, or null, in the same way.
    Block* take_first(std::size_t list) {
        Block* block = m_first[list];
        if (block != nullptr) {
            m_first[list] = next_of(block);
            m_bytes -= size_of(head_of(block));
        }
        return block;
    }

    std::size_t bytes() const { return m_bytes; }

    // First block of a size; the others by next_of().
    Block* first(std::size_t list) const { return m_first[list]; }

private:
    std::size_t m_bytes = 0;
    std::size_t m_turn = 0;
    std::array<Block*, LISTS> m_first{};
};

}  // namespace basalt::platform

#endif
