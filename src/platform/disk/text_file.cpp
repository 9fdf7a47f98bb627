#include "src/platform/text_file.h"

#include <fcntl.h>
#include <sys/single_threaded.h>
#include <unistd.h>

#include <atomic>
#include <cstring>
#include <mutex>
#include <new>
#include <string>

#include "src/platform/code_page.h"
#include "src/platform/system/failure.h"
#include "src/platform/system/forks.h"
#include "src/platform/system/output.h"
#include "src/platform/text/file_name.h"

namespace basalt::platform {

namespace {

// The open files, newest first.
constinit Lock s_files_lock;
constinit TextFile* s_files = nullptr;

constinit std::atomic<bool> s_handles_forks = false;

[[gnu::destructor]] void flush_at_exit() {
    TextFile::flush_all();
}

}  // namespace

std::unique_ptr<TextFile> TextFile::open(const char* path) noexcept {
    return or_out_of_memory(std::unique_ptr<TextFile>(), [&] {
        // make_unique cannot reach the constructor.
        // NOLINTNEXTLINE(bugprone-unhandled-exception-at-new)
        std::unique_ptr<TextFile> file(new TextFile);
        if (!register_fork_handlers(s_handles_forks,
                                    {before_fork, after_fork_in_parent, after_fork_in_child})) {
            return std::unique_ptr<TextFile>();
        }
        const std::string name = file_name_from_wide(active_code_page().widen_name(path));
        file->m_file = open_output(name.c_str(), O_APPEND);
        if (file->m_file < 0) {
            return std::unique_ptr<TextFile>();
        }
        const std::lock_guard guard(s_files_lock);
        file->m_next = s_files;
        if (s_files != nullptr) {
            s_files->m_previous = file.get();
        }
        s_files = file.get();
        return file;
    });
}

TextFile::~TextFile() {
    if (m_file < 0) {
        return;
    }
    {
        const std::lock_guard guard(s_files_lock);
        (m_previous != nullptr ? m_previous->m_next : s_files) = m_next;
        if (m_next != nullptr) {
            m_next->m_previous = m_previous;
        }
    }
    flush_own();
    ::close(m_file);
}

void TextFile::flush_all() noexcept {
    const std::unique_lock files(s_files_lock, std::try_to_lock);
    if (!files) {
        return;
    }
    for (TextFile* file = s_files; file != nullptr; file = file->m_next) {
        const std::unique_lock guard(file->m_lock, std::try_to_lock);
        if (guard) {
            file->flush_own();
        }
    }
}

void TextFile::write(std::wstring_view text) noexcept {
    const CodePage& code_page = active_code_page();
    // As the C library's streams do: the lock costs as much as converting a line.
    std::unique_lock guard(m_lock, std::defer_lock);
    if (__libc_single_threaded == 0) {
        guard.lock();
    }
    m_is_own = true;
    std::size_t before = m_size;
    while (!text.empty()) {
        char* const end = code_page.narrow_line_piece(text, PIECE, m_bytes + m_size);
        m_size = static_cast<std::size_t>(end - m_bytes);
        while (m_size > BUFFER) {
            flush(before > 0 ? before : m_size);
            before = 0;
        }
    }
}

// What a forked child has not added to is left to its parent.
void TextFile::flush_own() noexcept {
    if (m_is_own) {
        flush(m_size);
    }
}

// The child gets a consistent list.
void TextFile::before_fork() noexcept {
    s_files_lock.lock();
}

void TextFile::after_fork_in_parent() noexcept {
    s_files_lock.unlock();
}

// A lock held by a thread that does not exist here is replaced. Its buffer may be half written, and is the
// parent's anyway.
void TextFile::after_fork_in_child() noexcept {
    for (TextFile* file = s_files; file != nullptr; file = file->m_next) {
        if (!file->m_lock.try_lock()) {
            file->m_size = 0;
        }
        new (&file->m_lock) Lock;
        file->m_is_own = false;
    }
    s_files_lock.unlock();
}

// Writes the first bytes of the buffer to the file.
void TextFile::flush(std::size_t count) noexcept {
    const OutputSignalBlocker blocker;
    write_output(m_file, m_bytes, count);
    m_size -= count;
    std::memmove(m_bytes, m_bytes + count, m_size);
}

}  // namespace basalt::platform
