// Files: opening without sharing, deleting.
//
// Names are UTF-8 on the disk, whatever the locale; a byte that is none there has a value of its own, 0xDC00
// above the byte, which leads back to it. Both separators lead to folders; the links of a path are followed.
//
// An open file is locked against every other opener of this layer and against its deletion, in this process
// and in others, from the call that opens it until it is closed and its views are unmapped. The lock is the
// system's advisory lock on the open file: it goes with a process that is killed, and programs that do not
// ask for it are not kept out.
// Threads: thread-safe.
#ifndef BASALT_SRC_PLATFORM_FILE_H
#define BASALT_SRC_PLATFORM_FILE_H

#include "basalt/platform/types.h"
#include "src/platform/handle.h"

inline constexpr DWORD GENERIC_READ = 0x80000000;
inline constexpr DWORD GENERIC_WRITE = 0x40000000;

inline constexpr DWORD CREATE_NEW = 1;
inline constexpr DWORD OPEN_EXISTING = 3;

inline constexpr DWORD FILE_ATTRIBUTE_HIDDEN = 0x2;  // nothing here: a name alone hides a file
inline constexpr DWORD FILE_ATTRIBUTE_DIRECTORY = 0x10;
inline constexpr DWORD FILE_ATTRIBUTE_NORMAL = 0x80;
inline constexpr DWORD FILE_ATTRIBUTE_TEMPORARY = 0x100;  // nothing here
inline constexpr DWORD FILE_FLAG_DELETE_ON_CLOSE = 0x04000000;
inline constexpr DWORD FILE_FLAG_SEQUENTIAL_SCAN = 0x08000000;  // nothing here

// Opens a file for reading and writing, alone. `access` is GENERIC_READ | GENERIC_WRITE, `sharing` 0,
// `security` and `pattern` null, `disposition` CREATE_NEW (only this user may open the new file) or
// OPEN_EXISTING, `flags` any of the above but the folder's: anything else is ERROR_INVALID_PARAMETER.
// Delete-on-close deletes the name it was opened by, if that still is this file, when the handle is closed,
// and else when the process ends by returning or exit(), or the library is unloaded. A killed process leaves
// the file, unlocked. INVALID_HANDLE_VALUE on failure, nothing stays on the disk: ERROR_FILE_EXISTS for
// CREATE_NEW, ERROR_SHARING_VIOLATION for a file that is open, ERROR_FILE_NOT_FOUND, ERROR_PATH_NOT_FOUND
// when the folder is missing or the name empty, ERROR_INVALID_NAME for a name with values that are no
// characters, ERROR_ACCESS_DENIED for what is no file too, ERROR_TOO_MANY_OPEN_FILES, ERROR_NOT_ENOUGH_MEMORY
// and what else the system says.
HANDLE CreateFileW(const wchar_t* name, DWORD access, DWORD sharing, SECURITY_ATTRIBUTES* security,
                   DWORD disposition, DWORD flags, HANDLE pattern);

// Deletes a file. 1, or 0 with an error as for CreateFileW: one that is open anywhere stays
// (ERROR_SHARING_VIOLATION), so do a file that may not be written and a folder (ERROR_ACCESS_DENIED). A link
// is deleted itself. Takes a descriptor for the time of the call.
BOOL DeleteFileW(const wchar_t* name);

#endif
