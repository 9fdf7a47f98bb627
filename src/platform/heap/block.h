// The block of a private heap: a head of one word, then the payload.
//
//     head | payload ...                          live
//     head | next | prev | unused ... | size      free
//     head | next | unused ...                    freed, in a quick list
//
// A head lies 8 bytes before a multiple of 16, so payloads are 16-byte aligned. Blocks fill a region without
// gaps, and no two neighbours are both free. The size at the end of a free block lets its successor find its
// start; the last block of a region stores none, so that the far end of a new region is not touched.
#ifndef BASALT_SRC_PLATFORM_HEAP_BLOCK_H
#define BASALT_SRC_PLATFORM_HEAP_BLOCK_H

#include <cstddef>
#include <cstdint>

#include "src/platform/heap/sanitizer.h"

namespace basalt::platform {

struct Block;

inline constexpr std::size_t BLOCK_ALIGNMENT = 16;
inline constexpr std::size_t HEAD_BYTES = 8;
inline constexpr std::size_t MIN_BLOCK = 32;
// Of a region, besides its blocks: 8 bytes before the first head, 8 after the last payload.
inline constexpr std::size_t REGION_OVERHEAD = 16;
// Far beyond any address space, far below overflow.
inline constexpr std::size_t MAX_REQUEST = std::size_t{1} << 46;

// A head: flags in the low four bits, the size of the whole block (a multiple of 16), and in the top 16 bits
// the heap's tag while the block is live, 0 while it is free, QUICK_TAG in a quick list.
inline constexpr std::uint64_t PREVIOUS_FREE = 1;
inline constexpr std::uint64_t LAST_OF_REGION = 2;
inline constexpr std::uint64_t SIZE_BITS = 0x0000'FFFF'FFFF'FFF0;
inline constexpr std::uint64_t TAG_BITS = 0xFFFF'0000'0000'0000;
inline constexpr std::uint64_t LIVE_BIT = 0x0001'0000'0000'0000;  // set in the tag of every heap
inline constexpr std::uint64_t QUICK_TAG = 0x0002'0000'0000'0000;

inline std::size_t size_of(std::uint64_t head) {
    return head & SIZE_BITS;
}
inline bool is_free(std::uint64_t head) {
    return (head & TAG_BITS) == 0;
}
inline bool is_last(std::uint64_t head) {
    return (head & LAST_OF_REGION) != 0;
}

// Size of the block for a request, 0 when it is too large.
inline std::size_t block_size_for(std::size_t request) {
    if (request > MAX_REQUEST) {
        return 0;
    }
    const std::size_t size =
        (request + HEAD_BYTES + GUARD_BYTES + BLOCK_ALIGNMENT - 1) & ~(BLOCK_ALIGNMENT - 1);
    return size < MIN_BLOCK ? MIN_BLOCK : size;
}

inline std::byte* bytes_of(Block* block) {
    return reinterpret_cast<std::byte*>(block);
}
inline void* payload_of(Block* block) {
    return bytes_of(block) + HEAD_BYTES;
}
inline Block* block_at(std::byte* head) {
    return reinterpret_cast<Block*>(head);
}
inline Block* block_of(void* payload) {
    return block_at(static_cast<std::byte*>(payload) - HEAD_BYTES);
}
inline Block* successor(Block* block, std::size_t size) {
    return block_at(bytes_of(block) + size);
}

// Access to the words of a block, which are poisoned for all other code under the address sanitizer.
[[gnu::no_sanitize_address]] inline std::uint64_t head_of(const Block* block) {
    return *reinterpret_cast<const std::uint64_t*>(block);
}
[[gnu::no_sanitize_address]] inline void set_head(Block* block, std::uint64_t head) {
    *reinterpret_cast<std::uint64_t*>(block) = head;
}
[[gnu::no_sanitize_address]] inline Block* next_of(const Block* block) {
    return reinterpret_cast<Block* const*>(block)[1];
}
[[gnu::no_sanitize_address]] inline void set_next(Block* block, Block* next) {
    reinterpret_cast<Block**>(block)[1] = next;
}
[[gnu::no_sanitize_address]] inline Block* prev_of(const Block* block) {
    return reinterpret_cast<Block* const*>(block)[2];
}
[[gnu::no_sanitize_address]] inline void set_prev(Block* block, Block* prev) {
    reinterpret_cast<Block**>(block)[2] = prev;
}
[[gnu::no_sanitize_address]] inline std::uint64_t size_before(const Block* block) {
    return reinterpret_cast<const std::uint64_t*>(block)[-1];
}
[[gnu::no_sanitize_address]] inline void set_size_before(Block* block, std::uint64_t size) {
    reinterpret_cast<std::uint64_t*>(block)[-1] = size;
}

}  // namespace basalt::platform

#endif
