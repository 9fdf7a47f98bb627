#include "esri_grid_reader.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <cmath>
#include <limits>
#include <optional>
#include <string_view>
#include <system_error>
#include <utility>

#include "input_error.h"
#include "number_parsing.h"

namespace {

enum Key : std::size_t { COLUMNS, ROWS, X_CORNER, X_CENTRE, Y_CORNER, Y_CENTRE, CELL_SIZE, NO_DATA };
const std::array<std::string, 8> KEYS = {"ncols",     "nrows",     "xllcorner", "xllcenter",
                                         "yllcorner", "yllcenter", "cellsize",  "nodata_value"};  // as Key

bool is_blank(int c) {
    return c == ' ' || c == '\t' || c == '\r' || c == '\v' || c == '\f';
}

}  // namespace

EsriGridReader::EsriGridReader(std::string path)
    : m_path(std::move(path)), m_file(std::fopen(m_path.c_str(), "rb")) {
    if (!m_file) {
        throw InputError(m_path, "cannot be opened: " + std::generic_category().message(errno));
    }
    advance();
    if (m_word.starts_with("\xEF\xBB\xBF")) {
        m_word.erase(0, 3);
        m_read -= 3;
        if (m_word.empty()) {
            advance();
        }
    }
    read_header();
}

int EsriGridReader::get() {
    ++m_read;
    return getc_unlocked(m_file.get());
}

/// Goes to the next word or end of a line.
void EsriGridReader::advance() {
    if (m_token == Token::LINE_END) {
        ++m_line;
        m_read = 0;
    }
    int c = get();
    while (is_blank(c)) {
        c = get();
    }
    m_column = m_read;
    m_word.clear();
    for (; c != '\n' && c != EOF && !is_blank(c); c = get()) {
        constexpr std::size_t LONGEST_WORD = 1024;
        if (m_word.size() == LONGEST_WORD) {
            require(false, "not text: " + quoted(m_word) + " has no end");
        }
        m_word += static_cast<char>(c);
    }
    if (c == EOF && std::ferror(m_file.get()) != 0) {
        throw InputError(m_path, "cannot be read: " + std::generic_category().message(errno));
    }
    m_token = c == EOF ? Token::FILE_END : Token::LINE_END;
    if (!m_word.empty()) {
        m_token = Token::WORD;
        std::ungetc(c, m_file.get());
        --m_read;
    }
}

/// Throws at the current word.
void EsriGridReader::require(bool is_so, const std::string& message) const {
    if (!is_so) {
        throw InputError(m_path, m_line, m_column, message);
    }
}

void EsriGridReader::require_in_line(bool is_so, const std::string& message) const {
    if (!is_so) {
        throw InputError(m_path, m_line, message);
    }
}

double EsriGridReader::header_value(std::size_t key) const {
    const std::optional<double> value = parse_any_number<double>(m_word);
    if (key == COLUMNS || key == ROWS) {
        const std::optional<std::int64_t> count = parse_integer(m_word);
        require(count && *count >= 1 && *count <= std::numeric_limits<int>::max(),
                KEYS[key] + " must be a whole number from 1 to 2147483647, not " + quoted(m_word));
    }
    require(value && (key == NO_DATA || std::isfinite(*value)),
            KEYS[key] + " must be a number, not " + quoted(m_word));
    constexpr double SMALLEST_CELL = 1e-9;  // degrees: a tenth of a millimetre
    require(key != CELL_SIZE || *value >= SMALLEST_CELL,
            KEYS[key] + " must be 1e-9 degrees or more, not " + quoted(m_word));
    return *value;
}

void EsriGridReader::read_header() {
    Header header;
    for (; m_token != Token::FILE_END; advance()) {
        if (m_token == Token::LINE_END) {
            continue;
        }
        if (begins_number(m_word)) {
            break;  // no key does
        }
        std::string name = m_word;
        std::transform(name.begin(), name.end(), name.begin(),
                       [](char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c; });
        const auto key = static_cast<std::size_t>(std::find(KEYS.begin(), KEYS.end(), name) - KEYS.begin());
        require(key < KEYS.size(), "unknown header key " + quoted(m_word));
        require(!header[key], "header key " + name + " is given twice");
        advance();
        require(m_token == Token::WORD, "header key " + name + " has no value");
        header[key] = header_value(key);
        advance();
        require(m_token != Token::WORD, "header key " + name + " has more than one value");
    }
    place_grid(header);
}

/// Place and size of the grid from the header's values.
void EsriGridReader::place_grid(const Header& header) {
    for (const Key key : {COLUMNS, ROWS, CELL_SIZE}) {
        require_in_line(header[key].has_value(), "the header lacks " + KEYS[key]);
    }
    m_frame.columns = static_cast<int>(*header[COLUMNS]);
    m_frame.rows = static_cast<int>(*header[ROWS]);
    m_frame.cell_size = *header[CELL_SIZE];
    const auto lower_edge = [&](Key corner, Key centre) {
        require_in_line(header[corner] || header[centre],
                        "the header lacks " + KEYS[corner] + " or " + KEYS[centre]);
        require_in_line(!header[corner] || !header[centre],
                        "the header gives both " + KEYS[corner] + " and " + KEYS[centre]);
        return header[corner] ? *header[corner] : *header[centre] - 0.5 * m_frame.cell_size;
    };
    m_frame.west = lower_edge(X_CORNER, X_CENTRE);
    m_frame.south = lower_edge(Y_CORNER, Y_CENTRE);
    m_no_data = header[NO_DATA].value_or(m_no_data);

    // A grid in metres read as degrees would give plausible nonsense. A global grid may overshoot its limits
    // by the rounding of a cell size such as 0.000833333.
    constexpr double SLACK = 1e-3;
    constexpr double WIDEST = 90.0;
    if (m_frame.south < -90.0 - SLACK || m_frame.north() > 90.0 + SLACK || m_frame.west < -360.0 - SLACK ||
        m_frame.east() > 360.0 + SLACK || m_frame.columns * m_frame.cell_size > 360.0 + SLACK) {
        throw InputError(m_path, "the grid's corner and cell size are not geographic degrees");
    }
    if (std::max(m_frame.columns, m_frame.rows) * m_frame.cell_size > WIDEST) {
        throw InputError(m_path, "the grid is more than 90 degrees wide or high, too much for one plane");
    }
}

/// The current word as an elevation.
double EsriGridReader::elevation() const {
    const std::optional<double> value = parse_any_number<double>(m_word);
    if (!value) {
        require(false, quoted(m_word) + " is not a number");
    }
    if (*value == m_no_data || (std::isnan(*value) && std::isnan(m_no_data))) {
        return NO_ELEVATION;
    }
    if (!(std::abs(*value) <= LARGEST_ELEVATION)) {
        require(false, quoted(m_word) + " is no elevation in metres, nor the header's NODATA_value");
    }
    return *value;
}

bool EsriGridReader::next_row(std::vector<double>& elevations) {
    while (m_token == Token::LINE_END) {
        advance();
    }
    const std::string rows = std::to_string(m_frame.rows);
    if (m_rows_read == m_frame.rows) {
        require_in_line(m_token != Token::WORD, "more rows than nrows says (" + rows + ")");
        return false;
    }
    require_in_line(m_token == Token::WORD,
                    "the file ends after " + std::to_string(m_rows_read) + " of " + rows + " rows");
    // The row grows with what is really there: a header that lies about ncols costs no memory.
    const auto columns = static_cast<std::size_t>(m_frame.columns);
    elevations.clear();
    for (; m_token == Token::WORD; advance()) {
        if (elevations.size() == columns) {
            require(false, "more values than ncols says (" + std::to_string(columns) + ")");
        }
        elevations.push_back(elevation());
    }
    require(elevations.size() == columns, "the row ends after " + std::to_string(elevations.size()) + " of " +
                                              std::to_string(columns) + " values");
    ++m_rows_read;
    return true;
}
