#include "angles.h"

#include <cmath>
#include <cstdint>

#include "number_parsing.h"
#include "number_text.h"

namespace {

constexpr std::int64_t SECONDS_PER_TURN = 1296000;

/// A number spelled with digits and a point only.
std::optional<double> digits(std::string_view text) {
    const bool plain = !text.empty() && text.find_first_not_of("0123456789.") == std::string_view::npos;
    return plain ? parse_number(text) : std::nullopt;
}

/// A whole number spelled with digits only.
std::optional<double> whole(std::string_view text) {
    return text.find('.') == std::string_view::npos ? digits(text) : std::nullopt;
}

std::string two_digits(const std::string& text) {
    const std::size_t before_point = text.find('.') == std::string::npos ? text.size() : text.find('.');
    return before_point < 2 ? "0" + text : text;
}

}  // namespace

std::optional<double> parse_angle(std::string_view text) {
    constexpr double TURN = 360.0;
    std::optional<double> degrees;
    const std::size_t first = text.find('-');
    if (first == std::string_view::npos) {
        degrees = digits(text);
    } else if (const std::size_t second = text.find('-', first + 1); second != std::string_view::npos) {
        const std::optional<double> d = whole(text.substr(0, first));
        const std::optional<double> m = whole(text.substr(first + 1, second - first - 1));
        const std::optional<double> s = digits(text.substr(second + 1));
        if (d && m && s && *m < 60.0 && *s < 60.0) {
            degrees = *d + (*m + *s / 60.0) / 60.0;
        }
    }
    return degrees && *degrees < TURN ? std::optional(*degrees * RADIANS_PER_DEGREE) : std::nullopt;
}

std::string dms_text(double radians, int decimals) {
    // Rounded once, as a whole count of the last decimal, so that no part can show 60.
    const auto per_second = static_cast<std::int64_t>(std::llround(std::pow(10.0, decimals)));
    const std::int64_t turn = SECONDS_PER_TURN * per_second;
    const std::int64_t signed_units =
        std::llround(radians / RADIANS_PER_SECOND * static_cast<double>(per_second));
    const std::int64_t units = (signed_units < 0 ? -signed_units : signed_units) % turn;
    const std::int64_t per_minute = 60 * per_second;
    const std::int64_t per_degree = 60 * per_minute;
    const double seconds = static_cast<double>(units % per_minute) / static_cast<double>(per_second);
    std::string text(signed_units < 0 ? "-" : "");
    text += std::to_string(units / per_degree) + "-";
    text += two_digits(std::to_string(units % per_degree / per_minute)) + "-";
    return text + two_digits(fixed_text(seconds, decimals));
}

std::string seconds_text(double radians) {
    return fixed_text(radians / RADIANS_PER_SECOND, 1);
}
