#include "text_scanner.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <system_error>
#include <utility>

#include "input_error.h"
#include "number_parsing.h"

namespace {

constexpr std::size_t PIECE = std::size_t{1} << 18;
constexpr std::size_t LONGEST_WORD = 1024;

bool is_blank(char c) {
    return c == ' ' || c == '\t' || c == '\r' || c == '\v' || c == '\f';
}

std::string system_message(int code) {
    return std::generic_category().message(code);
}

}  // namespace

TextScanner::TextScanner(std::string path)
    : m_path(std::move(path)), m_file(std::fopen(m_path.c_str(), "rb")), m_buffer(PIECE) {
    if (!m_file) {
        throw InputError(m_path, "cannot be opened: " + system_message(errno));
    }
    // The scanner's own piece is the only buffer the bytes pass through.
    std::setvbuf(m_file.get(), nullptr, _IONBF, 0);
    refill();
    if (m_end >= 3 && std::memcmp(m_buffer.data(), "\xEF\xBB\xBF", 3) == 0) {
        m_position = 3;
        m_line_start = 3;
    }
}

/// Moves what is left to the buffer's front and reads more behind it; false at the end of the file.
bool TextScanner::refill() {
    const std::size_t kept = m_end - m_position;
    std::memmove(m_buffer.data(), m_buffer.data() + m_position, kept);
    m_buffer_offset += m_position;
    m_position = 0;
    const std::size_t got = std::fread(m_buffer.data() + kept, 1, m_buffer.size() - kept, m_file.get());
    if (got == 0 && std::ferror(m_file.get()) != 0) {
        throw InputError(m_path, "cannot be read: " + system_message(errno));
    }
    m_end = kept + got;
    return got != 0;
}

TextScanner::Token TextScanner::next() {
    if (m_line_ended) {
        ++m_line;
        m_line_start = offset();
        m_line_ended = false;
    }
    for (;;) {
        while (m_position < m_end && is_blank(m_buffer[m_position])) {
            ++m_position;
        }
        if (m_position < m_end) {
            break;
        }
        if (!refill()) {
            m_column = offset() - m_line_start + 1;
            return Token::FILE_END;
        }
    }
    m_column = offset() - m_line_start + 1;
    if (m_buffer[m_position] == '\n') {
        ++m_position;
        m_line_ended = true;
        return Token::LINE_END;
    }
    std::size_t length = 0;
    for (;;) {
        while (m_position + length < m_end && !is_blank(m_buffer[m_position + length]) &&
               m_buffer[m_position + length] != '\n') {
            ++length;
        }
        m_word = std::string_view(m_buffer.data() + m_position, std::min(length, LONGEST_WORD));
        if (length > LONGEST_WORD) {
            fail("not text: " + quoted(m_word) + " has no end");
        }
        if (m_position + length < m_end || !refill()) {
            break;
        }
    }
    m_word = std::string_view(m_buffer.data() + m_position, length);
    m_position += length;
    return Token::FIELD;
}

void TextScanner::fail(const std::string& message) const {
    throw InputError(m_path, m_line, m_column, message);
}
