#include "basalt/geo/angle_text.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstdint>

#include "src/geo/constants.h"

namespace basalt {

using namespace geo;

namespace {

/// A text that is read from its front.
class Reader {
public:
    explicit Reader(std::string_view text) : m_text(text) { skip_spaces(); }

    bool is_over() const { return m_text.empty(); }
    /// Whether there were any.
    bool skip_spaces() {
        const std::size_t size = std::min(m_text.find_first_not_of(' '), m_text.size());
        m_text.remove_prefix(size);
        return size > 0;
    }

    /// Takes one of some characters; 0 when another one is next.
    char take_any(std::string_view of) {
        if (m_text.empty() || of.find(m_text.front()) == std::string_view::npos) {
            return 0;
        }
        const char taken = m_text.front();
        m_text.remove_prefix(1);
        return taken;
    }
    bool take(std::string_view word) {
        const bool is_next = m_text.substr(0, word.size()) == word;
        m_text.remove_prefix(is_next ? word.size() : 0);
        return is_next;
    }
    /// A number of digits and at most one point.
    std::optional<double> take_number(bool& has_point) {
        const std::size_t size = std::min(m_text.find_first_not_of("0123456789."), m_text.size());
        const char* const end = m_text.data() + size;
        double number = 0.0;
        const auto [rest, error] = std::from_chars(m_text.data(), end, number, std::chars_format::fixed);
        if (size == 0 || rest != end || error != std::errc()) {
            return std::nullopt;
        }
        has_point = m_text.substr(0, size).find('.') != std::string_view::npos;
        m_text.remove_prefix(size);
        return number;
    }

private:
    std::string_view m_text;
};

/// Text of a whole number with at least two digits.
std::string two_digits(std::uint64_t number) {
    const std::string text = std::to_string(number);
    return number < 10 ? "0" + text : text;
}

}  // namespace

std::optional<double> parse_angle(std::string_view text) noexcept {
    constexpr std::string_view LETTERS = "NnEeSsWw";
    constexpr std::string_view MARKS[] = {"d", "'m", "\""};
    constexpr double UNITS[] = {1.0, 60.0, 3600.0};
    Reader reader(text);
    const char sign = reader.take_any("+-");
    char letter = sign == 0 ? reader.take_any(LETTERS) : '\0';
    reader.skip_spaces();
    double degrees = 0.0;
    double radians = 0.0;
    for (int part = 0; part < 3; ++part) {
        bool has_point = false;
        const std::optional<double> number = reader.take_number(has_point);
        if (!number || (part > 0 && *number >= 60.0)) {
            return std::nullopt;
        }
        degrees += *number / UNITS[part];
        radians += *number / UNITS[part] * RADIANS_PER_DEGREE;
        const bool is_marked = (part == 0 && reader.take("\xC2\xB0")) || reader.take_any(MARKS[part]) != 0;
        const bool is_separated = !is_marked && reader.take_any("-:") != 0;
        bool may_continue = reader.skip_spaces() || is_marked || is_separated;
        if (letter == 0 && sign == 0 && !is_separated) {
            letter = reader.take_any(LETTERS);
            reader.skip_spaces();
            may_continue = may_continue && letter == 0;
        }
        if (reader.is_over() && !is_separated) {
            break;
        }
        if (part == 2 || has_point || !may_continue) {
            return std::nullopt;
        }
    }
    const bool is_north_or_south =
        letter != 0 && std::string_view("NnSs").find(letter) != std::string_view::npos;
    const double most = letter == 0 ? 360.0 : is_north_or_south ? 90.0 : 180.0;
    if (degrees > most) {
        return std::nullopt;
    }
    const bool is_negative = sign == '-' || std::string_view("SsWw").find(letter) != std::string_view::npos;
    return is_negative ? -radians : radians;
}

std::string format_angle(double radians, int decimals, AngleStyle style) {
    constexpr double MOST_UNITS = 9007199254740992.0;  // 2^53
    std::uint64_t per_second = 1;
    const int places = std::clamp(decimals, 0, 9);
    for (int i = 0; i < places; ++i) {
        per_second *= 10;
    }
    const double angle = style == AngleStyle::longitude ? std::remainder(radians, TWO_PI) : radians;
    const double size = std::abs(angle);
    const double rounded = std::round(size / RADIANS_PER_DEGREE * 3600.0 * static_cast<double>(per_second));
    if (!(rounded < MOST_UNITS)) {
        return {};
    }
    const auto units = static_cast<std::uint64_t>(rounded);
    const std::uint64_t seconds = units / per_second;
    std::string text =
        std::to_string(seconds / 3600) + "-" + two_digits(seconds / 60 % 60) + "-" + two_digits(seconds % 60);
    if (places > 0) {
        const std::string fraction = std::to_string(units % per_second);
        text.append(".").append(static_cast<std::size_t>(places) - fraction.size(), '0').append(fraction);
    }
    const bool is_negative = units > 0 && angle < 0.0;
    switch (style) {
        case AngleStyle::latitude:
            return text + (is_negative ? "S" : "N");
        case AngleStyle::longitude:
            return text + (is_negative ? "W" : "E");
        default:
            return (is_negative ? "-" : "") + text;
    }
}

}  // namespace basalt
