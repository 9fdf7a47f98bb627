/// @file
/// Allocators: the interface, private heaps and the process-wide shared heap.
///
/// Sizes are in bytes, blocks are aligned to 16. Nothing here throws: failures are null, and unless said
/// otherwise each is reported to the debugger output (basalt/platform/error.h) as "ERROR:", the system's
/// message text for the thread's last error and "\n", in three pieces.
#ifndef BASALT_MEMORY_ALLOCATORS_H
#define BASALT_MEMORY_ALLOCATORS_H

#include <cstddef>
#include <cstdint>

#include "basalt/export.h"

namespace vex_lib {

/// What every allocator offers.
class BASALT_API vlAllocator {
public:
    virtual ~vlAllocator() = 0;

    /// A block of at least `size` bytes, or null.
    virtual void* Alloc(std::uint64_t size) = 0;

    /// Frees a block of this allocator.
    virtual void Free(void* block) = 0;
};

/// Allocator over a private heap of its own. Destroying the object releases every block still taken at
/// once, without a visit to any of them.
///
/// The heap grows in regions that double it (up to 32 MiB each); blocks of 1 MiB and more are mapped alone
/// and go back to the system when freed. Regions that become wholly free are kept for the next use up to
/// 32 MiB; beyond that they go back, and Compact() gives back the rest.
/// Threads: thread-safe; destruction must be the last call.
class BASALT_API vlWinHeapAllocator : public vlAllocator {
public:
    /// Creates the heap. `maximumSize` (bytes, rounded up to whole pages) limits what it takes from the
    /// system for its blocks with the 8 bytes each costs; 0 sets no limit. All 64 bits count.
    /// When the heap cannot be created this is reported, and every later call fails and is reported too.
    /// A limit does not restrict the size of single blocks beyond what fits; other systems refuse blocks
    /// near and above 1 MiB in heaps with a limit.
    explicit vlWinHeapAllocator(unsigned long maximumSize);

    ~vlWinHeapAllocator() override;

    /// The heap has one owner: copies are refused.
    vlWinHeapAllocator(const vlWinHeapAllocator&) = delete;
    vlWinHeapAllocator& operator=(const vlWinHeapAllocator&) = delete;

    /// A block of at least `size` bytes, contents undefined; 0 gives a block of its own as well. Null, with
    /// a report, when the system has no memory or the limit is reached. Constant time, growth aside.
    void* Alloc(std::uint64_t size) override;

    /// Frees a block; null does nothing. What is no live block of this heap (freed twice, foreign) is
    /// reported and leaves the heap unharmed. Constant time, but for giving regions back.
    void Free(void* block) override;

    /// The block with room for `size` bytes, perhaps elsewhere, contents kept up to the smaller size. Null
    /// on failure, unreported, with the old block as it was. A null block makes this the object's own Alloc.
    virtual void* ReAlloc(void* block, std::uint64_t size);

    /// Gives what free memory holds back to the system. Reported like a failure when there is no free block
    /// at all, as in a heap from which nothing was taken yet.
    void Compact();

    /// The heap's handle, null when it could not be created.
    void* Handle() const;

private:
    void* m_heap;
};

/// The process-wide shared heap, without limit, from the library's load to its unload; blocks still taken
/// then go with it, at the end of a process too: threads that use it have ended by then. Objects of derived
/// classes are placed on it: `new` gives null, and no constructor runs, when it is exhausted. Placement of
/// such a class needs the global operator, named with its scope. Threads: thread-safe.
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
