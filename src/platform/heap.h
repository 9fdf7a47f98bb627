// Private heaps by their Win32 names.
//
// Blocks are aligned to 16 bytes and come from regions that the heap maps as it grows. Allocation takes
// constant time until no more can be mapped, freeing that of a binary search among the regions. In heaps
// without a limit or with one above 64 MiB, a block of 1 MiB or more has a mapping of its own, unmapped when
// it is freed. An unused heap costs one page.
//
// All calls: flags and options are 0. A null handle, or one that is plainly no heap, is ERROR_INVALID_HANDLE;
// a handle must not be used after HeapDestroy. The last error is set on failure only. Threads: thread-safe,
// and threads that allocate from a heap without a limit seldom wait for each other; HeapDestroy must be the
// last call on its heap.
#ifndef BASALT_SRC_PLATFORM_HEAP_H
#define BASALT_SRC_PLATFORM_HEAP_H

#include <cstddef>

#include "basalt/platform/types.h"

// A new heap, or null (ERROR_NOT_ENOUGH_MEMORY). maximumSize in bytes, rounded up to whole pages, limits what
// is mapped for blocks and their overhead; 0 sets no limit. initialSize is 0.
// Other systems refuse single blocks near and above 1 MiB from a heap with a limit; this one does not.
HANDLE HeapCreate(DWORD options, std::size_t initialSize, std::size_t maximumSize);

// Releases the heap and all its blocks. 1, or 0 for an invalid handle.
BOOL HeapDestroy(HANDLE heap);

// A block of at least size bytes (0 gives a block too), contents undefined, or null: out of memory or at the
// limit (ERROR_NOT_ENOUGH_MEMORY).
void* HeapAlloc(HANDLE heap, DWORD flags, std::size_t size);

// Resizes a block, perhaps to another address, contents kept up to the smaller size. Null on failure, with
// the block unchanged: ERROR_NOT_ENOUGH_MEMORY, or ERROR_INVALID_PARAMETER when it is no live block of this
// heap.
void* HeapReAlloc(HANDLE heap, DWORD flags, void* block, std::size_t size);

// 1 when the block is freed or null; 0 when it is no live block of this heap, freed twice for instance
// (ERROR_INVALID_PARAMETER; nothing changes), or the system refuses to unmap it (ERROR_NOT_ENOUGH_MEMORY; the
// block stays).
BOOL HeapFree(HANDLE heap, DWORD flags, void* block);

// Returns free memory to the system. The size in bytes of the largest free block; 0 on failure, or when there
// is no free block at all (the last error is ERROR_SUCCESS then, as Win32 documents it). A heap that was not
// used yet has no free block.
std::size_t HeapCompact(HANDLE heap, DWORD flags);

#endif
