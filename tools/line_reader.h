// A file or standard input, line by line.
#ifndef TOOLS_LINE_READER_H
#define TOOLS_LINE_READER_H

#include <cstddef>
#include <functional>
#include <string>
#include <string_view>
#include <vector>

/// Reads by blocks. A line ends with LF, CRLF or the input; it may hold any byte.
class LineReader {
public:
    /// Bytes of the longest line. A longer one is skipped without being stored.
    static constexpr std::size_t LONGEST = std::size_t{1} << 20;

    /// @param path of a file, or `-` for standard input; InputError when it cannot be opened
    /// @param before_waiting called before each read, which may block
    LineReader(std::string path, std::function<void()> before_waiting);
    ~LineReader();
    LineReader(const LineReader&) = delete;
    LineReader& operator=(const LineReader&) = delete;

    /// Goes to the next line; false at the end. std::runtime_error when the input cannot be read.
    bool next();
    /// The line without its end. Unspecified when it is too long.
    std::string_view line() const { return m_line; }
    bool too_long() const { return m_too_long; }
    /// Counts from 1.
    std::size_t number() const { return m_number; }

private:
    bool fill();
    void skip_rest();
    bool take(std::size_t length, std::size_t end_length);

    std::string m_path;
    int m_file;
    std::function<void()> m_before_waiting;
    std::vector<char> m_block;
    std::size_t m_begin = 0;  ///< start of the unread bytes
    std::size_t m_end = 0;
    std::string_view m_line;
    std::size_t m_number = 0;
    bool m_too_long = false;
};

#endif
