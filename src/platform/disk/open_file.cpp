#include "src/platform/disk/open_file.h"

#include <fcntl.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <filesystem>
#include <functional>
#include <mutex>
#include <system_error>
#include <utility>

#include "basalt/platform/error.h"
#include "src/platform/errors/error_from_errno.h"
#include "src/platform/pages.h"
#include "src/platform/system/output.h"
#include "src/platform/text/file_name.h"

namespace basalt::platform {
namespace {

constexpr mode_t ONLY_THIS_USER = 0600;

// Another process may delete a file between its opening and its locking; then it is tried again.
constexpr int MAX_ATTEMPTS = 100;

// The file a path has to lead to when this thread opens it next: others may write to the folder, too. Plain
// data in the thread's initial memory, like the last error.
struct ExpectedFile {
    std::size_t path_hash = 0;
    std::uint64_t device = 0;
    std::uint64_t inode = 0;  // 0: none
};
[[gnu::tls_model("initial-exec")]] constinit thread_local ExpectedFile s_expected;

template <class Call>
int retried(Call call) noexcept {
    int result;
    do {
        result = call();
    } while (result < 0 && errno == EINTR);
    return result;
}

int open_descriptor(const std::string& path, int flags) noexcept {
    // A pipe must not block the call, nor a terminal become the controlling one.
    constexpr int ALWAYS = O_CLOEXEC | O_NONBLOCK | O_NOCTTY;
    const int opened = retried([&] { return ::open(path.c_str(), flags | ALWAYS, ONLY_THIS_USER); });
    const int moved = above_standard(opened);
    if (opened >= 0 && moved < 0 && (flags & O_CREAT) != 0) {
        const int error = errno;
        unlink(path.c_str());
        errno = error;
    }
    return moved;
}

// Locks an open file that is still on the disk. These locks belong to the open file, not to the process, so
// they also keep out other openers within it.
DWORD lock_alone(int descriptor, struct stat& status) noexcept {
    if (fstat(descriptor, &status) != 0) {
        return error_from_errno(errno);
    }
    if (!S_ISREG(status.st_mode)) {
        return ERROR_ACCESS_DENIED;
    }
    struct flock whole = {};
    whole.l_type = F_WRLCK;
    whole.l_whence = SEEK_SET;
    if (retried([&] { return fcntl(descriptor, F_OFD_SETLK, &whole); }) != 0) {
        return errno == EAGAIN || errno == EACCES ? ERROR_SHARING_VIOLATION : error_from_errno(errno);
    }
    // Only the holder of the lock deletes, so from here on the file stays.
    if (fstat(descriptor, &status) != 0) {
        return error_from_errno(errno);
    }
    return status.st_nlink > 0 ? ERROR_SUCCESS : ERROR_FILE_NOT_FOUND;
}

}  // namespace

DWORD OpenFile::open(const std::string& path, Mode mode, bool delete_on_close) {
    std::error_code no_folder;
    // The process may be in another folder by the time it closes the file.
    std::string absolute = std::filesystem::absolute(path, no_folder).string();
    if (no_folder && !path.empty()) {
        return ERROR_PATH_NOT_FOUND;
    }
    if (!count_forks()) {
        return ERROR_NOT_ENOUGH_MEMORY;
    }
    const bool creates = mode == Mode::CREATE;
    const bool is_named = s_expected.inode != 0 && s_expected.path_hash == std::hash<std::string>{}(path);
    const bool is_expected = is_named && !creates;
    const ExpectedFile expected = is_expected ? std::exchange(s_expected, {}) : ExpectedFile{};
    const int flags = creates ? O_RDWR | O_CREAT | O_EXCL : is_expected ? O_RDWR | O_NOFOLLOW : O_RDWR;
    for (int attempt = 0; attempt < MAX_ATTEMPTS; ++attempt) {
        const int descriptor = open_descriptor(path, flags);
        if (descriptor < 0) {
            return error_of_path(path, errno);
        }
        struct stat status = {};
        DWORD error = lock_alone(descriptor, status);
        if (error == ERROR_SUCCESS && is_expected &&
            (status.st_dev != expected.device || status.st_ino != expected.inode)) {
            error = ERROR_ACCESS_DENIED;
        }
        if (error == ERROR_SUCCESS) {
            if (is_named) {
                s_expected = {};  // the name may belong to a new file now
            }
            m_descriptor = descriptor;
            m_delete_path = delete_on_close ? std::move(absolute) : std::string();
            m_device = status.st_dev;
            m_inode = status.st_ino;
            m_process = this_process();
            m_is_open = true;
            return ERROR_SUCCESS;
        }
        // A new file that is already locked is about to be deleted by a clean-up.
        const bool was_deleted =
            error == ERROR_FILE_NOT_FOUND || (creates && error == ERROR_SHARING_VIOLATION);
        if (creates && !was_deleted) {
            unlink(path.c_str());
        }
        ::close(descriptor);
        if (!was_deleted) {
            return error;
        }
    }
    return ERROR_SHARING_VIOLATION;
}

void OpenFile::expect_at(const std::string& path) const noexcept {
    s_expected = {std::hash<std::string>{}(path), m_device, m_inode};
}

DWORD OpenFile::reserve(std::size_t size) noexcept {
    const std::lock_guard<Lock> guard(m_guard);
    const OutputSignalBlocker blocker;
    // In pieces: tmpfs undoes an interrupted fallocate, so a periodic signal would keep a large one from
    // finishing.
    constexpr off_t PIECE = off_t{8} << 20;
    const auto end = static_cast<off_t>(size);
    int number = 0;
    off_t done = 0;
    do {
        const off_t piece = std::min(PIECE, end - done);
        number = posix_fallocate(m_descriptor, done, piece);
        done += number == 0 ? piece : 0;
    } while (number == EINTR || (number == 0 && done < end));
    return error_from_errno(number);
}

DWORD OpenFile::map(std::size_t size, std::byte*& view) noexcept {
    const std::lock_guard<Lock> guard(m_guard);
    void* pages = mmap(nullptr, whole_pages(size), PROT_READ | PROT_WRITE, MAP_SHARED, m_descriptor, 0);
    if (pages == MAP_FAILED) {
        return error_from_errno(errno);
    }
    ::close(m_descriptor);
    m_descriptor = -1;
    view = static_cast<std::byte*>(pages);
    return ERROR_SUCCESS;
}

bool OpenFile::unmap(std::byte* view, std::size_t size) noexcept {
    const std::lock_guard<Lock> guard(m_guard);
    const std::size_t mapped = whole_pages(size);
    if (!m_is_open) {
        return unmap_pages(view, mapped);
    }
    const std::size_t page = page_size();
    if (mapped > page && !unmap_pages(view + page, mapped - page)) {
        return false;
    }
    // The page that keeps the lock is not to be used; if this fails, no harm is done.
    (void)mprotect(view, page, PROT_NONE);
    m_lock_page = view;
    return true;
}

void OpenFile::delete_if_requested() noexcept {
    // Not by a forked child, which has copies of its parent's files, and not a file that replaced this one.
    struct stat status = {};
    if (!m_delete_path.empty() && m_process == this_process() && stat(m_delete_path.c_str(), &status) == 0 &&
        status.st_dev == m_device && status.st_ino == m_inode) {
        unlink(m_delete_path.c_str());
    }
}

void OpenFile::close() noexcept {
    const std::lock_guard<Lock> guard(m_guard);
    if (!m_is_open) {
        return;
    }
    m_is_open = false;
    delete_if_requested();
    if (m_descriptor >= 0) {
        ::close(m_descriptor);
        m_descriptor = -1;
    }
    if (m_lock_page != nullptr) {
        unmap_pages(m_lock_page, page_size());
        m_lock_page = nullptr;
    }
}

void OpenFile::delete_at_exit() noexcept {
    // In a forked child a thread that does not exist may hold the lock of a parent's file.
    if (m_process == this_process()) {
        const std::lock_guard<Lock> guard(m_guard);
        delete_if_requested();
    }
}

DWORD delete_file(const std::string& path) {
    struct stat status = {};
    if (lstat(path.c_str(), &status) != 0) {
        return error_of_path(path, errno);
    }
    if (S_ISDIR(status.st_mode)) {
        return ERROR_ACCESS_DENIED;
    }
    if (!S_ISREG(status.st_mode)) {
        return unlink(path.c_str()) == 0 ? ERROR_SUCCESS : error_of_path(path, errno);
    }
    const int descriptor = open_descriptor(path, O_WRONLY | O_NOFOLLOW);
    if (descriptor < 0) {
        return error_of_path(path, errno);
    }
    DWORD error = lock_alone(descriptor, status);
    if (error == ERROR_SUCCESS && unlink(path.c_str()) != 0) {
        error = error_from_errno(errno);
    }
    ::close(descriptor);
    return error;
}

DIR* open_folder(const char* path) noexcept {
    const int descriptor = above_standard(::open(path, O_RDONLY | O_DIRECTORY | O_CLOEXEC | O_NONBLOCK));
    DIR* const folder = descriptor >= 0 ? fdopendir(descriptor) : nullptr;
    if (folder == nullptr && descriptor >= 0) {
        ::close(descriptor);
        errno = ENOMEM;
    }
    return folder;
}

}  // namespace basalt::platform
