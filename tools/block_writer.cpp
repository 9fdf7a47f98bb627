#include "block_writer.h"

#include <unistd.h>

#include <cerrno>
#include <cstddef>
#include <stdexcept>
#include <string_view>
#include <system_error>

namespace {

constexpr std::size_t BLOCK = std::size_t{1} << 16;

[[noreturn]] void fail() {
    throw std::runtime_error("cannot write to standard output: " + std::generic_category().message(errno));
}

}  // namespace

void BlockWriter::end_of_line() {
    m_text += '\n';
    if (m_text.size() >= BLOCK) {
        flush();
    }
}

void BlockWriter::flush() {
    std::string_view left = m_text;
    while (!left.empty()) {
        const ssize_t count = ::write(STDOUT_FILENO, left.data(), left.size());
        if (count >= 0) {
            m_wrote = true;
            left.remove_prefix(static_cast<std::size_t>(count));
        } else if (errno != EINTR) {
            fail();
        }
    }
    m_text.clear();
}

void BlockWriter::finish() {
    flush();
    if (m_wrote && ::close(STDOUT_FILENO) != 0 && errno != EINTR) {
        fail();
    }
}
