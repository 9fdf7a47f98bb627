// The folder for temporary files.
#ifndef BASALT_SRC_PLATFORM_TEMPORARY_FOLDER_H
#define BASALT_SRC_PLATFORM_TEMPORARY_FOLDER_H

#include "basalt/platform/types.h"

inline constexpr DWORD MAX_PATH = 260;  // characters, the terminator included

// The folder for temporary files, with a `/` at its end: TMPDIR, or /tmp when that is unset or empty, asked
// anew at each call. Whether it exists is not looked at.
// The length without the terminator; when `length` characters do not hold it, the length needed with the
// terminator, and the buffer is as it was; 0 on failure (ERROR_NOT_ENOUGH_MEMORY).
// Threads: thread-safe, as long as nobody changes the environment.
DWORD GetTempPathW(DWORD length, wchar_t* buffer);

#endif
