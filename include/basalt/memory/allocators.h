/// @file
/// Allocators: the interface, private heaps and the process-wide shared heap.
///
/// Sizes are in bytes, blocks are aligned to 16. Nothing here throws: failures are null, and unless stated
/// otherwise each is reported to the debugger output (basalt/platform/error.h) as "ERROR:", the system's
/// message text for the thread's last error and "\n", in three pieces.
#ifndef BASALT_MEMORY_ALLOCATORS_H
#define BASALT_MEMORY_ALLOCATORS_H

#include <cstddef>
#include <cstdint>

#include "basalt/export.h"

namespace vex_lib {

/// The interface of every allocator.
class BASALT_API vlAllocator {
public:
    virtual ~vlAllocator() = 0;

    /// A block of at least `size` bytes, or null.
    virtual void* Alloc(std::uint64_t size) = 0;

    /// Frees a block of this allocator.
    virtual void Free(void* block) = 0;
};

/// Allocator over a private heap of its own. Destroying the object releases every block at once, without
/// visiting them.
///
/// The heap grows in regions that double it (up to 32 MiB each); blocks of 1 MiB and more have a mapping of
/// their own, unless the heap has a limit of up to 64 MiB, and are unmapped when freed. Regions without a
/// block in use are kept up to 32 MiB, and 2 MiB more for each further part; beyond that they are unmapped,
/// and Compact() unmaps the rest. Without a limit, further threads that allocate get parts of the heap (15 at
/// most) with a lock and regions of their own, so that they seldom wait for each other; any thread may free
/// any block.
///
/// Threads: thread-safe; destruction must be the last call.
class BASALT_API vlWinHeapAllocator : public vlAllocator {
public:
    /// Creates the heap. `maximumSize` (bytes, rounded up to whole pages) limits what it maps for its blocks
    /// and the 8 bytes of overhead of each; 0 sets no limit. All 64 bits count. A heap that cannot be created
    /// is reported; every later call then fails and is reported too. Any single block that fits under the
    /// limit is served; other systems refuse blocks near and above 1 MiB in heaps with a limit.
    explicit vlWinHeapAllocator(unsigned long maximumSize);

    ~vlWinHeapAllocator() override;

    /// The heap has one owner: copies are refused.
    vlWinHeapAllocator(const vlWinHeapAllocator&) = delete;
    vlWinHeapAllocator& operator=(const vlWinHeapAllocator&) = delete;

    /// A block of at least `size` bytes, contents undefined; a size of 0 gives a block too. Null, with a
    /// report, when out of memory or at the limit. Constant time except for growth.
    void* Alloc(std::uint64_t size) override;

    /// Frees a block; null does nothing. An address that is no live block of this heap (freed twice, foreign)
    /// is reported and ignored. Constant time except for unmapping.
    void Free(void* block) override;

    /// Resizes a block, perhaps to another address; contents are kept up to the smaller size. Null on
    /// failure, not reported, with the old block unchanged. A null block makes this the object's own Alloc().
    virtual void* ReAlloc(void* block, std::uint64_t size);

    /// Returns free memory to the system. Reported like a failure when there is no free block at all, as in a
    /// heap that was not used yet.
    void Compact();

    /// The heap's handle, null when it could not be created.
    void* Handle() const;

private:
    void* m_heap;
};

/// The process-wide shared heap, without limit, from the load of the library to its unload or the end of the
/// process, which releases every block; threads that use it must have ended by then. Objects of derived
/// classes are allocated on it: `new` returns null, and no constructor runs, when out of memory. Placement of
/// such a class needs the global `new`. Threads: thread-safe.
class BASALT_API vlSharedMemoryHeap {
public:
    /// As Alloc().
    static void* operator new(std::size_t size) noexcept;
    /// The same; file and line are ignored.
    static void* operator new(std::size_t size, const char* file, int line) noexcept;

    /// As Free().
    static void operator delete(void* block) noexcept;
    /// The same; file and line are ignored.
    static void operator delete(void* block, const char* file, int line) noexcept;

    /// vlWinHeapAllocator::Alloc() of the shared heap.
    static void* Alloc(std::size_t size);
    /// vlWinHeapAllocator::Free() of the shared heap.
    static void Free(void* block);
    /// vlWinHeapAllocator::Compact() of the shared heap.
    static void Compact();
    /// The shared heap's handle.
    static void* GetHeapHandle();

private:
    static vlWinHeapAllocator m_heap;
};

}  // namespace vex_lib

#endif
