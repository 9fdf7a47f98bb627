#include "src/platform/text_file.h"

#include <fcntl.h>
#include <sys/resource.h>
#include <sys/single_threaded.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <mutex>
#include <optional>
#include <string>

#include "src/platform/code_page.h"
#include "src/platform/file_name.h"
#include "src/platform/file_size_signal.h"
#include "src/platform/open_for_writing.h"
#include "src/platform/out_of_memory.h"

namespace basalt::platform {

namespace {

// Bytes that are no text cannot be told in another encoding, so they are left as they are.
std::string system_name(const char* path) {
    std::string name;
    file_name_from_wide(active_code_page().widen_name(path), name);
    return name;
}

}  // namespace

std::unique_ptr<TextFile> TextFile::open(const char* path) noexcept {
    return or_out_of_memory(std::unique_ptr<TextFile>(), [&] {
        // The constructor is private, and want of memory caught.
        // NOLINTNEXTLINE(bugprone-unhandled-exception-at-new)
        std::unique_ptr<TextFile> file(new TextFile);
        file->m_file = open_for_writing(system_name(path).c_str(), O_APPEND);
        return file->m_file >= 0 ? std::move(file) : nullptr;
    });
}

TextFile::~TextFile() {
    if (m_file >= 0) {
        send(m_size);
        ::close(m_file);
    }
}

void TextFile::write(std::wstring_view text) noexcept {
    const CodePage& code_page = active_code_page();
    // As the C library's streams do: locking takes as long as converting a line, here for nobody to wait.
    std::unique_lock guard(m_lock, std::defer_lock);
    if (__libc_single_threaded == 0) {
        guard.lock();
    }
    std::size_t before = m_size;
    std::mbstate_t state{};
    while (!text.empty()) {
        char* const end = code_page.narrow_line_piece(text, PIECE, m_bytes + m_size, state);
        m_size = static_cast<std::size_t>(end - m_bytes);
        while (m_size > BUFFER) {
            send(before > 0 ? before : m_size);
            before = 0;
        }
    }
}

// Takes bytes off the front of the buffer and gives them to the system.
void TextFile::send(std::size_t count) noexcept {
    // Asking whether there is a limit takes a quarter of the calls that holding its signal back takes.
    std::optional<FileSizeSignalHeld> held;
    rlimit limit{};
    if (::getrlimit(RLIMIT_FSIZE, &limit) != 0 || limit.rlim_cur != RLIM_INFINITY) {
        held.emplace();
    }
    for (std::size_t sent = 0; sent < count;) {
        const ssize_t taken = ::write(m_file, m_bytes + sent, count - sent);
        if (taken > 0) {
            sent += static_cast<std::size_t>(taken);
        } else if (taken == 0 || errno != EINTR) {
            break;
        }
    }
    m_size -= count;
    std::memmove(m_bytes, m_bytes + count, m_size);
}

}  // namespace basalt::platform
