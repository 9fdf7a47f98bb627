// Dates and times of day as text: 2024-02-29, 2024-02-29T23:59:59.5, with or without a Z behind the time.
#ifndef TOOLS_TIME_TEXT_H
#define TOOLS_TIME_TEXT_H

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

inline constexpr int SECONDS_OF_DAY = 86400;

/// Last MJD whose year has five digits and fits its record.
inline constexpr std::uint32_t LAST_MJD = 23'257'590;

/// What parse_moment() reads, for messages.
inline constexpr const char* A_TIME = "a time like 2024-02-29 or 2024-02-29T23:59:59.5";

struct Moment {
    std::uint32_t mjd;              ///< whole days since 1858-11-17
    std::optional<double> seconds;  ///< of the day; none for a date alone
};

/// Reads a Gregorian date from 1858-11-17 to 65535-12-31, with or without a time of day. InputError for all
/// else, leap seconds too: the time scales have none.
Moment parse_moment(std::string_view text);

struct Date {
    std::uint16_t year;
    std::uint16_t month;
    std::uint16_t day;
};

Date date_of(std::uint32_t mjd);

std::string date_text(const Date& date);

/// @param seconds 0 to 86400, rounded to so many digits; what rounds up to a day is the next one. InputError
/// for a day behind the last.
std::string moment_text(std::uint32_t mjd, double seconds, int digits);

#endif
