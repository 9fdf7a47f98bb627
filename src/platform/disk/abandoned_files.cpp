#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <ctime>
#include <exception>
#include <memory>
#include <string>
#include <string_view>

#include "src/platform/disk/open_file.h"
#include "src/platform/file.h"
#include "src/platform/text/file_name.h"

namespace basalt::platform {
namespace {

constexpr int MOST_ENTRIES = 65'536;  // of a folder that are read
constexpr std::time_t MINUTE = 60;    // far longer than from the creation of a file to its lock

struct CloseFolder {
    void operator()(DIR* folder) const noexcept { ::closedir(folder); }
};

bool is_old_file_of_this_user(DIR* folder, const char* name) noexcept {
    struct stat status = {};
    return ::fstatat(::dirfd(folder), name, &status, AT_SYMLINK_NOFOLLOW) == 0 && S_ISREG(status.st_mode) &&
           status.st_uid == ::geteuid() && status.st_mtime < std::time(nullptr) - MINUTE;
}

}  // namespace

void delete_abandoned_files(const wchar_t* folder, const wchar_t* prefix) noexcept {
    try {
        const std::string path = file_name_from_wide(folder);
        const std::string start = file_name_from_wide(prefix);
        const std::unique_ptr<DIR, CloseFolder> entries(open_folder(path.c_str()));
        for (int i = 0; entries != nullptr && i < MOST_ENTRIES; ++i) {
            const dirent* const entry = ::readdir(entries.get());
            if (entry == nullptr) {
                return;
            }
            const std::string_view name = entry->d_name;
            if (name.starts_with(start) && name.ends_with(".tmp") &&
                is_old_file_of_this_user(entries.get(), entry->d_name)) {
                delete_file(path + '/' + entry->d_name);
            }
        }
    } catch (const std::exception&) {
        // Out of memory for the names: the files stay.
    }
}

}  // namespace basalt::platform
