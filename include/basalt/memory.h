/// @file
/// Allocators: the interface, private heaps and the process-wide shared heap.
#ifndef BASALT_MEMORY_H
#define BASALT_MEMORY_H

#include <cstddef>
#include <cstdint>

#include "basalt/export.h"

namespace vex_lib {

/// What every allocator offers.
class BASALT_API vlAllocator {
public:
    virtual ~vlAllocator() = 0;
    virtual void* Alloc(std::uint64_t size) = 0;
    virtual void Free(void* block) = 0;
};

/// Allocator over a private heap of its own, which goes as a whole with the object.
class BASALT_API vlWinHeapAllocator : public vlAllocator {
public:
    explicit vlWinHeapAllocator(unsigned long maximumSize);
    ~vlWinHeapAllocator() override;
    vlWinHeapAllocator(const vlWinHeapAllocator&) = delete;
    vlWinHeapAllocator& operator=(const vlWinHeapAllocator&) = delete;

    void* Alloc(std::uint64_t size) override;
    void Free(void* block) override;
    virtual void* ReAlloc(void* block, std::uint64_t size);
    void Compact();
    void* Handle() const;

private:
    void* m_heap;
};

/// The process-wide shared heap. Objects of derived classes are placed on it.
class BASALT_API vlSharedMemoryHeap {
public:
    static void* operator new(std::size_t size) noexcept;
    static void* operator new(std::size_t size, const char* file, int line) noexcept;
    static void operator delete(void* block) noexcept;
    static void operator delete(void* block, const char* file, int line) noexcept;
    static void* Alloc(std::size_t size);
    static void Free(void* block);
    static void Compact();
    static void* GetHeapHandle();

private:
    static vlWinHeapAllocator m_heap;
};

}  // namespace vex_lib

#endif
