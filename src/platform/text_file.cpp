#include "src/platform/text_file.h"

#include <fcntl.h>
#include <stdio.h>
#include <stdio_ext.h>
#include <unistd.h>

#include <cerrno>
#include <climits>
#include <string>

#include "src/platform/code_page.h"
#include "src/platform/system_file_name.h"

namespace {

// Bytes that are no text cannot be told in another encoding, so such a name is left as it is.
std::string file_name(const char* path) {
    const std::wstring wide = basalt::platform::widen(path);
    const bool is_text = wide.find(basalt::platform::REPLACEMENT_CHARACTER) == std::wstring::npos;
    return is_text ? basalt::platform::system_file_name(wide) : path;
}

}  // namespace

int fopen_s(std::FILE** stream, const char* path, const char* mode) {
    if (stream == nullptr) {
        return EINVAL;
    }
    *stream = nullptr;
    if (path == nullptr || mode == nullptr || std::string_view(mode) != "w") {
        return EINVAL;
    }
    const int file =
        ::open(file_name(path).c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_APPEND | O_CLOEXEC, 0666);
    if (file < 0) {
        return errno;
    }
    *stream = ::fdopen(file, mode);
    if (*stream == nullptr) {
        const int error = errno;
        ::close(file);
        return error;
    }
    return 0;
}

namespace basalt::platform {

namespace {

constexpr std::size_t PIECE = 256;  // characters; longer texts are converted piece by piece

struct Piece {
    char bytes[PIECE * MB_LEN_MAX];
    std::size_t size;

    void convert(std::wstring_view text, const CodePage& code_page) {
        char* end = bytes;
        for (std::size_t line_end; (line_end = text.find(L'\n')) != std::wstring_view::npos;
             text.remove_prefix(line_end + 1)) {
            end = code_page.narrow_to(text.substr(0, line_end), end);
            *end++ = '\r';
            *end++ = '\n';
        }
        size = static_cast<std::size_t>(code_page.narrow_to(text, end) - bytes);
    }
};

class StreamLock {
public:
    explicit StreamLock(std::FILE* stream) : m_stream(stream) { ::flockfile(stream); }
    ~StreamLock() { ::funlockfile(m_stream); }
    StreamLock(const StreamLock&) = delete;
    StreamLock& operator=(const StreamLock&) = delete;

private:
    std::FILE* m_stream;
};

void make_room(std::size_t size, std::FILE* stream) {
    const std::size_t pending = ::__fpending(stream);
    if (pending > 0 && pending + size > ::__fbufsize(stream)) {
        ::fflush_unlocked(stream);
    }
}

}  // namespace

void write_text(std::wstring_view text, std::FILE* stream) {
    const CodePage& code_page = active_code_page();
    Piece piece;
    // Measured first, so that the buffer goes out between texts; a short text is measured and converted at
    // once.
    std::size_t size = 0;
    for (std::size_t at = 0; at < text.size(); at += PIECE) {
        piece.convert(text.substr(at, PIECE), code_page);
        size += piece.size;
    }
    const StreamLock lock(stream);
    make_room(size, stream);
    for (std::size_t at = 0; at < text.size(); at += PIECE) {
        if (text.size() > PIECE) {
            piece.convert(text.substr(at, PIECE), code_page);
        }
        ::fwrite_unlocked(piece.bytes, 1, piece.size, stream);
    }
}

}  // namespace basalt::platform
