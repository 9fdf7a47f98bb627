#include "line_reader.h"

#include <fcntl.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <stdexcept>
#include <string>
#include <system_error>
#include <utility>

#include "input_error.h"

LineReader::LineReader(std::string path, std::function<void()> before_waiting)
    : m_path(std::move(path)),
      m_file(m_path == "-" ? STDIN_FILENO : ::open(m_path.c_str(), O_RDONLY | O_CLOEXEC)),
      m_before_waiting(std::move(before_waiting)),
      m_block(std::size_t{1} << 16) {
    if (m_file < 0) {
        throw InputError(m_path, "cannot be opened: " + std::generic_category().message(errno));
    }
}

LineReader::~LineReader() {
    if (m_file != STDIN_FILENO) {
        ::close(m_file);
    }
}

/// Appends input to the buffer; false at the end of the input.
bool LineReader::fill() {
    m_before_waiting();
    for (;;) {
        const ssize_t count = ::read(m_file, m_block.data() + m_end, m_block.size() - m_end);
        if (count >= 0) {
            m_end += static_cast<std::size_t>(count);
            return count > 0;
        }
        if (errno != EINTR) {
            throw std::runtime_error("cannot read " + (m_path == "-" ? "standard input" : m_path) + ": " +
                                     std::generic_category().message(errno));
        }
    }
}

bool LineReader::take(std::size_t length, std::size_t end_length) {
    m_line = {m_block.data() + m_begin, length};
    m_begin += length + end_length;
    if (!m_line.empty() && m_line.back() == '\r') {
        m_line.remove_suffix(1);
    }
    m_too_long = m_line.size() > LONGEST;
    return true;
}

/// Skips the rest of a line.
void LineReader::skip_rest() {
    m_too_long = true;
    m_line = {};
    const void* found = nullptr;
    while (found == nullptr) {
        m_begin = m_end = 0;
        if (!fill()) {
            return;
        }
        found = std::memchr(m_block.data(), '\n', m_end);
    }
    m_begin = static_cast<std::size_t>(static_cast<const char*>(found) - m_block.data()) + 1;
}

bool LineReader::next() {
    m_too_long = false;
    ++m_number;
    std::size_t looked_at = 0;
    for (;;) {
        const char* begin = m_block.data() + m_begin;
        const std::size_t there = m_end - m_begin;
        const void* found =
            there > looked_at ? std::memchr(begin + looked_at, '\n', there - looked_at) : nullptr;
        if (found != nullptr) {
            return take(static_cast<std::size_t>(static_cast<const char*>(found) - begin), 1);
        }
        looked_at = there;
        if (m_begin > 0) {
            std::memmove(m_block.data(), begin, there);
            m_begin = 0;
            m_end = there;
        }
        if (there > LONGEST + 1) {  // a CR may still belong to the line's end
            skip_rest();
            return true;
        }
        if (m_end == m_block.size()) {
            m_block.resize(std::min(2 * m_block.size(), LONGEST + (std::size_t{1} << 16)));
        }
        if (!fill()) {
            return m_end > 0 && take(m_end, 0);
        }
    }
}
