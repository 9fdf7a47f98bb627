#include "src/memory/allocators.h"

#include <cstdlib>

#include "basalt/platform/error.h"
#include "src/platform/error_message.h"
#include "src/platform/heap.h"

namespace vex_lib {

void ReportLastError() {
    const DWORD code = GetLastError();
    wchar_t* message = nullptr;
    FormatMessageW(
        FORMAT_MESSAGE_ALLOCATE_BUFFER | FORMAT_MESSAGE_FROM_SYSTEM | FORMAT_MESSAGE_IGNORE_INSERTS, nullptr,
        code, 0, &message, 0, nullptr);
    OutputDebugStringW(L"ERROR:");
    OutputDebugStringW(message != nullptr ? message : L"");
    OutputDebugStringW(L"\n");
    LocalFree(message);
    // The calls above, the host's handler among them, may have set another.
    SetLastError(code);
}

vlAllocator::~vlAllocator() = default;

vlHeapAllocator::~vlHeapAllocator() = default;

void* vlHeapAllocator::Alloc(std::uint64_t size) {
    return std::malloc(size);
}

void vlHeapAllocator::Free(void* block) {
    std::free(block);
}

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

void* vlSharedMemoryHeap::operator new(std::size_t size) noexcept {
    return m_heap.Alloc(size);
}

void* vlSharedMemoryHeap::operator new(std::size_t size, const char*, int) noexcept {
    return m_heap.Alloc(size);
}

void vlSharedMemoryHeap::operator delete(void* block) noexcept {
    m_heap.Free(block);
}

void vlSharedMemoryHeap::operator delete(void* block, const char*, int) noexcept {
    m_heap.Free(block);
}

void* vlSharedMemoryHeap::Alloc(std::size_t size) {
    return m_heap.Alloc(size);
}

void vlSharedMemoryHeap::Free(void* block) {
    m_heap.Free(block);
}

void vlSharedMemoryHeap::Compact() {
    m_heap.Compact();
}

void* vlSharedMemoryHeap::GetHeapHandle() {
    return m_heap.Handle();
}

}  // namespace vex_lib
