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
#include "src/platform/system/failure.h"
#include "src/platform/system/handle_table.h"
#include "src/platform/text/file_name.h"
#include "src/platform/ticks.h"

using namespace basalt::platform;

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
        m_folder = open_folder(folder);
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

FILETIME file_time_of(const statx_timestamp& time) {
    return file_time(ticks_of(time.tv_sec, time.tv_nsec));
}

// The fields of a status that describe() reads.
constexpr unsigned ALL_FIELDS = STATX_BASIC_STATS | STATX_BTIME;

void describe(std::wstring_view name, mode_t mode, WIN32_FIND_DATAW& entry) {
    entry = {};
    entry.dwFileAttributes = S_ISDIR(mode) ? FILE_ATTRIBUTE_DIRECTORY : FILE_ATTRIBUTE_NORMAL;
    name.copy(entry.cFileName, std::size(entry.cFileName) - 1);
}

void describe(std::wstring_view name, const struct statx& status, WIN32_FIND_DATAW& entry) {
    describe(name, status.stx_mode, entry);
    const bool knows_creation = (status.stx_mask & STATX_BTIME) != 0;
    entry.ftCreationTime = file_time_of(knows_creation ? status.stx_btime : status.stx_ctime);
    entry.ftLastAccessTime = file_time_of(status.stx_atime);
}

// The status of a link's target, or of the link itself if that is missing. Links are rare, so they are not
// followed at first: one call is enough for everything else, missing files included.
bool query(int folder, const char* name, unsigned fields, struct statx& status) {
    if (statx(folder, name, AT_NO_AUTOMOUNT | AT_SYMLINK_NOFOLLOW, fields, &status) != 0) {
        return false;
    }
    if (S_ISLNK(status.stx_mode)) {
        struct statx target = {};
        if (statx(folder, name, AT_NO_AUTOMOUNT, fields, &target) == 0) {
            status = target;
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
        wide_from_system_name(m_found->d_name, m_name);
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
        if (query(dirfd(m_folder), m_found->d_name, ALL_FIELDS, status)) {
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
struct SearchPath {
    std::wstring_view folder, last;  // the last element is empty behind a separator
    bool has_wildcards = false;      // in the last element

    explicit SearchPath(std::wstring_view path) {
        std::size_t start = path.size();
        for (; start > 0 && !is_separator(path[start - 1]); --start) {
            has_wildcards |= path[start - 1] == L'*' || path[start - 1] == L'?';
        }
        folder = path.substr(0, start);
        last = path.substr(start);
    }
};

// Opens the folder of a search with wildcards. ERROR_SUCCESS or an error.
DWORD open_folder(const SearchPath& sought, FileSearch& search) {
    FileName name;
    return name.set(sought.folder.empty() ? L"." : sought.folder) ? search.open(name.c_str(), sought.last)
                                                                  : ERROR_INVALID_NAME;
}

// Begins a search and describes its first entry by at least these fields. ERROR_SUCCESS or an error.
DWORD find_first(const wchar_t* path, unsigned fields, FileSearch& search, WIN32_FIND_DATAW& entry) {
    const SearchPath sought(path);
    if (sought.last.empty()) {
        return ERROR_FILE_NOT_FOUND;
    }
    if (!sought.has_wildcards) {
        FileName name;
        if (!name.set(path)) {
            return ERROR_INVALID_NAME;
        }
        struct statx status = {};
        if (!query(AT_FDCWD, name.c_str(), fields, status)) {
            return error_of_path(name.c_str(), errno);
        }
        describe(sought.last, status, entry);
        return ERROR_SUCCESS;
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
        FileSearch search;
        WIN32_FIND_DATAW entry;
        const DWORD error = find_first(path, STATX_TYPE, search, entry);
        return error == ERROR_SUCCESS ? entry.dwFileAttributes : fail_with(error, DWORD{0});
    });
}

void basalt::platform::for_each_match(const wchar_t* path, const std::function<void(const wchar_t*)>& visit) {
    const SearchPath sought(path);
    FileSearch search;
    DWORD error = ERROR_SUCCESS;
    if (sought.has_wildcards) {
        error = open_folder(sought, search);
        while (error == ERROR_SUCCESS && (error = search.advance()) == ERROR_SUCCESS) {
            visit(search.name());
        }
    } else {
        WIN32_FIND_DATAW entry;
        error = find_first(path, STATX_TYPE, search, entry);
        if (error == ERROR_SUCCESS) {
            visit(sought.last.data());
        }
    }
    // An incomplete list is a failure.
    if (error == ERROR_NOT_ENOUGH_MEMORY) {
        throw std::bad_alloc();
    }
}

HANDLE FindFirstFileW(const wchar_t* path, WIN32_FIND_DATAW* entry) {
    return or_out_of_memory(INVALID_HANDLE_VALUE, [&] {
        const auto search = std::make_shared<FileSearch>();
        NewHandle handle(search);
        const DWORD error = find_first(path, ALL_FIELDS, *search, *entry);
        return error == ERROR_SUCCESS ? handle.give() : fail_with(error, INVALID_HANDLE_VALUE);
    });
}

BOOL FindNextFileW(HANDLE search, WIN32_FIND_DATAW* entry) {
    return or_out_of_memory(0, [&] {
        const DWORD error = find_object_of<FileSearch>(search)->next(*entry);
        return error == ERROR_SUCCESS ? 1 : fail_with(error, 0);
    });
}

BOOL FindClose(HANDLE search) {
    drop_handle(search);
    return 1;
}
