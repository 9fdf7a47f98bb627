// A text file as words and line ends, read in large pieces.
#ifndef WORKAREA_TEXT_SCANNER_H
#define WORKAREA_TEXT_SCANNER_H

#include <cstddef>
#include <cstdio>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

/// Splits a file into words (runs without blanks) and line ends. Blanks, tabs and carriage returns separate,
/// so LF and CRLF files read alike; a UTF-8 byte order mark at the start is passed over.
///
/// Memory is one piece whatever the file's size, and a word is handed out as a view into it without a copy.
class TextScanner {
public:
    enum class Token { FIELD, LINE_END, FILE_END };

    /// Opens the file. InputError when that fails.
    explicit TextScanner(std::string path);

    /// The next token. InputError when reading fails or a word is longer than any number or key.
    Token next();
    /// The word found last; valid until the next call of next().
    std::string_view word() const { return m_word; }
    /// Line of the token found last, from 1.
    std::size_t line() const { return m_line; }
    /// Byte column of the token found last, from 1.
    std::size_t column() const { return m_column; }
    const std::string& path() const { return m_path; }

    /// Throws an InputError at the token found last.
    [[noreturn]] void fail(const std::string& message) const;

private:
    struct CloseFile {
        void operator()(std::FILE* file) const { std::fclose(file); }
    };

    bool refill();
    std::size_t offset() const { return m_buffer_offset + m_position; }

    std::string m_path;
    std::unique_ptr<std::FILE, CloseFile> m_file;
    std::vector<char> m_buffer;
    std::size_t m_position = 0;       // next byte to look at
    std::size_t m_end = 0;            // bytes in the buffer
    std::size_t m_buffer_offset = 0;  // file offset of the buffer's first byte
    std::size_t m_line_start = 0;     // file offset of the current line
    std::size_t m_line = 1;
    std::size_t m_column = 1;
    bool m_line_ended = false;
    std::string_view m_word;
};

#endif
