// Address space, and memory in it, by the Win32 names.
//
// A range is reserved first, which takes address space only; its pages are committed and decommitted as
// needed. Committed pages read as zero at first, also after a decommit; reserved ones are not accessible.
// Committed memory counts against the system's limit at once, where it has one. Threads: thread-safe; calls
// on one range must not overlap in time.
#ifndef BASALT_SRC_PLATFORM_VIRTUAL_MEMORY_H
#define BASALT_SRC_PLATFORM_VIRTUAL_MEMORY_H

#include <cstddef>

#include "basalt/platform/types.h"

inline constexpr DWORD MEM_COMMIT = 0x1000;
inline constexpr DWORD MEM_RESERVE = 0x2000;
inline constexpr DWORD MEM_DECOMMIT = 0x4000;
inline constexpr DWORD MEM_RELEASE = 0x8000;

inline constexpr DWORD PAGE_NOACCESS = 0x01;
inline constexpr DWORD PAGE_READWRITE = 0x04;

// MEM_RESERVE with PAGE_NOACCESS: reserves at least `size` bytes, for a null address anywhere, else from the
// address rounded down to a multiple of 64 KiB; reservations start at such multiples. MEM_COMMIT with
// PAGE_READWRITE: commits every page that holds a byte of the range, which lies within one reservation; pages
// already committed keep their contents. A null address reserves the range first. No other combination
// occurs, and sizes are below half the address space. The base of the pages, or null: ERROR_INVALID_PARAMETER
// for size 0, ERROR_INVALID_ADDRESS for a range that is taken or, to commit, not reserved,
// ERROR_NOT_ENOUGH_MEMORY.
void* VirtualAlloc(void* address, std::size_t size, DWORD type, DWORD protection);

// MEM_DECOMMIT with a size: gives back every page that holds a byte of the range, which lies within one
// reservation and stays reserved. MEM_RELEASE with size 0: gives the whole reservation at this base back.
// 1, or 0: ERROR_INVALID_ADDRESS for a range or base that is not reserved, ERROR_NOT_ENOUGH_MEMORY when the
// system refuses (the pages are as they were).
BOOL VirtualFree(void* address, std::size_t size, DWORD type);

#endif
