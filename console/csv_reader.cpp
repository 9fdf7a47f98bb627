#include "csv_reader.h"

#include <algorithm>
#include <cerrno>
#include <optional>
#include <system_error>
#include <utility>

#include "input_error.h"
#include "number_parsing.h"

namespace {

constexpr std::string_view BLANKS = " \t\r\v\f";

}  // namespace

CsvReader::CsvReader(std::string path) : m_path(std::move(path)), m_file(std::fopen(m_path.c_str(), "rb")) {
    if (!m_file) {
        throw InputError(m_path, "cannot be opened: " + std::generic_category().message(errno));
    }
}

/// False at the end of the file.
bool CsvReader::read_line() {
    m_text.clear();
    ++m_line;
    for (int c = std::getc(m_file.get()); c != '\n'; c = std::getc(m_file.get())) {
        if (c == EOF) {
            if (std::ferror(m_file.get()) != 0) {
                throw InputError(m_path, "cannot be read: " + std::generic_category().message(errno));
            }
            return !m_text.empty();
        }
        if (m_text.size() == LONGEST_LINE) {
            throw InputError(
                m_path, m_line, 1,
                "the line is longer than " + std::to_string(LONGEST_LINE) + " bytes: " + quoted(m_text));
        }
        m_text += static_cast<char>(c);
    }
    return true;
}

void CsvReader::split() {
    const std::string_view line = std::string_view(m_text).substr(0, m_text.find('#'));
    const std::size_t start = m_line == 1 && line.substr(0, 3) == "\xEF\xBB\xBF" ? 3 : 0;
    m_fields.clear();
    const std::size_t last = line.find_last_not_of(BLANKS);
    m_end_column = last == std::string_view::npos ? 1 : last + 2 - start;
    if (last == std::string_view::npos || last < start) {
        return;
    }
    for (std::size_t at = start;;) {
        const std::size_t comma = std::min(line.find(',', at), line.size());
        const std::size_t first = std::min(line.find_first_not_of(BLANKS, at), comma);
        const std::size_t end = first == comma ? comma : line.find_last_not_of(BLANKS, comma - 1) + 1;
        m_fields.push_back({line.substr(first, end - first), first + 1 - start});
        if (comma == line.size()) {
            return;
        }
        at = comma + 1;
    }
}

bool CsvReader::next() {
    while (read_line()) {
        split();
        if (!m_fields.empty()) {
            return true;
        }
    }
    return false;
}

FilePlace CsvReader::place(std::size_t index) const {
    return {m_line, index < m_fields.size() ? m_fields[index].column : m_end_column};
}

std::string_view CsvReader::text(std::size_t index, const char* expected) const {
    if (index >= m_fields.size() || m_fields[index].text.empty()) {
        fail(index, expected);
    }
    return m_fields[index].text;
}

double CsvReader::number(std::size_t index, const char* expected, double low, double high) const {
    const std::optional<double> value = parse_number(text(index, expected));
    if (!value || *value < low || *value > high) {
        fail(index, expected);
    }
    return *value;
}

void CsvReader::expect_end(std::size_t count) const {
    if (m_fields.size() > count) {
        fail(count, "the line to end");
    }
}

void CsvReader::fail(std::size_t index, const std::string& expected) const {
    fail_at(place(index), "expected " + expected +
                              (index < m_fields.size() ? ", not " + quoted(m_fields[index].text)
                                                       : ", but the line ends here"));
}

void CsvReader::fail_at(const FilePlace& place, const std::string& message) const {
    throw InputError(m_path, place.line, place.column, message);
}
