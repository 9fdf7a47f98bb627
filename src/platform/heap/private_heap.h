// A private heap: parts with a lock each, so that threads seldom wait for each other.
#ifndef BASALT_SRC_PLATFORM_HEAP_PRIVATE_HEAP_H
#define BASALT_SRC_PLATFORM_HEAP_PRIVATE_HEAP_H

#include <array>
#include <atomic>
#include <cstddef>
#include <cstdint>

#include "src/platform/heap/part.h"

namespace basalt::platform {

// The record has pages of its own; a handle is its address. The first part is in the record and serves the
// first thread, and every thread of a heap with a maximum; the others are made when further threads allocate,
// and threads of equal hash share one. A block is freed by any thread: the thread's part is searched first.
// Threads: thread-safe except create() and destroy().
class PrivateHeap {
public:
    // At most so many bytes are mapped for blocks (a multiple of the page size, 0 for no limit).
    // Null when out of memory.
    static PrivateHeap* create(std::size_t maximum);

    // Null for a handle that is plainly no heap: null, not page-aligned, not a record.
    static PrivateHeap* from_handle(void* handle);

    // Unmaps every part and the record.
    void destroy();

    // A block of at least size bytes, 16-byte aligned, or null.
    void* allocate(std::size_t size) {
        HeapPart* const own = own_part();
        void* const block = (own != nullptr ? *own : make_part()).allocate(size);
        return block != nullptr || m_has_maximum ? block : allocate_anywhere(size);
    }

    // Frees a block. Error code: ERROR_INVALID_PARAMETER for anything but null and a live block of this heap.
    DWORD release(void* payload);

    // The block in its new size, perhaps at another address, contents kept up to the smaller size. On failure
    // null with the error code set; the block is unchanged.
    void* resize(void* payload, std::size_t size, DWORD& error);

    // Returns free memory to the system. Size of the largest free block, 0 without any.
    std::size_t compact();

private:
    friend class HeapInspection;

    static constexpr std::size_t FURTHER_PARTS = 15;

    explicit PrivateHeap(std::size_t maximum);
    ~PrivateHeap() = default;

    // The address of a thread's control block. A later thread may have it again, and with it the part.
    static std::uintptr_t this_thread() {
        return reinterpret_cast<std::uintptr_t>(__builtin_thread_pointer());
    }

    std::atomic<HeapPart*>& place_of(std::uintptr_t thread) {
        const std::uint64_t hash = (std::uint64_t{thread} >> 6) * 0x9E37'79B9'7F4A'7C15;
        return m_further[(hash >> 32) % FURTHER_PARTS];
    }

    // The thread's part, null while it has none.
    HeapPart* own_part() {
        const std::uintptr_t thread = this_thread();
        return m_has_maximum || m_first_thread.load(std::memory_order_relaxed) == thread
                   ? &m_first
                   : place_of(thread).load(std::memory_order_acquire);
    }

    HeapPart& make_part();
    void* allocate_anywhere(std::size_t size);
    template <class Visit>
    void for_each_part(Visit visit);

    // Read by all threads; the first part, which its thread writes, has cache lines of its own.
    std::uint64_t m_magic;
    const bool m_has_maximum;
    std::atomic<std::uintptr_t> m_first_thread{0};
    std::array<std::atomic<HeapPart*>, FURTHER_PARTS> m_further{};
    alignas(64) HeapPart m_first;
};

}  // namespace basalt::platform

#endif
