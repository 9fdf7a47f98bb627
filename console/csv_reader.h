// Comma-separated files, line by line, with the place of every field.
#ifndef CONSOLE_CSV_READER_H
#define CONSOLE_CSV_READER_H

#include <cstddef>
#include <cstdio>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

/// A position in a file; both count from 1, columns in bytes.
struct FilePlace {
    std::size_t line;
    std::size_t column;
};

/// Reads records of fields between commas. Blanks around a field are no part of it, `#` begins a comment,
/// lines without fields are passed over, LF and CRLF files read alike, and a UTF-8 byte order mark is
/// skipped. There is no quoting: a field holds no comma and no `#`. A line, its comment included, has at most
/// LONGEST_LINE bytes.
///
/// A mismatch is an InputError with file, line, column and what was expected.
class CsvReader {
public:
    static constexpr std::size_t LONGEST_LINE = 4096;

    /// Opens the file. InputError when that fails.
    explicit CsvReader(std::string path);

    /// Goes to the next record; false at the end of the file.
    bool next();

    /// Line of the record, or the last line at the end of the file.
    std::size_t line() const { return m_line; }
    /// The record as a whole, without its comment.
    std::string_view record() const { return m_record; }
    std::size_t fields() const { return m_fields.size(); }
    /// A field that there is, empty or not.
    std::string_view field(std::size_t index) const { return m_fields[index].text; }
    /// Position of a field, or of the line's end after the last field.
    FilePlace place(std::size_t index) const;
    /// A required field; `expected` describes it for the error.
    std::string_view text(std::size_t index, const char* expected) const;
    /// A finite number from `low` to `high`.
    double number(std::size_t index, const char* expected, double low, double high) const;
    /// Refuses fields beyond the first `count`.
    void expect_end(std::size_t count) const { require(m_fields.size() <= count, count, "the line to end"); }

    /// Throws `expected ..., not 'field'`, or `... but the line ends here`, unless the field is as expected.
    void require(bool is_so, std::size_t index, std::string_view expected) const;
    /// Throws a message about an earlier place.
    [[noreturn]] void fail_at(const FilePlace& place, const std::string& message) const;

private:
    struct CloseFile {
        void operator()(std::FILE* file) const { std::fclose(file); }
    };
    struct Field {
        std::string_view text;
        std::size_t column;
    };

    bool read_line();
    void split();

    std::string m_path;
    std::unique_ptr<std::FILE, CloseFile> m_file;
    std::string m_text;
    std::string_view m_record;
    std::size_t m_line = 0;
    bool m_line_ended = true;
    std::vector<Field> m_fields;
};

#endif
