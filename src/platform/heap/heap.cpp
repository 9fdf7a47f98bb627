#include "src/platform/heap.h"

#include "src/platform/heap/private_heap.h"
#include "src/platform/pages.h"

using basalt::platform::PrivateHeap;
using basalt::platform::whole_pages;

namespace {

// The heap, or null with the last error set for an invalid handle.
PrivateHeap* checked(HANDLE handle) {
    PrivateHeap* heap = PrivateHeap::from_handle(handle);
    if (heap == nullptr) {
        SetLastError(ERROR_INVALID_HANDLE);
    }
    return heap;
}

}  // namespace

HANDLE HeapCreate(DWORD /*options*/, std::size_t /*initialSize*/, std::size_t maximumSize) {
    // Within a page of 2^64 this is 0: no limit, which is as good.
    PrivateHeap* heap = PrivateHeap::create(whole_pages(maximumSize));
    if (heap == nullptr) {
        SetLastError(ERROR_NOT_ENOUGH_MEMORY);
    }
    return heap;
}

BOOL HeapDestroy(HANDLE heap) {
    PrivateHeap* valid = checked(heap);
    if (valid == nullptr) {
        return 0;
    }
    valid->destroy();
    return 1;
}

void* HeapAlloc(HANDLE heap, DWORD /*flags*/, std::size_t size) {
    PrivateHeap* valid = checked(heap);
    if (valid == nullptr) {
        return nullptr;
    }
    void* block = valid->allocate(size);
    if (block == nullptr) {
        SetLastError(ERROR_NOT_ENOUGH_MEMORY);
    }
    return block;
}

void* HeapReAlloc(HANDLE heap, DWORD /*flags*/, void* block, std::size_t size) {
    PrivateHeap* valid = checked(heap);
    if (valid == nullptr) {
        return nullptr;
    }
    DWORD error = ERROR_SUCCESS;
    void* resized = valid->resize(block, size, error);
    if (resized == nullptr) {
        SetLastError(error);
    }
    return resized;
}

BOOL HeapFree(HANDLE heap, DWORD /*flags*/, void* block) {
    PrivateHeap* valid = checked(heap);
    if (valid == nullptr) {
        return 0;
    }
    const DWORD error = valid->release(block);
    if (error != ERROR_SUCCESS) {
        SetLastError(error);
        return 0;
    }
    return 1;
}

std::size_t HeapCompact(HANDLE heap, DWORD /*flags*/) {
    PrivateHeap* valid = checked(heap);
    if (valid == nullptr) {
        return 0;
    }
    const std::size_t largest = valid->compact();
    if (largest == 0) {
        SetLastError(ERROR_SUCCESS);
    }
    return largest;
}
