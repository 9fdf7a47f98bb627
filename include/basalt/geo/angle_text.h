/// @file
/// Angles as text in degrees, minutes and seconds. Independent of the locale.
#ifndef BASALT_GEO_ANGLE_TEXT_H
#define BASALT_GEO_ANGLE_TEXT_H

#include <optional>
#include <string>
#include <string_view>

#include "basalt/export.h"

namespace basalt {

/// How format_angle() writes the sign.
enum class AngleStyle {
    sign,       ///< -12-30-00.0
    latitude,   ///< 12-30-00.0S
    longitude,  ///< 12-30-00.0W, within half a turn
};

/// Text of an angle, with two digits or more each for minutes and seconds. Rounded once: no part shows 60.
/// @param radians the angle
/// @param decimals of the seconds, clamped to 0 to 9
/// @param style of the sign; an angle that rounds to 0 has none, and N or E
///
/// Bad input: an empty text for NaN, infinities and angles of 2^53 units of the last decimal and more.
/// Threads: thread-safe. Throws std::bad_alloc when out of memory.
BASALT_API std::string format_angle(double radians, int decimals, AngleStyle style = AngleStyle::sign);

/// Angle in radians of a text: degrees, degrees and minutes, or all three; only the last may have decimals.
///
/// The parts are separated by - or : or spaces, or marked: degrees by a degree sign (UTF-8) or d, minutes by
/// ' or m, seconds by ". The sign is + or - in front, or one letter N, E (positive), S, W (negative) of
/// either case in front or behind; with neither the angle is positive. Spaces in front and behind are
/// ignored.
/// @return radians; nothing when the text is none of these, minutes or seconds are 60 or more, or degrees are
/// beyond 360, 180 with E or W, 90 with N or S
/// Threads: thread-safe. Never throws.
BASALT_API std::optional<double> parse_angle(std::string_view text) noexcept;

}  // namespace basalt

#endif
