// Writing all there is to write.
#ifndef BASALT_SRC_PLATFORM_SYSTEM_WRITE_WHOLE_H
#define BASALT_SRC_PLATFORM_SYSTEM_WRITE_WHOLE_H

#include <unistd.h>

#include <cerrno>
#include <cstddef>

namespace basalt::platform {

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
