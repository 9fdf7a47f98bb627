// Opening what a host named to be written to.
#ifndef BASALT_SRC_PLATFORM_SYSTEM_OPEN_FOR_WRITING_H
#define BASALT_SRC_PLATFORM_SYSTEM_OPEN_FOR_WRITING_H

#include <fcntl.h>

#include <cerrno>

namespace basalt::platform {

// A descriptor for a file, created or emptied, or for a device or pipe; -1 with errno. A pipe that nobody
// reads is refused (ENXIO) instead of waited for, and a terminal does not become the process's own.
inline int open_for_writing(const char* path, int further_flags) noexcept {
    const int flags = O_WRONLY | further_flags;
    int file;
    do {
        file = ::open(path, flags | O_CREAT | O_TRUNC | O_CLOEXEC | O_NOCTTY | O_NONBLOCK, 0666);
    } while (file < 0 && errno == EINTR);
    if (file >= 0) {
        // Whoever reads a pipe slowly is waited for, or what is written would have holes.
        (void)::fcntl(file, F_SETFL, flags);
    }
    return file;
}

}  // namespace basalt::platform

#endif
