#include "row.h"

#include <basalt/geo.h>

#include <charconv>
#include <cmath>
#include <numbers>

#include "input_error.h"

namespace {

constexpr double TURN = 2 * std::numbers::pi;

}  // namespace

void Row::separate() {
    if (!m_first) {
        m_text += m_format.separator;
    }
    m_first = false;
}

void Row::number(double value, int digits) {
    if (!std::isfinite(value)) {
        throw InputError("the result is not finite");
    }
    separate();
    char buffer[400];  // the largest double has 309 digits
    const char* begin = buffer;
    const char* end =
        std::to_chars(buffer, buffer + sizeof buffer, value, std::chars_format::fixed, digits).ptr;
    if (buffer[0] == '-' &&
        std::string_view(begin, end).find_first_not_of("0.", 1) == std::string_view::npos) {
        ++begin;
    }
    m_text.append(begin, end);
}

double Row::in_unit(double radians) const {
    return m_format.degrees ? radians * (180 / std::numbers::pi) : radians;
}

void Row::bearing(double radians) {
    const double half_a_digit = 0.5 * std::pow(10, -m_format.angle_digits());
    const double value = in_unit(_normalisedbearing(radians));
    number(in_unit(TURN) - value <= half_a_digit ? 0 : value, m_format.angle_digits());
}

void Row::longitude(double radians) {
    angle(std::abs(radians) > std::numbers::pi ? std::remainder(radians, TURN) : radians);
}

void Row::whole(std::int64_t value) {
    separate();
    char buffer[32];
    m_text.append(buffer, std::to_chars(buffer, buffer + sizeof buffer, value).ptr);
}

void Row::text(std::string_view value) {
    separate();
    m_text += value;
}

void Row::any_text(std::string_view value) {
    if (!m_format.csv || value.find_first_of(",\"") == std::string_view::npos) {
        text(value);
        return;
    }
    separate();
    m_text += '"';
    for (const char c : value) {
        m_text.append(c == '"' ? 2 : 1, c);
    }
    m_text += '"';
}
