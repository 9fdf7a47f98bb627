// Text files that are written as text mode does.
#ifndef BASALT_SRC_PLATFORM_TEXT_FILE_H
#define BASALT_SRC_PLATFORM_TEXT_FILE_H

#include <climits>
#include <cstddef>
#include <memory>
#include <string_view>

#include "src/platform/system/lock.h"

namespace basalt::platform {

// A file open for writing, with a buffer of its own: a text is converted in its place, once, and moved if
// that turns out to be too small; a stream of the C library lets nobody write there.
class TextFile {
public:
    // Created, or emptied when it exists. What is written goes to the file's end as it then is, so two
    // objects on one file do not overwrite each other. A child process does not inherit it. The path is
    // narrow text in the active code page, either separator; bytes that are no character of it go to the
    // system as they are. Null for a file that cannot be opened, and for want of memory.
    static std::unique_ptr<TextFile> open(const char* path) noexcept;
    // Sends the buffer out and closes the file; a forked child that has not written to it leaves the sending
    // to its parent.
    ~TextFile();
    TextFile(const TextFile&) = delete;
    TextFile& operator=(const TextFile&) = delete;

    // Adds a text up to its first zero, in the active code page, '?' for what that lacks, CR LF for each LF.
    // A text for which the buffer has no room left sends the buffer out first: what reaches the file ends
    // between two texts, unless one is longer than the buffer. Takes no memory. What the system does not take
    // is lost. Threads: thread-safe; each text is whole.
    void write(std::wstring_view text) noexcept;

    // Sends the buffers of all that are open out, as closing them does: the end of the process. A file that a
    // thread writes to meanwhile is left out, since that thread may never come back.
    static void send_all() noexcept;

private:
    // Bytes. Two pages, since the system has the more to do the more often one is written in parts.
    static constexpr std::size_t BUFFER = 8192;
    static constexpr std::size_t PIECE = 256;  // characters that are converted at once

    TextFile() = default;
    void send_own() noexcept;
    void send(std::size_t count) noexcept;
    static void before_fork() noexcept;
    static void after_fork_in_parent() noexcept;
    static void after_fork_in_child() noexcept;

    int m_file = -1;
    bool m_is_own = true;        // whether this process opened it or wrote to it
    TextFile* m_next = nullptr;  // open files
    TextFile* m_previous = nullptr;
    Lock m_lock;
    std::size_t m_size = 0;
    char m_bytes[BUFFER + (PIECE + 1) * MB_LEN_MAX];  // with room behind the buffer for any piece
};

}  // namespace basalt::platform

#endif
