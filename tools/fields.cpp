#include "fields.h"

#include <basalt/geo.h>

#include <algorithm>
#include <cmath>
#include <numbers>
#include <optional>
#include <string>

#include "input_error.h"
#include "number_parsing.h"

namespace {

bool is_blank(char c) {
    return c == ' ' || c == '\t';
}

std::string_view trimmed(std::string_view text) {
    while (!text.empty() && is_blank(text.front())) {
        text.remove_prefix(1);
    }
    while (!text.empty() && is_blank(text.back())) {
        text.remove_suffix(1);
    }
    return text;
}

}  // namespace

std::string_view Fields::text(const char* what) {
    while (m_at < m_line.size() && is_blank(m_line[m_at])) {
        ++m_at;
    }
    if (m_ended || (m_at == m_line.size() && !m_format.csv)) {
        throw InputError("expected " + std::string(what) + ", but the line ends before it");
    }
    const std::size_t begin = m_at;
    if (m_format.csv) {
        const std::size_t comma = m_line.find(',', begin);
        m_ended = comma == std::string_view::npos;
        m_at = m_ended ? m_line.size() : comma + 1;
        return trimmed(m_line.substr(begin, comma - begin));
    }
    while (m_at < m_line.size() && !is_blank(m_line[m_at])) {
        ++m_at;
    }
    return m_line.substr(begin, m_at - begin);
}

void Fields::fail(const char* what, std::string_view found) const {
    const bool commas = !m_format.csv && found.find(',') != std::string_view::npos;
    throw InputError("expected " + std::string(what) + ", not " + quoted(found) +
                     (commas ? " (--csv reads commas)" : ""));
}

double Fields::number(const char* what, double low, double high) {
    const std::string_view field = text(what);
    const std::optional<double> value = parse_number(field);
    if (!value || *value < low || *value > high) {
        fail(what, field);
    }
    return *value;
}

std::int64_t Fields::whole(const char* what, std::int64_t low, std::int64_t high) {
    const std::string_view field = text(what);
    const std::optional<std::int64_t> value = parse_integer(field);
    if (!value || *value < low || *value > high) {
        fail(what, field);
    }
    return *value;
}

double Fields::angle(const char* what, std::string_view wrong_letters) {
    const std::string_view field = text(what);
    if (const std::optional<double> value = parse_number(field)) {
        return m_format.degrees ? _degtorad(*value) : *value;
    }
    const std::optional<double> radians = basalt::parse_angle(field);
    if (!radians || field.find_first_of(wrong_letters) != std::string_view::npos) {
        fail(what, field);
    }
    return *radians;
}

double Fields::latitude() {
    constexpr double POLE = std::numbers::pi / 2;
    // Rounding to few digits may carry a pole beyond 90 degrees.
    constexpr double SLACK = 1e-7;
    const std::size_t begin = m_at;
    const double radians = angle("a latitude", "EWew");
    if (std::abs(radians) > POLE + SLACK) {
        m_at = begin;
        m_ended = false;
        throw InputError("latitude " + std::string(text("a latitude").substr(0, 40)) +
                         (m_format.degrees ? " is beyond 90 degrees"
                                           : " is beyond pi/2 radians (--degrees reads degrees)"));
    }
    return std::clamp(radians, -POLE, POLE);
}

std::string_view Fields::whole_line() {
    m_at = m_line.size();
    m_ended = true;
    return m_line;
}

std::string_view Fields::rest() const {
    return trimmed(m_line.substr(m_at));
}
