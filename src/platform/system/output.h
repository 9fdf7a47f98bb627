// Opening and writing what a host has named or inherited, which may be a pipe, a terminal or a full disk.
#ifndef BASALT_SRC_PLATFORM_SYSTEM_OUTPUT_H
#define BASALT_SRC_PLATFORM_SYSTEM_OUTPUT_H

#include <signal.h>

#include <cstddef>

namespace basalt::platform {

// While one lives, writing raises neither SIGPIPE nor SIGXFSZ on this thread: the call fails with EPIPE or
// EFBIG instead. The host's disposition stays, and so does a signal that was pending before.
class OutputSignalBlocker {
public:
    OutputSignalBlocker() noexcept;
    ~OutputSignalBlocker();
    OutputSignalBlocker(const OutputSignalBlocker&) = delete;
    OutputSignalBlocker& operator=(const OutputSignalBlocker&) = delete;

private:
    sigset_t m_raised_here;  // signals that were not pending before
    sigset_t m_mask_before;
};

// Moves a new descriptor away from the numbers of standard input, output and error, which a host may have
// closed: what is written to them would end up in the file. -1 with errno on failure; -1 stays -1.
int above_standard(int descriptor) noexcept;

// A descriptor that never blocks, for a file, created or emptied, or for a device or pipe. -1 with errno,
// ENXIO for a pipe without a reader. A terminal does not become the controlling one.
int open_output(const char* path, int further_flags) noexcept;

// Writes all bytes; false with errno when the system takes no more. Blocks no longer than the descriptor
// does.
bool write_output(int file, const char* bytes, std::size_t count) noexcept;

// Writes to standard error, which is the host's; dropped where that is closed, broken or would block. Blocks
// only if another writer fills the pipe between the check and the writing.
void write_report(const char* bytes, std::size_t count) noexcept;

}  // namespace basalt::platform

#endif
