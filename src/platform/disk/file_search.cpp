#include "src/platform/file_search.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>

#include <cerrno>
#include <iterator>
#include <memory>
#include <new>
#include <string>
#include <string_view>

#include "basalt/platform/error.h"
#include "src/platform/disk/open_file.h"
#include "src/platform/disk/wildcard.h"
#include "src/platform/errors/error_from_errno.h"
#include "src/platform/path_split.h"
#include "src/platform/system/handle_table.h"
#include "src/platform/system/out_of_memory.h"
#include "src/platform/text/file_name.h"
#include "src/platform/ticks.h"

using basalt::platform::error_from_errno;
using basalt::platform::fail_with;
using basalt::platform::HandleObject;
using basalt::platform::matches_wildcards;
using basalt::platform::NewHandle;
using basalt::platform::or_out_of_memory;

namespace {

// An open search; already at its end for the entry of a path without wildcards.
class FileSearch final : public HandleObject {
public:
    static constexpr Kind KIND = Kind::SEARCH;

    FileSearch() noexcept : HandleObject(KIND) {}
    ~FileSearch() override {
        if (m_folder != nullptr) {
            closedir(m_folder);
        }
    }
    FileSearch(const FileSearch&) = delete;
    FileSearch& operator=(const FileSearch&) = delete;

    // Begins a search of a folder. ERROR_SUCCESS or an error.
    DWORD open(const char* folder, std::wstring_view pattern) {
        m_pattern = pattern;
        m_folder = basalt::platform::open_folder(folder);
        if (m_folder != nullptr) {
            return ERROR_SUCCESS;
        }
        return errno == ENOENT ? ERROR_PATH_NOT_FOUND : error_from_errno(errno);
    }

    // Moves to the next match. ERROR_SUCCESS, ERROR_NO_MORE_FILES or another error.
    DWORD advance();
    // The name of the match.
    const wchar_t* name() const { return m_name.c_str(); }
    // Advances and describes the match.
    DWORD next(WIN32_FIND_DATAW& entry);

private:
    DIR* m_folder = nullptr;
    const dirent* m_found = nullptr;
    std::wstring m_name;
    std::wstring m_pattern;
};

FILETIME file_time(const statx_timestamp& time) {
    return basalt::platform::file_time(basalt::platform::ticks_of(time.tv_sec, time.tv_nsec));
}

DWORD attributes_of(mode_t mode) {
    return S_ISDIR(mode) ? FILE_ATTRIBUTE_DIRECTORY : FILE_ATTRIBUTE_NORMAL;
}

void describe(std::wstring_view name, mode_t mode, WIN32_FIND_DATAW& entry) {
    entry = {};
    entry.dwFileAttributes = attributes_of(mode);
    name.copy(entry.cFileName, std::size(entry.cFileName) - 1);
}

void describe(std::wstring_view name, const struct statx& status, WIN32_FIND_DATAW& entry) {
    describe(name, status.stx_mode, entry);
    const bool knows_creation = (status.stx_mask & STATX_BTIME) != 0;
    entry.ftCreationTime = file_time(knows_creation ? status.stx_btime : status.stx_ctime);
    entry.ftLastAccessTime = file_time(status.stx_atime);
    entry.ftLastWriteTime = file_time(status.stx_mtime);
    entry.nFileSizeHigh = static_cast<DWORD>(status.stx_size >> 32);
    entry.nFileSizeLow = static_cast<DWORD>(status.stx_size & 0xFFFFFFFF);
}

// The status of a link's target, or of the link itself if that is missing. Links are rare, so they are not
// followed at first: one call does for everything else, missing files included.
bool query(int folder, const char* name, struct statx& status) {
    constexpr unsigned WANTED = STATX_BASIC_STATS | STATX_BTIME;
    if (statx(folder, name, AT_NO_AUTOMOUNT | AT_SYMLINK_NOFOLLOW, WANTED, &status) != 0) {
        return false;
    }
    if (S_ISLNK(status.stx_mode)) {
        struct statx target = {};
        if (statx(folder, name, AT_NO_AUTOMOUNT, WANTED, &target) == 0) {
            status = target;
        } else if (errno == ENOMEM) {
            return false;
        }
    }
    return true;
}

// The same for the mode alone, by the cheapest call.
bool query_mode(const char* name, mode_t& mode) {
    struct stat status;
    if (fstatat(AT_FDCWD, name, &status, AT_NO_AUTOMOUNT | AT_SYMLINK_NOFOLLOW) != 0) {
        return false;
    }
    mode = status.st_mode;
    if (S_ISLNK(mode)) {
        if (fstatat(AT_FDCWD, name, &status, AT_NO_AUTOMOUNT) == 0) {
            mode = status.st_mode;
        } else if (errno == ENOMEM) {
            return false;
        }
    }
    return true;
}

DWORD FileSearch::advance() {
    if (m_folder == nullptr) {
        return ERROR_NO_MORE_FILES;
    }
    do {
        errno = 0;
        m_found = readdir(m_folder);
        if (m_found == nullptr) {
            return errno == 0 ? ERROR_NO_MORE_FILES : error_from_errno(errno);
        }
        basalt::platform::wide_from_system_name(m_found->d_name, m_name);
    } while (!matches_wildcards(m_name, m_pattern));
    return ERROR_SUCCESS;
}

DWORD FileSearch::next(WIN32_FIND_DATAW& entry) {
    for (;;) {
        const DWORD error = advance();
        if (error != ERROR_SUCCESS) {
            return error;
        }
        struct statx status = {};
        if (query(dirfd(m_folder), m_found->d_name, status)) {
            describe(m_name, status, entry);
        } else if (errno == ENOENT) {
            continue;  // deleted in the meantime
        } else if (errno == ENOMEM) {
            return ERROR_NOT_ENOUGH_MEMORY;
        } else {
            // A folder that may be read but not entered gives only names and kinds.
            describe(m_name, m_found->d_type == DT_DIR ? S_IFDIR : S_IFREG, entry);
        }
        return ERROR_SUCCESS;
    }
}

// The parts of a search path.
struct Sought {
    std::wstring_view folder, last;  // the last element is empty behind a separator
    bool has_wildcards = false;      // in the last element

    explicit Sought(std::wstring_view path) {
        std::size_t start = path.size();
        for (; start > 0 && !basalt::platform::is_separator(path[start - 1]); --start) {
            has_wildcards |= path[start - 1] == L'*' || path[start - 1] == L'?';
        }
        folder = path.substr(0, start);
        last = path.substr(start);
    }
};

// Calls query_name for the path. ERROR_SUCCESS or an error.
template <class Query>
DWORD query_path(std::wstring_view path, Query query_name) {
    basalt::platform::FileName name;
    if (!name.set(path)) {
        return ERROR_INVALID_NAME;
    }
    return query_name(name.c_str()) ? ERROR_SUCCESS : basalt::platform::error_of_path(name.c_str(), errno);
}

DWORD query_mode_of_path(std::wstring_view path, mode_t& mode) {
    return query_path(path, [&](const char* name) { return query_mode(name, mode); });
}

// Opens the folder of a search with wildcards. ERROR_SUCCESS or an error.
DWORD open_folder(const Sought& sought, FileSearch& search) {
    basalt::platform::FileName name;
    return name.set(sought.folder.empty() ? L"." : sought.folder) ? search.open(name.c_str(), sought.last)
                                                                  : ERROR_INVALID_NAME;
}

// Begins a search and describes its first entry.
DWORD find_first(std::wstring_view path, FileSearch& search, WIN32_FIND_DATAW& entry) {
    const Sought sought(path);
    if (sought.last.empty()) {
        return ERROR_FILE_NOT_FOUND;
    }
    if (!sought.has_wildcards) {
        struct statx status = {};
        const DWORD error = query_path(path, [&](const char* name) { return query(AT_FDCWD, name, status); });
        if (error == ERROR_SUCCESS) {
            describe(sought.last, status, entry);
        }
        return error;
    }
    const DWORD error = open_folder(sought, search);
    if (error != ERROR_SUCCESS) {
        return error;
    }
    const DWORD first = search.next(entry);
    return first == ERROR_NO_MORE_FILES ? ERROR_FILE_NOT_FOUND : first;
}

}  // namespace

DWORD basalt::platform::first_match_attributes(const wchar_t* path) noexcept {
    return or_out_of_memory(DWORD{0}, [&] {
        const std::wstring_view whole = path != nullptr ? path : L"";
        const Sought sought(whole);
        if (sought.last.empty() || sought.has_wildcards) {
            FileSearch search;
            WIN32_FIND_DATAW entry;
            const DWORD error = find_first(whole, search, entry);
            return error == ERROR_SUCCESS ? entry.dwFileAttributes : fail_with(error, DWORD{0});
        }
        mode_t mode = 0;
        const DWORD error = query_mode_of_path(whole, mode);
        return error == ERROR_SUCCESS ? attributes_of(mode) : fail_with(error, DWORD{0});
    });
}

void basalt::platform::for_each_match(const wchar_t* path, const std::function<void(const wchar_t*)>& visit) {
    const Sought sought(path);
    DWORD error = ERROR_SUCCESS;
    if (sought.has_wildcards) {
        FileSearch search;
        error = open_folder(sought, search);
        while (error == ERROR_SUCCESS && (error = search.advance()) == ERROR_SUCCESS) {
            visit(search.name());
        }
    } else if (!sought.last.empty()) {
        mode_t mode = 0;
        error = query_mode_of_path(path, mode);
        if (error == ERROR_SUCCESS) {
            visit(sought.last.data());
        }
    }
    // An incomplete list must not pass for the whole.
    if (error == ERROR_NOT_ENOUGH_MEMORY) {
        throw std::bad_alloc();
    }
}

HANDLE FindFirstFileW(const wchar_t* path, WIN32_FIND_DATAW* entry) {
    return or_out_of_memory(INVALID_HANDLE_VALUE, [&] {
        const auto search = std::make_shared<FileSearch>();
        NewHandle handle(search);
        const DWORD error = find_first(path != nullptr ? path : L"", *search, *entry);
        return error == ERROR_SUCCESS ? handle.give() : fail_with(error, INVALID_HANDLE_VALUE);
    });
}

BOOL FindNextFileW(HANDLE search, WIN32_FIND_DATAW* entry) {
    return or_out_of_memory(0, [&] {
        const auto open = basalt::platform::find_object_of<FileSearch>(search);
        const DWORD error = open != nullptr ? open->next(*entry) : ERROR_INVALID_HANDLE;
        return error == ERROR_SUCCESS ? 1 : fail_with(error, 0);
    });
}

BOOL FindClose(HANDLE search) {
    if (basalt::platform::find_object_of<FileSearch>(search) == nullptr) {
        return fail_with(ERROR_INVALID_HANDLE, 0);
    }
    basalt::platform::drop_handle(search);
    return 1;
}
