// Files: opening without sharing, deleting, temporary files; handles.
//
// File names are UTF-8 on the disk, whatever the locale; a byte that is not becomes the value 0xDC00 plus the
// byte, which leads back to it. Both separators work; links in a path are followed.
//
// An open file is locked against every other open and delete of this layer, in this process and in others,
// until it is closed and its views are unmapped. The lock is the system's advisory lock on the open file: it
// goes with a process that is killed, and programs that do not use it are not kept out. Threads: thread-safe;
// one handle is used by one thread at a time.
#ifndef BASALT_SRC_PLATFORM_FILE_H
#define BASALT_SRC_PLATFORM_FILE_H

#include <cstdint>

#include "basalt/platform/types.h"

inline constexpr DWORD GENERIC_READ = 0x80000000;
inline constexpr DWORD GENERIC_WRITE = 0x40000000;

inline constexpr DWORD CREATE_NEW = 1;
inline constexpr DWORD OPEN_EXISTING = 3;

inline constexpr DWORD FILE_ATTRIBUTE_HIDDEN = 0x2;  // ignored: only a name hides a file
inline constexpr DWORD FILE_ATTRIBUTE_DIRECTORY = 0x10;
inline constexpr DWORD FILE_ATTRIBUTE_NORMAL = 0x80;
inline constexpr DWORD FILE_ATTRIBUTE_TEMPORARY = 0x100;  // ignored
inline constexpr DWORD FILE_FLAG_DELETE_ON_CLOSE = 0x04000000;
inline constexpr DWORD FILE_FLAG_SEQUENTIAL_SCAN = 0x08000000;  // ignored

inline constexpr DWORD MAX_PATH = 260;  // characters, the terminator included

// A handle is a 32-bit number, a multiple of 4, that is not reused for a very long time, so one used after
// its object was closed is detected: ERROR_INVALID_HANDLE, like any other wrong handle. CreateFileW and
// FindFirstFileW return this on failure, other calls null.
inline const HANDLE INVALID_HANDLE_VALUE = reinterpret_cast<HANDLE>(~std::uintptr_t{0});

// Always null, the default.
struct SECURITY_ATTRIBUTES;

// Opens a file for reading and writing, not shared. `access` is GENERIC_READ | GENERIC_WRITE, `sharing` 0,
// `security` and `pattern` null, `disposition` CREATE_NEW (mode 0600) or OPEN_EXISTING, `flags` any of the
// above but FILE_ATTRIBUTE_DIRECTORY. Delete-on-close deletes the name the file was opened by, if it still is
// this file, when the handle is closed, or when the process returns from main or exits or the library is
// unloaded. A killed process leaves the file, unlocked.
// INVALID_HANDLE_VALUE on failure, and nothing stays on the disk: ERROR_FILE_EXISTS for CREATE_NEW,
// ERROR_SHARING_VIOLATION for a file that is open, ERROR_FILE_NOT_FOUND, ERROR_PATH_NOT_FOUND when the folder
// is missing or the name empty or with values that are not characters, ERROR_ACCESS_DENIED also for what is
// not a regular file, ERROR_TOO_MANY_OPEN_FILES, ERROR_NOT_ENOUGH_MEMORY and other errors of the system.
HANDLE CreateFileW(const wchar_t* name, DWORD access, DWORD sharing, SECURITY_ATTRIBUTES* security,
                   DWORD disposition, DWORD flags, HANDLE pattern);

// Closes a file or a mapping. A delete-on-close file is deleted now; a view stays until it is unmapped, and
// its file stays locked until then. 1, or 0 for any other handle (ERROR_INVALID_HANDLE); FindClose closes
// searches.
BOOL CloseHandle(HANDLE handle);

// Deletes a file. 1, or 0 with an error as for CreateFileW: a file that is open anywhere stays
// (ERROR_SHARING_VIOLATION), and so do a read-only file and a folder (ERROR_ACCESS_DENIED). A link is deleted
// itself. Uses a descriptor during the call.
BOOL DeleteFileW(const wchar_t* name);

// The folder for temporary files, with a `/` at its end: TMPDIR, or /tmp when that is unset or empty, read at
// each call. It may not exist.
// Returns the length without the terminator; if the buffer of `length` characters is too small, the length
// needed with the terminator, buffer unchanged; 0 when out of memory.
// Threads: thread-safe as long as no thread changes the environment.
DWORD GetTempPathW(DWORD length, wchar_t* buffer);

// Creates a new, empty file of mode 0600 and closes it. Its name is the folder, a separator where that has
// none, up to three characters of the prefix, a number of up to four hexadecimal digits and ".tmp". `unique`
// is 0. When the same thread opens its last such name next, it gets this very file: a link or another file
// in its place is refused, unless the thread has created it. Returns the number, never 0, and the full name
// in `name` (MAX_PATH characters); 0 on failure, buffer unchanged: ERROR_FILE_EXISTS when all 65,535 numbers
// are taken, ERROR_FILENAME_EXCED_RANGE for a folder of more than MAX_PATH - 14 characters, and as for
// CreateFileW. Threads: thread-safe; files made at the same time have different names.
UINT GetTempFileNameW(const wchar_t* folder, const wchar_t* prefix, UINT unique, wchar_t* name);

namespace basalt::platform {

// Deletes the temporary files with this prefix that killed processes left in a folder: regular files of this
// user, no links, not written for a minute and not open in any process. Reads at most 65,536 entries; errors
// are ignored.
void delete_abandoned_files(const wchar_t* folder, const wchar_t* prefix) noexcept;

}  // namespace basalt::platform

#endif
