#include "angles.h"

#include <basalt/geo.h>

#include <cmath>

#include "number_parsing.h"
#include "number_text.h"

namespace {

constexpr double SECONDS_PER_TURN = 1296000.0;

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

SineCosine sine_cosine(double radians) {
    geo_nee unit = {};
    geo_grid_follow3({0.0, 0.0, 0.0}, radians, 1.0, 0.0, unit);
    return {unit.east, unit.north};
}

std::optional<double> parse_angle(std::string_view text) {
    constexpr double TURN = 360.0;
    const std::size_t first = text.find('-');
    const std::size_t second = text.find('-', first == std::string_view::npos ? first : first + 1);
    if (first == std::string_view::npos) {
        const std::optional<double> degrees = digits(text);
        return degrees && *degrees < TURN ? std::optional(_degtorad(*degrees)) : std::nullopt;
    }
    if (second == std::string_view::npos) {
        return std::nullopt;
    }
    const std::optional<double> d = whole(text.substr(0, first));
    const std::optional<double> m = whole(text.substr(first + 1, second - first - 1));
    const std::optional<double> s = digits(text.substr(second + 1));
    if (!d || !m || !s || *d >= TURN || *m >= 60.0 || *s >= 60.0) {
        return std::nullopt;
    }
    double radians = 0.0;
    _dmstorad(static_cast<int>(*d), static_cast<int>(*m), *s, &radians);
    return radians;
}

std::string dms_text(double radians, int decimals) {
    // Rounded once, as a whole count of the last decimal, so that no part can show 60.
    const double per_second = std::pow(10.0, decimals);
    const double units = std::fmod(std::round(std::abs(radians) / RADIANS_PER_SECOND * per_second),
                                   SECONDS_PER_TURN * per_second);
    int degrees = 0;
    int minutes = 0;
    double seconds = 0.0;
    _radtodms(units / per_second * RADIANS_PER_SECOND, &degrees, &minutes, &seconds);
    const bool negative = radians < 0.0 && units > 0.0;
    std::string text(negative ? "-" : "");
    text += std::to_string(degrees) + "-" + two_digits(std::to_string(minutes)) + "-";
    return text + two_digits(fixed_text(seconds, decimals));
}

std::string seconds_text(double radians) {
    return fixed_text(radians / RADIANS_PER_SECOND, 1);
}
