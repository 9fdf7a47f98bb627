// Handles of files and mappings, and closing them.
//
// A handle is a number of 32 bits, a multiple of 4, and is not given out again for a very long time, so that
// one used after its object was closed is told apart: ERROR_INVALID_HANDLE, like any other wrong handle.
// Threads: different handles are independent; one handle is used by one thread at a time.
#ifndef BASALT_SRC_PLATFORM_HANDLE_H
#define BASALT_SRC_PLATFORM_HANDLE_H

#include <cstdint>

#include "basalt/platform/types.h"

// What CreateFileW and FindFirstFileW answer on failure; other calls answer null.
inline const HANDLE INVALID_HANDLE_VALUE = reinterpret_cast<HANDLE>(~std::uintptr_t{0});

// Never made: only the default, null, is known here.
struct SECURITY_ATTRIBUTES;

// Closes a file or a mapping. A file opened delete-on-close is deleted now; a view stays until it is
// unmapped, and until then its file stays locked. 1, or 0 for what is no such handle (ERROR_INVALID_HANDLE),
// a search among them, which FindClose closes.
BOOL CloseHandle(HANDLE handle);

#endif
