#include "boundary_reader.h"

#include <optional>
#include <string_view>

#include "input_error.h"
#include "number_parsing.h"
#include "text_scanner.h"

namespace {

std::string_view trimmed(std::string_view text) {
    const std::size_t first = text.find_first_not_of(" \t");
    if (first == std::string_view::npos) {
        return {};
    }
    return text.substr(first, text.find_last_not_of(" \t") - first + 1);
}

/// Reads the rest of a line up to a comment, blanks made single; false at the end of the file.
bool next_line(TextScanner& scanner, std::string& text, std::size_t& line) {
    text.clear();
    bool in_comment = false;
    for (;;) {
        const TextScanner::Token token = scanner.next();
        if (token != TextScanner::Token::FIELD) {
            line = scanner.line();
            return token == TextScanner::Token::LINE_END || !text.empty();
        }
        if (in_comment) {
            continue;
        }
        const std::size_t comment = scanner.word().find('#');
        in_comment = comment != std::string_view::npos;
        text += text.empty() ? "" : " ";
        text += scanner.word().substr(0, comment);
        constexpr std::size_t LONGEST_LINE = 4096;
        if (text.size() > LONGEST_LINE) {
            scanner.fail("the line is too long for longitude,latitude");
        }
    }
}

double coordinate(const std::string& path, std::size_t line, std::string_view field, const char* name,
                  double limit) {
    const std::optional<double> value = parse_number(field);
    if (!value) {
        throw InputError(path, line, std::string(name) + " " + quoted(field) + " is not a number");
    }
    if (*value < -limit || *value > limit) {
        throw InputError(path, line, std::string(name) + " " + quoted(field) + " is not in degrees");
    }
    return *value;
}

bool encloses_area(const std::vector<Place>& vertices) {
    const Place& a = vertices[0];
    for (std::size_t i = 2; i < vertices.size(); ++i) {
        const Place& b = vertices[i - 1];
        const Place& c = vertices[i];
        if ((b.longitude - a.longitude) * (c.latitude - a.latitude) !=
            (c.longitude - a.longitude) * (b.latitude - a.latitude)) {
            return true;
        }
    }
    return false;
}

bool same_place(const Place& a, const Place& b) {
    return a.longitude == b.longitude && a.latitude == b.latitude;
}

}  // namespace

std::vector<Place> read_boundary(const std::string& path) {
    TextScanner scanner(path);
    std::vector<Place> vertices;
    std::string text;
    std::size_t line = 0;
    bool may_be_header = true;
    while (next_line(scanner, text, line)) {
        const std::string_view content = trimmed(text);
        if (content.empty()) {
            continue;
        }
        const std::size_t comma = content.find(',');
        if (comma == std::string_view::npos || content.find(',', comma + 1) != std::string_view::npos) {
            throw InputError(path, line, "expected longitude,latitude but found " + quoted(content));
        }
        const std::string_view first = trimmed(content.substr(0, comma));
        const std::string_view second = trimmed(content.substr(comma + 1));
        const bool names =
            !first.empty() && !second.empty() && !begins_number(first) && !begins_number(second);
        if (!(may_be_header && names)) {
            vertices.push_back({coordinate(path, line, first, "longitude", 360.0),
                                coordinate(path, line, second, "latitude", 90.0)});
        }
        may_be_header = false;
    }
    if (vertices.size() > 1 && same_place(vertices.front(), vertices.back())) {
        vertices.pop_back();
    }
    if (vertices.size() < 3) {
        throw InputError(path, line,
                         "a boundary needs three points or more, not " + std::to_string(vertices.size()));
    }
    if (!encloses_area(vertices)) {
        throw InputError(path, line, "the boundary's points lie in one line and enclose nothing");
    }
    return vertices;
}
