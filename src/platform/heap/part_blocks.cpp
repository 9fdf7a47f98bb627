// Splitting and coalescing the blocks of shared regions.
#include "src/platform/heap/part.h"

namespace basalt::platform {

// Makes a listed free block live; the excess at its end becomes a free block.
void HeapPart::split(Block* block, std::size_t need) {
    const std::uint64_t head = head_of(block);
    std::size_t size = size_of(head);
    std::uint64_t last = head & LAST_OF_REGION;
    m_free.remove(block, size);
    if (is_idle_region(block)) {
        m_idle -= size + REGION_OVERHEAD;
    }
    Block* after = successor(block, size);
    if (size - need >= MIN_BLOCK) {
        Block* rest = successor(block, need);
        set_head(rest, (size - need) | last);
        if (last == 0) {
            set_size_before(after, size - need);
        }
        m_free.insert(rest, size - need);
        size = need;
        last = 0;
    } else if (last == 0) {
        set_head(after, head_of(after) & ~PREVIOUS_FREE);
    }
    set_head(block, m_tag | size | last);
    m_live_shared += size;
}

// Makes a block free, joined with its free neighbours. It is not counted as live any more.
void HeapPart::coalesce(Block* block) {
    const std::uint64_t head = head_of(block);
    std::size_t size = size_of(head);
    std::uint64_t last = head & LAST_OF_REGION;
    forbid_access(block, size);  // the head too: where a block shrank, it was part of the payload
    set_head(block, size);       // no longer live, even if it is joined to its predecessor
    if (last == 0) {
        Block* after = successor(block, size);
        const std::uint64_t head_after = head_of(after);
        if (is_free(head_after)) {
            m_free.remove(after, size_of(head_after));
            size += size_of(head_after);
            last = head_after & LAST_OF_REGION;
        }
    }
    if ((head & PREVIOUS_FREE) != 0) {
        const std::size_t before = size_before(block);
        block = block_at(bytes_of(block) - before);
        m_free.remove(block, before);
        size += before;
    }
    set_head(block, size | last);
    if (last == 0) {
        Block* after = successor(block, size);
        set_size_before(after, size);
        set_head(after, head_of(after) | PREVIOUS_FREE);
    }
    m_free.insert(block, size);
    if (is_idle_region(block)) {
        keep_idle_region(block, size + REGION_OVERHEAD);
    }
}

bool HeapPart::resize_in_place(Block* block, std::size_t need) {
    std::uint64_t head = head_of(block);
    if (size_of(head) < need) {
        Block* after = successor(block, size_of(head));
        if (is_last(head) || !is_free(head_of(after)) || size_of(head) + size_of(head_of(after)) < need) {
            return false;
        }
        // The whole neighbour is taken; the excess is freed below.
        split(after, size_of(head_of(after)));
        const std::uint64_t joined = head_of(after);
        set_head(after, 0);
        head = (head + size_of(joined)) | (joined & LAST_OF_REGION);
        set_head(block, head);
    }
    const std::size_t rest = size_of(head) - need;
    if (rest >= MIN_BLOCK) {
        set_head(block, (head & ~(SIZE_BITS | LAST_OF_REGION)) | need);
        Block* tail = successor(block, need);
        set_head(tail, m_tag | rest | (head & LAST_OF_REGION));
        m_live_shared -= rest;
        coalesce(tail);
    }
    return true;
}

}  // namespace basalt::platform
