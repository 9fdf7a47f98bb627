#include "csv_reader.h"

#include <algorithm>
#include <cerrno>
#include <optional>
#include <system_error>
#include <utility>

#include "input_error.h"
#include "number_parsing.h"

CsvReader::CsvReader(std::string path) : m_path(std::move(path)), m_file(std::fopen(m_path.c_str(), "rb")) {
    if (!m_file) {
        throw InputError(m_path, "cannot be opened: " + std::generic_category().message(errno));
    }
}

/// False at the end of the file.
bool CsvReader::read_line() {
    m_text.clear();
    m_line += m_line_ended ? 1 : 0;
    m_line_ended = false;
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
    return m_line_ended = true;
}

void CsvReader::split() {
    constexpr std::string_view BLANKS = " \t\r\v\f";
    m_record = std::string_view(m_text).substr(0, m_text.find('#'));
    m_record.remove_prefix(m_line == 1 && m_record.starts_with("\xEF\xBB\xBF") ? 3 : 0);
    m_record = m_record.substr(0, m_record.find_last_not_of(BLANKS) + 1);
    m_fields.clear();
    for (std::size_t at = 0; !m_record.empty() && at <= m_record.size();) {
        const std::size_t comma = std::min(m_record.find(',', at), m_record.size());
        const std::size_t first = std::min(m_record.find_first_not_of(BLANKS, at), comma);
        const std::size_t end = first == comma ? comma : m_record.find_last_not_of(BLANKS, comma - 1) + 1;
        m_fields.push_back({m_record.substr(first, end - first), first + 1});
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
    return {m_line, index < m_fields.size() ? m_fields[index].column : m_record.size() + 1};
}

std::string_view CsvReader::text(std::size_t index, const char* expected) const {
    require(index < m_fields.size() && !m_fields[index].text.empty(), index, expected);
    return m_fields[index].text;
}

double CsvReader::number(std::size_t index, const char* expected, double low, double high) const {
    const std::optional<double> value = parse_number(text(index, expected));
    require(value && *value >= low && *value <= high, index, expected);
    return *value;
}

void CsvReader::require(bool is_so, std::size_t index, std::string_view expected) const {
    if (!is_so) {
        const bool ends = index >= m_fields.size();
        fail_at(place(index),
                "expected " + std::string(expected) +
                    (ends ? ", but the line ends here" : ", not " + quoted(m_fields[index].text)));
    }
}

void CsvReader::fail_at(const FilePlace& place, const std::string& message) const {
    throw InputError(m_path, place.line, place.column, message);
}
