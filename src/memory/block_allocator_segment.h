// A segment of the block allocator (one file and its blocks) and the index of all segments by address.
#ifndef BASALT_SRC_MEMORY_BLOCK_ALLOCATOR_SEGMENT_H
#define BASALT_SRC_MEMORY_BLOCK_ALLOCATOR_SEGMENT_H

#include <algorithm>
#include <cstddef>
#include <cstdint>

#include "basalt/memory/block_allocator.h"
#include "src/platform/file.h"

namespace vex_lib {

struct vlVmAllocator::MemoryMappedFile {
    HANDLE file = nullptr;
    HANDLE mapping = nullptr;
    void* view = nullptr;
};

// Blocks are numbered by their position in the view. Those below `carved` have been allocated at least once;
// of these, `free_count` are free, on a stack.
//
// State is kept in chunks, allocated as carving proceeds: a bit for each block, set while it is in use, in
// words of 32, then as many places of the stack as there are blocks.
struct vlVmAllocator::Segment {
    static constexpr std::uint32_t CHUNK_BLOCKS = 1U << 14;

    Segment* next = nullptr;  // links of the list that holds it
    Segment* previous = nullptr;
    char* base;
    std::uint32_t block_count;  // of the view
    std::uint32_t carved = 0;
    std::uint32_t free_count = 0;
    std::uint32_t chunk_count = 0;
    MemoryMappedFile* file;

    Segment(MemoryMappedFile* its_file, std::uint32_t count)
        : base(static_cast<char*>(its_file->view)), block_count(count), file(its_file) {}

    static void push_front(Segment*& list, Segment* segment) {
        segment->previous = nullptr;
        segment->next = list;
        if (list != nullptr) {
            list->previous = segment;
        }
        list = segment;
    }
    static void unlink(Segment*& list, Segment* segment) {
        (segment->previous != nullptr ? segment->previous->next : list) = segment->next;
        if (segment->next != nullptr) {
            segment->next->previous = segment->previous;
        }
    }

    // The record is followed by a pointer to each chunk.
    static std::size_t record_bytes(std::uint32_t block_count) {
        const std::size_t chunks = (std::size_t{block_count} + CHUNK_BLOCKS - 1) / CHUNK_BLOCKS;
        return sizeof(Segment) + chunks * sizeof(std::uint32_t*);
    }
    std::uint32_t** chunks() { return reinterpret_cast<std::uint32_t**>(this + 1); }

    // Every chunk is as large as the first.
    std::uint32_t chunk_blocks() const { return std::min(block_count, CHUNK_BLOCKS); }
    std::size_t bit_words() const { return (chunk_blocks() + 31) / 32; }
    std::size_t chunk_bytes() const { return (bit_words() + chunk_blocks()) * sizeof(std::uint32_t); }

    bool is_full() const { return free_count == 0 && carved == block_count; }
    bool is_unused() const { return free_count == carved; }
    bool needs_chunk() const {
        return free_count == 0 && carved == std::uint64_t{chunk_count} * CHUNK_BLOCKS;
    }

    std::uint32_t& bits_of(std::uint32_t block) {
        return chunks()[block / CHUNK_BLOCKS][block % CHUNK_BLOCKS / 32];
    }
    std::uint32_t& stack_place(std::uint32_t depth) {
        return chunks()[depth / CHUNK_BLOCKS][bit_words() + depth % CHUNK_BLOCKS];
    }

    // Allocates a block; the segment is not full and needs no chunk.
    std::uint32_t take() {
        if (free_count != 0) {
            const std::uint32_t block = stack_place(--free_count);
            bits_of(block) |= 1U << block % 32;
            return block;
        }
        const std::uint32_t block = carved++;
        // The first block of a word also clears the bits of the following ones.
        bits_of(block) = (block % 32 == 0 ? 0 : bits_of(block)) | 1U << block % 32;
        return block;
    }

    // Frees a block; false when it is not in use.
    bool give_back(std::uint32_t block) {
        const std::uint32_t bit = 1U << block % 32;
        if (block >= carved || (bits_of(block) & bit) == 0) {
            return false;
        }
        bits_of(block) &= ~bit;
        stack_place(free_count++) = block;
        return true;
    }
};

// All segments in the order of their addresses; the record is followed by `capacity` entries.
struct vlVmAllocator::SegmentIndex {
    struct Entry {
        std::uintptr_t base;
        Segment* segment;
    };
    std::size_t count = 0;
    std::size_t capacity;

    explicit SegmentIndex(std::size_t most) : capacity(most) {}

    static std::size_t record_bytes(std::size_t capacity) {
        return sizeof(SegmentIndex) + capacity * sizeof(Entry);
    }
    Entry* begin() { return reinterpret_cast<Entry*>(this + 1); }
    Entry* end() { return begin() + count; }

    void insert(Segment* segment) {
        const Entry entry = {reinterpret_cast<std::uintptr_t>(segment->base), segment};
        Entry* const place = std::lower_bound(begin(), end(), entry,
                                              [](const Entry& a, const Entry& b) { return a.base < b.base; });
        std::copy_backward(place, end(), end() + 1);
        *place = entry;
        ++count;
    }
};

}  // namespace vex_lib

#endif
