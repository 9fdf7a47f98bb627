#include "src/platform/disk/open_file.h"

#include <fcntl.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <filesystem>
#include <mutex>
#include <system_error>

#include "basalt/platform/error.h"
#include "src/platform/errors/error_from_errno.h"
#include "src/platform/pages.h"
#include "src/platform/system/file_size_signal.h"
#include "src/platform/text/file_name.h"

namespace basalt::platform {
namespace {

constexpr mode_t ONLY_THIS_USER = 0600;

// Between opening a file and locking it another process may have deleted it. It is tried again, but not for
// ever.
constexpr int MAX_ATTEMPTS = 100;

template <class Call>
int retried(Call call) noexcept {
    int result;
    do {
        result = call();
    } while (result < 0 && errno == EINTR);
    return result;
}

int open_descriptor(const std::string& path, int flags) noexcept {
    // A pipe must not make the call wait, nor a terminal become the process's own.
    constexpr int ALWAYS = O_CLOEXEC | O_NONBLOCK | O_NOCTTY;
    return retried([&] { return ::open(path.c_str(), flags | ALWAYS, ONLY_THIS_USER); });
}

// Locks an open file that is still on the disk. These locks belong to the open file, not to the process, and
// so keep out other openers within it too.
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
    // Only whoever holds the lock deletes, so from here on the answer stays.
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
    for (int attempt = 0; attempt < MAX_ATTEMPTS; ++attempt) {
        const int descriptor = open_descriptor(path, creates ? O_RDWR | O_CREAT | O_EXCL : O_RDWR);
        if (descriptor < 0) {
            return error_of_path(path, errno);
        }
        struct stat status = {};
        const DWORD error = lock_alone(descriptor, status);
        if (error == ERROR_SUCCESS) {
            m_descriptor = descriptor;
            m_delete_path = delete_on_close ? std::move(absolute) : std::string();
            m_device = status.st_dev;
            m_inode = status.st_ino;
            m_process = this_process();
            m_is_open = true;
            return ERROR_SUCCESS;
        }
        // A new file that somebody else has locked is about to be deleted: clean-up found it a moment ago.
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

DWORD OpenFile::reserve(std::uint64_t size) noexcept {
    const std::lock_guard<Lock> guard(m_guard);
    if (m_descriptor < 0) {
        return ERROR_FILE_INVALID;
    }
    if (size > static_cast<std::uint64_t>(INT64_MAX)) {
        return ERROR_FILE_TOO_LARGE;
    }
    const SigxfszBlocker held;
    // In pieces: a file system in memory gives up a call that a signal interrupts, with all that it had
    // reserved, and a host's timer may come sooner than a large file is done.
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
    if (m_descriptor < 0) {
        return ERROR_FILE_INVALID;
    }
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
    // Nobody is to use the page that keeps the lock; that it could be used would do no harm.
    (void)mprotect(view, page, PROT_NONE);
    m_lock_page = view;
    return true;
}

void OpenFile::delete_if_asked() noexcept {
    // A forked child has copies of its parent's files, and somebody may have replaced the file by force.
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
    delete_if_asked();
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
    // In a forked child the lock of a parent's file may be held by a thread that does not exist there.
    if (m_process == this_process()) {
        const std::lock_guard<Lock> guard(m_guard);
        delete_if_asked();
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

}  // namespace basalt::platform
