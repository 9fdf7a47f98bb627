#include "basalt/memory.h"
#include "src/platform/heap.h"
namespace vex_lib {
vlAllocator::~vlAllocator() = default;
vlWinHeapAllocator::vlWinHeapAllocator(unsigned long m) : m_heap(HeapCreate(0, 0, m)) {}
vlWinHeapAllocator::~vlWinHeapAllocator() { HeapDestroy(m_heap); }
void* vlWinHeapAllocator::Alloc(std::uint64_t size) { return HeapAlloc(m_heap, 0, size); }
void vlWinHeapAllocator::Free(void* block) { HeapFree(m_heap, 0, block); }
void* vlWinHeapAllocator::ReAlloc(void* block, std::uint64_t size) { return block ? HeapReAlloc(m_heap, 0, block, size) : Alloc(size); }
void vlWinHeapAllocator::Compact() { HeapCompact(m_heap, 0); }
void* vlWinHeapAllocator::Handle() const { return m_heap; }
}
