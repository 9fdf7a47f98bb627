#include "angles.h"

#include <algorithm>
#include <optional>

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

geo_nee read_coordinates(const CsvReader& csv, std::size_t index) {
    constexpr double LARGEST_ELEVATION = 1e5;
    geo_nee point = {};
    point.north = csv.number(index, "a north coordinate in metres", -LARGEST_COORDINATE, LARGEST_COORDINATE);
    point.east =
        csv.number(index + 1, "an east coordinate in metres", -LARGEST_COORDINATE, LARGEST_COORDINATE);
    point.elevation = csv.number(index + 2, "an elevation in metres", -LARGEST_ELEVATION, LARGEST_ELEVATION);
    return point;
}

std::string dms_text(double radians, int decimals) {
    const std::string text = basalt::format_angle(radians, decimals);
    return text.starts_with("360-") ? basalt::format_angle(0.0, decimals) : text;
}
