// Private heaps, by the platform's published names.
//
// A heap hands out blocks aligned to 16 bytes from regions that it maps as it grows. The cost of taking
// and freeing does not depend on how many blocks there are; 1 MiB and more is mapped for each block alone
// and goes back to the system when freed. An unused heap costs one page.
//
// Common to all calls: flags and options must be 0, anything else is ERROR_INVALID_PARAMETER. A null
// handle, or one that is plainly no heap, is ERROR_INVALID_HANDLE; a handle after HeapDestroy must not be
// used. The last error is set on failure only. Threads: each heap serialises itself; HeapDestroy must be
// the last call on its heap.
#ifndef BASALT_SRC_PLATFORM_HEAP_H
#define BASALT_SRC_PLATFORM_HEAP_H

#include <cstddef>

#include "basalt/platform/types.h"

// A new heap, or null (ERROR_NOT_ENOUGH_MEMORY). maximumSize in bytes, rounded up to whole pages, limits
// what is mapped for blocks with all it takes to manage them; 0 sets no limit. initialSize is not taken
// in advance; it must not exceed a limit (ERROR_INVALID_PARAMETER).
// Other systems refuse single blocks near and above 1 MiB from a heap with a limit; this one does not.
HANDLE HeapCreate(DWORD options, std::size_t initialSize, std::size_t maximumSize);

// Releases the heap with every block still taken from it. 1, or 0 for an invalid handle.
BOOL HeapDestroy(HANDLE heap);

// A block of at least size bytes (0 gives a block too), contents undefined, or null: the system has no
// memory or the limit is reached (ERROR_NOT_ENOUGH_MEMORY).
void* HeapAlloc(HANDLE heap, DWORD flags, std::size_t size);

// The block with room for size bytes, perhaps at another address, contents kept up to the smaller size.
// Null on failure, and the block stays as it is: ERROR_NOT_ENOUGH_MEMORY, or ERROR_INVALID_PARAMETER when
// it is null or no live block of this heap.
void* HeapReAlloc(HANDLE heap, DWORD flags, void* block, std::size_t size);

// 1 when the block is freed or null; 0 when it is no live block of this heap, freed twice for instance
// (ERROR_INVALID_PARAMETER; the heap is unharmed), or the system refuses to unmap it
// (ERROR_NOT_ENOUGH_MEMORY; the block stays).
BOOL HeapFree(HANDLE heap, DWORD flags, void* block);

// Gives what free memory holds back to the system and answers the size in bytes of the largest free
// block; 0 on failure, or when there is no free block at all (the last error is ERROR_SUCCESS then, as
// published). A heap from which nothing was taken yet has no free block.
std::size_t HeapCompact(HANDLE heap, DWORD flags);

#endif
