// Private heaps: HeapCreate and its family, by their published names.
#ifndef BASALT_SRC_PLATFORM_HEAP_H
#define BASALT_SRC_PLATFORM_HEAP_H

#include <cstddef>

#include "basalt/platform/types.h"

HANDLE HeapCreate(DWORD options, std::size_t initialSize, std::size_t maximumSize);
BOOL HeapDestroy(HANDLE heap);
void* HeapAlloc(HANDLE heap, DWORD flags, std::size_t size);
void* HeapReAlloc(HANDLE heap, DWORD flags, void* block, std::size_t size);
BOOL HeapFree(HANDLE heap, DWORD flags, void* block);
std::size_t HeapCompact(HANDLE heap, DWORD flags);

#endif
