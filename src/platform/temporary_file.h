// The folder for temporary files, and new names in it.
#ifndef BASALT_SRC_PLATFORM_TEMPORARY_FILE_H
#define BASALT_SRC_PLATFORM_TEMPORARY_FILE_H

#include "basalt/platform/types.h"

inline constexpr DWORD MAX_PATH = 260;  // characters, the terminator included

// The folder for temporary files, with a separator at its end: TMPDIR, or /tmp when that is unset or empty,
// asked anew at each call. Whether it exists is not looked at.
// The length without the terminator; when `length` characters do not hold it, the length needed with the
// terminator, and the buffer is as it was; 0 on failure (ERROR_NOT_ENOUGH_MEMORY).
// Threads: thread-safe, as long as nobody changes the environment.
DWORD GetTempPathW(DWORD length, wchar_t* buffer);

// Creates a new, empty file that only this user may open, and closes it. Its name is the folder, a separator
// where that has none, up to three characters of the prefix, a number in up to four hexadecimal digits and
// ".tmp". `unique` must be 0.
// The number, never 0, with the full name in `name` (MAX_PATH characters); 0 on failure, the buffer as it
// was: ERROR_FILE_EXISTS when all 65,535 numbers are taken, ERROR_FILENAME_EXCED_RANGE when the name would
// not fit (a folder of more than MAX_PATH - 14 characters), and as for CreateFileW. Threads: thread-safe;
// files made at the same time have different names.
UINT GetTempFileNameW(const wchar_t* folder, const wchar_t* prefix, UINT unique, wchar_t* name);

#endif
