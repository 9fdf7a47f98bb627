#include "angles.h"

#include <basalt/geo.h>

#include <algorithm>
#include <optional>

SineCosine sine_cosine(double radians) {
    geo_nee unit = {};
    geo_grid_follow3({0.0, 0.0, 0.0}, radians, 1.0, 0.0, unit);
    return {unit.east, unit.north};
}

double read_angle(const CsvReader& csv, std::size_t index, const std::string& what) {
    const std::string expected = what + " from 0 to below 360 degrees, as 12.5 or 12-30-00";
    const std::string_view text = csv.text(index, expected.c_str());
    // The library reads more: degrees and minutes alone, other separators, signs and letters.
    const bool is_plain = text.find_first_not_of("0123456789.-") == std::string_view::npos &&
                          text[0] != '-' && std::count(text.begin(), text.end(), '-') % 2 == 0;
    const std::optional<double> angle = is_plain ? basalt::parse_angle(text) : std::nullopt;
    const double radians = angle.value_or(2.0 * PI);
    csv.require(radians < 2.0 * PI, index, expected);
    return radians;
}

std::string dms_text(double radians, int decimals) {
    const std::string text = basalt::format_angle(radians, decimals);
    return text.starts_with("360-") ? basalt::format_angle(0.0, decimals) : text;
}
