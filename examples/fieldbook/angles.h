// Angles as field books and reports write them.
#ifndef FIELDBOOK_ANGLES_H
#define FIELDBOOK_ANGLES_H

#include <optional>
#include <string>
#include <string_view>

inline constexpr double PI = 3.141592653589793;
inline constexpr double RADIANS_PER_DEGREE = PI / 180.0;
inline constexpr double RADIANS_PER_SECOND = PI / 648000.0;

struct SineCosine {
    double sine, cosine;
};

/// Sine and cosine by way of the library, whose results are the same on every processor.
SineCosine sine_cosine(double radians);

/// Radians from decimal degrees (`123.5`) or degrees, minutes and seconds (`123-30-00.0`) in [0, 360);
/// nothing if the text is neither. Minutes and seconds are below 60.
std::optional<double> parse_angle(std::string_view text);

/// `123-30-00.0` with so many decimals of a second; 60 seconds carry, and 360 degrees become 0.
std::string dms_text(double radians, int decimals);

/// Seconds of arc with one decimal.
std::string seconds_text(double radians);

#endif
