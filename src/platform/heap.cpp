#include "src/platform/heap.h"

#include <cstdlib>
HANDLE HeapCreate(DWORD, std::size_t, std::size_t) { return std::malloc(1); }
BOOL HeapDestroy(HANDLE heap) { std::free(heap); return 1; }
void* HeapAlloc(HANDLE, DWORD, std::size_t size) { return std::malloc(size); }
void* HeapReAlloc(HANDLE, DWORD, void* block, std::size_t size) { return std::realloc(block, size); }
BOOL HeapFree(HANDLE, DWORD, void* block) { std::free(block); return 1; }
std::size_t HeapCompact(HANDLE, DWORD) { return 0; }
