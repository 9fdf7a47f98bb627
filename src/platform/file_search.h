// Searching folders.
#ifndef BASALT_SRC_PLATFORM_FILE_SEARCH_H
#define BASALT_SRC_PLATFORM_FILE_SEARCH_H

#include <functional>

#include "basalt/platform/calendar.h"
#include "basalt/platform/types.h"
#include "src/platform/file.h"

// An entry, with the fields of Win32's that are used. For a link it describes the target, or the link itself
// if that is missing.
struct WIN32_FIND_DATAW {
    DWORD dwFileAttributes;  // FILE_ATTRIBUTE_DIRECTORY, or FILE_ATTRIBUTE_NORMAL for everything else
    // Times are 0 in a folder that may be read but not entered.
    FILETIME ftCreationTime;  // time of the last change where the file system keeps no creation time
    FILETIME ftLastAccessTime;
    wchar_t cFileName[MAX_PATH];
};

// Begins a search and describes its first entry. Without a wildcard in the last element of the path that is
// the path's own entry, named by its last element; with `*` (any characters) or `?` (one character),
// case-sensitive, every matching entry of the folder, "." and ".." included, in the system's order. "*.*"
// matches everything. Entries are never opened. A handle for FindClose, or INVALID_HANDLE_VALUE with the
// record unchanged: ERROR_FILE_NOT_FOUND when nothing matches and for a path that ends in a separator or is
// empty, ERROR_PATH_NOT_FOUND when the folder is missing, and as for CreateFileW. Threads: thread-safe; one
// search is used by one thread at a time.
HANDLE FindFirstFileW(const wchar_t* path, WIN32_FIND_DATAW* entry);

// Describes the next entry. 1, or 0 with the record unchanged: ERROR_NO_MORE_FILES after the last,
// ERROR_NOT_ENOUGH_MEMORY, or an error of the system.
BOOL FindNextFileW(HANDLE search, WIN32_FIND_DATAW* entry);

// Ends a search. 1.
BOOL FindClose(HANDLE search);

namespace basalt::platform {

// The attributes of the entry that FindFirstFileW would describe, or 0 with its error; no search is left
// open.
DWORD first_match_attributes(const wchar_t* path) noexcept;

// Visits the names that a search would return, in its order, without a system call per name; none where a
// search cannot begin. Throws std::bad_alloc, and whatever the visit throws.
void for_each_match(const wchar_t* path, const std::function<void(const wchar_t*)>& visit);

}  // namespace basalt::platform

#endif
