#include "esri_grid_reader.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <limits>
#include <optional>

#include "input_error.h"
#include "number_parsing.h"

namespace {

using Token = TextScanner::Token;

enum Key { COLUMNS, ROWS, X_CORNER, X_CENTRE, Y_CORNER, Y_CENTRE, CELL_SIZE, NO_DATA, KEY_COUNT };
constexpr std::array<std::string_view, KEY_COUNT> KEYS = {
    "ncols", "nrows", "xllcorner", "xllcenter", "yllcorner", "yllcenter", "cellsize", "nodata_value"};

constexpr double SMALLEST_CELL = 1e-9;  // degrees: a tenth of a millimetre

using Header = std::array<std::optional<double>, KEY_COUNT>;

std::string lower_case(std::string_view word) {
    std::string lower(word);
    std::transform(lower.begin(), lower.end(), lower.begin(),
                   [](char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c; });
    return lower;
}

double parse_header_value(const TextScanner& scanner, Key key) {
    const std::string_view word = scanner.word();
    const std::string name(KEYS[key]);
    if (key == COLUMNS || key == ROWS) {
        const std::optional<std::int64_t> count = parse_integer(word);
        if (!count || *count < 1 || *count > std::numeric_limits<int>::max()) {
            scanner.fail(name + " must be a whole number from 1 to 2147483647, not " + quoted(word));
        }
        return static_cast<double>(*count);
    }
    if (key == NO_DATA) {
        const std::optional<double> value = parse_any_number<double>(word);
        if (!value) {
            scanner.fail(name + " must be a number, not " + quoted(word));
        }
        return *value;
    }
    const std::optional<double> value = parse_number(word);
    if (!value) {
        scanner.fail(name + " must be a number, not " + quoted(word));
    }
    if (key == CELL_SIZE && *value < SMALLEST_CELL) {
        scanner.fail(name + " must be 1e-9 degrees or more, not " + quoted(word));
    }
    return *value;
}

/// Lower edge of the grid on one axis, from whichever of corner and centre is given.
double lower_edge(const Header& header, Key corner, Key centre, double cell_size,
                  const TextScanner& scanner) {
    if (header[corner].has_value() == header[centre].has_value()) {
        throw InputError(scanner.path(), scanner.line(),
                         "the header " + std::string(header[corner] ? "gives both " : "lacks ") +
                             std::string(KEYS[corner]) + (header[corner] ? " and " : " or ") +
                             std::string(KEYS[centre]));
    }
    return header[corner] ? *header[corner] : *header[centre] - 0.5 * cell_size;
}

}  // namespace

EsriGridReader::EsriGridReader(const std::string& path) : m_scanner(path) {
    read_header();
}

void EsriGridReader::read_header() {
    Header header;
    for (m_token = m_scanner.next(); m_token != Token::FILE_END; m_token = m_scanner.next()) {
        if (m_token == Token::LINE_END) {
            continue;
        }
        if (begins_number(m_scanner.word())) {
            break;  // no key does
        }
        const auto found = std::find(KEYS.begin(), KEYS.end(), lower_case(m_scanner.word()));
        if (found == KEYS.end()) {
            m_scanner.fail("unknown header key " + quoted(m_scanner.word()));
        }
        const auto key = static_cast<Key>(found - KEYS.begin());
        if (header[key]) {
            m_scanner.fail("header key " + std::string(*found) + " is given twice");
        }
        if (m_scanner.next() != Token::FIELD) {
            m_scanner.fail("header key " + std::string(*found) + " has no value");
        }
        header[key] = parse_header_value(m_scanner, key);
        if (m_scanner.next() == Token::FIELD) {
            m_scanner.fail("header key " + std::string(*found) + " has more than one value");
        }
    }
    for (const Key key : {COLUMNS, ROWS, CELL_SIZE}) {
        if (!header[key]) {
            throw InputError(m_scanner.path(), m_scanner.line(),
                             "the header lacks " + std::string(KEYS[key]));
        }
    }
    m_frame.columns = static_cast<int>(*header[COLUMNS]);
    m_frame.rows = static_cast<int>(*header[ROWS]);
    m_frame.cell_size = *header[CELL_SIZE];
    m_frame.west = lower_edge(header, X_CORNER, X_CENTRE, m_frame.cell_size, m_scanner);
    m_frame.south = lower_edge(header, Y_CORNER, Y_CENTRE, m_frame.cell_size, m_scanner);
    m_no_data = header[NO_DATA].value_or(m_no_data);

    // A grid in metres read as degrees would give plausible nonsense. A global grid may overshoot its limits
    // by the rounding of a cell size such as 0.000833333.
    constexpr double SLACK = 1e-3;
    constexpr double WIDEST = 90.0;
    if (m_frame.south < -90.0 - SLACK || m_frame.north() > 90.0 + SLACK || m_frame.west < -360.0 - SLACK ||
        m_frame.east() > 360.0 + SLACK || m_frame.columns * m_frame.cell_size > 360.0 + SLACK) {
        throw InputError(m_scanner.path(), "the grid's corner and cell size are not geographic degrees");
    }
    if (std::max(m_frame.columns, m_frame.rows) * m_frame.cell_size > WIDEST) {
        throw InputError(m_scanner.path(),
                         "the grid is more than 90 degrees wide or high, too much for one plane");
    }
}

double EsriGridReader::parse_elevation() const {
    const std::optional<double> value = parse_any_number<double>(m_scanner.word());
    if (!value) {
        m_scanner.fail(quoted(m_scanner.word()) + " is not a number");
    }
    if (*value == m_no_data || (std::isnan(*value) && std::isnan(m_no_data))) {
        return NO_ELEVATION;
    }
    if (!(std::abs(*value) <= LARGEST_ELEVATION)) {
        m_scanner.fail(quoted(m_scanner.word()) +
                       " is no elevation in metres, nor the header's NODATA_value");
    }
    return *value;
}

bool EsriGridReader::next_row(std::vector<double>& elevations) {
    while (m_token == Token::LINE_END) {
        m_token = m_scanner.next();
    }
    if (m_rows_read == m_frame.rows) {
        if (m_token == Token::FIELD) {
            throw InputError(m_scanner.path(), m_scanner.line(),
                             "more rows than nrows says (" + std::to_string(m_frame.rows) + ")");
        }
        return false;
    }
    if (m_token == Token::FILE_END) {
        throw InputError(m_scanner.path(), m_scanner.line(),
                         "the file ends after " + std::to_string(m_rows_read) + " of " +
                             std::to_string(m_frame.rows) + " rows");
    }
    // The row grows with what is really there: a header that lies about ncols costs no memory.
    const auto columns = static_cast<std::size_t>(m_frame.columns);
    elevations.clear();
    for (; m_token == Token::FIELD; m_token = m_scanner.next()) {
        if (elevations.size() == columns) {
            m_scanner.fail("more values than ncols says (" + std::to_string(columns) + ")");
        }
        elevations.push_back(parse_elevation());
    }
    if (elevations.size() != columns) {
        m_scanner.fail("the row ends after " + std::to_string(elevations.size()) + " of " +
                       std::to_string(columns) + " values");
    }
    ++m_rows_read;
    return true;
}
