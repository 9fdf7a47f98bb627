#include "basalt/memory.h"
#include "src/memory/report_last_error.h"
#include "src/platform/heap.h"

namespace vex_lib {

vlWinHeapAllocator::vlWinHeapAllocator(unsigned long maximumSize) : m_heap(HeapCreate(0, 0, maximumSize)) {
    if (m_heap == nullptr) {
        ReportLastError();
    }
}

vlWinHeapAllocator::~vlWinHeapAllocator() {
    HeapDestroy(m_heap);
}

void* vlWinHeapAllocator::Alloc(std::uint64_t size) {
    void* block = HeapAlloc(m_heap, 0, size);
    if (block == nullptr) {
        ReportLastError();
    }
    return block;
}

void vlWinHeapAllocator::Free(void* block) {
    if (HeapFree(m_heap, 0, block) == 0) {
        ReportLastError();
    }
}

void* vlWinHeapAllocator::ReAlloc(void* block, std::uint64_t size) {
    return block == nullptr ? Alloc(size) : HeapReAlloc(m_heap, 0, block, size);
}

void vlWinHeapAllocator::Compact() {
    if (HeapCompact(m_heap, 0) == 0) {
        ReportLastError();
    }
}

void* vlWinHeapAllocator::Handle() const {
    return m_heap;
}

}  // namespace vex_lib
