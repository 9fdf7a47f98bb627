#include "src/platform/system/output.h"

#include <fcntl.h>
#include <limits.h>
#include <poll.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <ctime>

namespace basalt::platform {

OutputSignalBlocker::OutputSignalBlocker() noexcept {
    sigset_t pending;
    sigemptyset(&pending);
    sigpending(&pending);
    sigset_t blocked;
    sigemptyset(&blocked);
    sigemptyset(&m_raised_here);
    for (const int signal : {SIGPIPE, SIGXFSZ}) {
        sigaddset(&blocked, signal);
        if (sigismember(&pending, signal) == 0) {
            sigaddset(&m_raised_here, signal);
        }
    }
    pthread_sigmask(SIG_BLOCK, &blocked, &m_mask_before);
}

OutputSignalBlocker::~OutputSignalBlocker() {
    constexpr timespec NO_WAIT = {0, 0};
    const int errno_before = errno;
    while (sigtimedwait(&m_raised_here, nullptr, &NO_WAIT) > 0) {
    }
    errno = errno_before;
    pthread_sigmask(SIG_SETMASK, &m_mask_before, nullptr);
}

int above_standard(int descriptor) noexcept {
    if (descriptor < 0 || descriptor > STDERR_FILENO) {
        return descriptor;
    }
    const int moved = ::fcntl(descriptor, F_DUPFD_CLOEXEC, STDERR_FILENO + 1);
    const int error = errno;
    ::close(descriptor);
    errno = error;
    return moved;
}

int open_output(const char* path, int further_flags) noexcept {
    constexpr int FLAGS = O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC | O_NOCTTY | O_NONBLOCK;
    int file;
    do {
        file = ::open(path, FLAGS | further_flags, 0666);
    } while (file < 0 && errno == EINTR);
    return above_standard(file);
}

bool write_output(int file, const char* bytes, std::size_t count) noexcept {
    while (count > 0) {
        const ssize_t taken = ::write(file, bytes, count);
        if (taken > 0) {
            bytes += taken;
            count -= static_cast<std::size_t>(taken);
        } else if (taken == 0) {
            errno = EIO;
            return false;
        } else if (errno != EINTR) {
            return false;
        }
    }
    return true;
}

void write_report(const char* bytes, std::size_t count) noexcept {
    const OutputSignalBlocker blocker;
    while (count > 0) {
        // A pipe that is ready takes PIPE_BUF bytes without blocking.
        const std::size_t piece = std::min(count, std::size_t{PIPE_BUF});
        pollfd error = {STDERR_FILENO, POLLOUT, 0};
        if (::poll(&error, 1, 0) != 1 || (error.revents & POLLOUT) == 0 ||
            !write_output(STDERR_FILENO, bytes, piece)) {
            return;
        }
        bytes += piece;
        count -= piece;
    }
}

}  // namespace basalt::platform
