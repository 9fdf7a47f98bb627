// Temporary files under new names.
#ifndef BASALT_SRC_PLATFORM_TEMPORARY_FILE_H
#define BASALT_SRC_PLATFORM_TEMPORARY_FILE_H

#include "basalt/platform/types.h"
#include "src/platform/temporary_folder.h"

// Creates a new, empty file that only this user may open, and closes it. Its name is the folder, a separator
// where that has none, up to three characters of the prefix, a number in up to four hexadecimal digits and
// ".tmp". `unique` must be 0.
// The number, never 0, with the full name in `name` (MAX_PATH characters); 0 on failure, the buffer as it
// was: ERROR_FILE_EXISTS when all 65,535 numbers are taken, ERROR_FILENAME_EXCED_RANGE when the name would
// not fit (a folder of more than MAX_PATH - 14 characters), and as for CreateFileW.
// Threads: thread-safe; files made at the same time have different names.
UINT GetTempFileNameW(const wchar_t* folder, const wchar_t* prefix, UINT unique, wchar_t* name);

namespace basalt::platform {

// Deletes the temporary files with this prefix that killed processes left in a folder: regular files of this
// user, no links, not written for a minute and not open in any process. Reads at most 65,536 entries; errors
// are ignored.
void delete_abandoned_files(const wchar_t* folder, const wchar_t* prefix) noexcept;

}  // namespace basalt::platform

#endif
