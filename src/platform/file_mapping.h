// Mapping a file, or anonymous pages, into memory.
//
// Disk space is reserved when the mapping is made, so a full disk, a quota or a limit on file sizes is a
// failed call, never a signal later. A mapping has one view in its life: MapViewOfFile closes the file's
// descriptor, so mapped files use none. Threads: thread-safe; each handle and view is used by one thread at a
// time.
#ifndef BASALT_SRC_PLATFORM_FILE_MAPPING_H
#define BASALT_SRC_PLATFORM_FILE_MAPPING_H

#include <cstddef>

#include "basalt/platform/types.h"
#include "src/platform/file.h"
#include "src/platform/virtual_memory.h"

inline constexpr DWORD FILE_MAP_ALL_ACCESS = 0xF001F;

// A mapping of the first `size_low` bytes of a file that has none yet, which grows to that length if it is
// shorter (new bytes are zero), or of that many zero bytes of memory for INVALID_HANDLE_VALUE. `security` and
// `name` are null, `protection` is PAGE_READWRITE and `size_high` 0. Null on failure: ERROR_INVALID_PARAMETER
// for anonymous pages of size 0, ERROR_FILE_INVALID for a file and size 0, ERROR_INVALID_HANDLE,
// ERROR_DISK_FULL, ERROR_FILE_TOO_LARGE, ERROR_NOT_ENOUGH_MEMORY. The file may have grown.
HANDLE CreateFileMappingW(HANDLE file, SECURITY_ATTRIBUTES* security, DWORD protection, DWORD size_high,
                          DWORD size_low, const wchar_t* name);

// Maps the whole of a mapping, once: `access` is FILE_MAP_ALL_ACCESS, the offset 0, `size` the mapping's.
// Returns a page-aligned address; the rest of the last page reads as zero and is not written to the file.
// Null on failure: ERROR_INVALID_HANDLE, ERROR_NOT_ENOUGH_MEMORY.
void* MapViewOfFile(HANDLE mapping, DWORD access, DWORD offset_high, DWORD offset_low, std::size_t size);

// Unmaps a view by its address, even when its mapping and file are closed. 1, or 0: ERROR_INVALID_ADDRESS
// when there is no such view, ERROR_NOT_ENOUGH_MEMORY when the system refuses (the view stays).
BOOL UnmapViewOfFile(const void* address);

#endif
