// Files that a host named to be written to.
#ifndef BASALT_SRC_PLATFORM_OPEN_FOR_WRITING_H
#define BASALT_SRC_PLATFORM_OPEN_FOR_WRITING_H

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstddef>

namespace basalt::platform {

// A descriptor for a file, created or emptied, or for a device or pipe; -1 with errno. A pipe that nobody
// reads is refused (ENXIO) instead of waited for, and a terminal does not become the process's own.
inline int open_for_writing(const char* path, int further_flags) noexcept {
    const int flags = O_WRONLY | further_flags;
    const int file = ::open(path, flags | O_CREAT | O_TRUNC | O_CLOEXEC | O_NOCTTY | O_NONBLOCK, 0666);
    if (file >= 0) {
        // Whoever reads a pipe slowly is waited for, or what is written would have holes.
        (void)::fcntl(file, F_SETFL, flags);
    }
    return file;
}

// Writes all bytes, however many the system takes at once and whichever signals come between; false with
// errno when it takes no more.
inline bool write_whole(int file, const char* bytes, std::size_t count) noexcept {
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

}  // namespace basalt::platform

#endif
