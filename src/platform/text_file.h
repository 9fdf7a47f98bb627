// Text files, written as text mode does.
#ifndef BASALT_SRC_PLATFORM_TEXT_FILE_H
#define BASALT_SRC_PLATFORM_TEXT_FILE_H

#include <climits>
#include <cstddef>
#include <memory>
#include <string_view>

#include "src/platform/system/lock.h"

namespace basalt::platform {

// A file open for writing, with its own buffer, into which text is converted directly: twice as fast as
// through a stream of the C library.
class TextFile {
public:
    // Creates or empties a file, opened for appending, so two objects on one file do not overwrite each
    // other; not inherited by child programs. The path is narrow text in the active code page, either
    // separator; bytes invalid in it pass through unchanged. Null when the file cannot be opened or out of
    // memory.
    static std::unique_ptr<TextFile> open(const char* path) noexcept;
    // Flushes and closes. A forked child that has not written to the file leaves the buffer to its parent.
    ~TextFile();
    TextFile(const TextFile&) = delete;
    TextFile& operator=(const TextFile&) = delete;

    // Appends a text up to its first zero, in the active code page: '?' for characters that it lacks, CR LF
    // for each LF. A text that no longer fits flushes the buffer first, so what reaches the file ends between
    // two texts, unless one is longer than the buffer. Allocates nothing and never blocks; what the system
    // does not take is lost. Threads: thread-safe; each text is whole.
    void write(std::wstring_view text) noexcept;

    // Flushes all open files, at the end of the process. A file in use by another thread is left out, since
    // that thread may be gone.
    static void flush_all() noexcept;

private:
    static constexpr std::size_t BUFFER = 8192;  // bytes: one flush for about a hundred lines
    static constexpr std::size_t PIECE = 256;    // characters converted at once

    TextFile() = default;
    void flush_own() noexcept;
    void flush(std::size_t count) noexcept;
    static void before_fork() noexcept;
    static void after_fork_in_parent() noexcept;
    static void after_fork_in_child() noexcept;

    int m_file = -1;
    bool m_is_own = true;        // this process opened it or wrote to it
    TextFile* m_next = nullptr;  // in the list of open files
    TextFile* m_previous = nullptr;
    Lock m_lock;
    std::size_t m_size = 0;
    char m_bytes[BUFFER + (PIECE + 1) * MB_LEN_MAX];  // space for any piece behind the buffer
};

}  // namespace basalt::platform

#endif
