// Calendar time, Modified Julian Date, GPS time, milliseconds since 1970.
#include <basalt/geo.h>

#include <algorithm>
#include <cmath>
#include <optional>

#include "commands.h"
#include "input_error.h"
#include "number_parsing.h"
#include "time_text.h"

namespace {

constexpr std::uint32_t GPS_EPOCH = 44244;
/// The library keeps 16 bits of the days since 1980-01-06.
constexpr std::uint32_t LAST_GPS_DAY = GPS_EPOCH + 65535;
constexpr int SECONDS_OF_WEEK = 7 * SECONDS_OF_DAY;

/// Whether a text begins like 9:05 or T09:05:00.
bool begins_time_of_day(std::string_view text) {
    const auto skip_digits = [&text] {
        const std::size_t count = std::min(text.find_first_not_of("0123456789"), text.size());
        text.remove_prefix(count);
        return count;
    };
    text.remove_prefix(!text.empty() && (text[0] == 'T' || text[0] == 't') ? 1 : 0);
    const std::size_t hour = skip_digits();
    if (hour < 1 || hour > 2 || text.empty() || text[0] != ':') {
        return false;
    }
    text.remove_prefix(1);
    return skip_digits() == 2;
}

/// A date alone means midnight: refuse a line whose time of day was split off by a blank.
Moment read_moment(Fields& fields) {
    const Moment moment = parse_moment(fields.text(A_TIME));
    if (!moment.seconds && begins_time_of_day(fields.rest())) {
        throw InputError("expected nothing but a T between the date and " + quoted(fields.rest()));
    }
    return moment;
}

void write_mjd(Fields& fields, Row& row, int digits) {
    const Moment moment = read_moment(fields);
    if (!moment.seconds) {
        row.whole(moment.mjd);
        return;
    }
    // Separately from the days, which would cost digits of the fraction.
    const double unit = std::pow(10, digits);
    const double fraction = std::round(*moment.seconds / SECONDS_OF_DAY * unit);
    const std::int64_t days = std::int64_t{moment.mjd} + (fraction >= unit ? 1 : 0);
    std::string decimals = std::to_string(static_cast<std::int64_t>(fraction >= unit ? 0 : fraction));
    decimals.insert(0, static_cast<std::size_t>(digits) - decimals.size(), '0');
    row.text(std::to_string(days).append(".").append(decimals));
}

void read_mjd(Fields& fields, Row& row, int digits) {
    const std::string_view text = fields.text("an MJD");
    const std::size_t point = std::min(text.find('.'), text.size());
    const std::optional<std::int64_t> days = parse_integer(text.substr(0, point));
    const std::string_view decimals = text.substr(point);
    if (!days || *days < 0 || *days > LAST_MJD || text[0] == '+' || text[0] == '-' ||
        decimals.find_first_not_of("0123456789", 1) != std::string_view::npos || decimals.size() == 1) {
        throw InputError("expected an MJD from 0 to below " + std::to_string(LAST_MJD + 1) + ", not " +
                         quoted(text));
    }
    const auto mjd = static_cast<std::uint32_t>(*days);
    if (decimals.empty()) {
        row.text(date_text(date_of(mjd)));
        return;
    }
    row.text(moment_text(mjd, parse_number(decimals).value_or(0) * SECONDS_OF_DAY, digits));
}

Work make_mjd(const CommandLine& line, const Format& format) {
    if (has_flag(line, INVERSE)) {
        return [digits = format.precision](Fields& fields, Row& row) { read_mjd(fields, row, digits); };
    }
    return [digits = format.day_digits()](Fields& fields, Row& row) { write_mjd(fields, row, digits); };
}

void write_gps(Fields& fields, Row& row, int digits) {
    const Moment moment = read_moment(fields);
    if (moment.mjd < GPS_EPOCH || moment.mjd > LAST_GPS_DAY) {
        throw InputError("GPS time is known from 1980-01-06 to 2159-06-11");
    }
    std::uint16_t week = 0;
    double seconds = 0;
    _mjd2gps(moment.mjd, moment.seconds.value_or(0), week, seconds);
    const double unit = std::pow(10, digits);
    const bool next = std::round(seconds * unit) >= SECONDS_OF_WEEK * unit;
    row.whole(week + (next ? 1 : 0));
    row.seconds(next ? 0 : seconds);
}

void read_gps(Fields& fields, Row& row, int digits) {
    const auto week = static_cast<std::uint16_t>(fields.whole("a GPS week, 0 to 9362", 0, 9362));
    const double seconds =
        fields.number("seconds of the week, 0 to below 604800", 0, std::nextafter(SECONDS_OF_WEEK, 0.0));
    const double days = std::floor(seconds / SECONDS_OF_DAY);
    const auto mjd = static_cast<std::uint32_t>(_gps2mjd(week, 0) + days);
    if (mjd > LAST_GPS_DAY) {
        throw InputError("GPS time is known from 1980-01-06 to 2159-06-11");
    }
    row.text(moment_text(mjd, seconds - days * SECONDS_OF_DAY, digits));
}

Work make_gps(const CommandLine& line, const Format& format) {
    const auto convert = has_flag(line, INVERSE) ? read_gps : write_gps;
    return [convert, digits = format.precision](Fields& fields, Row& row) { convert(fields, row, digits); };
}

constexpr int LAST_JAVA_YEAR = 30827;

void write_javatime(Fields& fields, Row& row) {
    const Moment moment = read_moment(fields);
    const Date date = date_of(moment.mjd);
    if (date.year < 1970 || date.year > LAST_JAVA_YEAR) {
        throw InputError("expected a time from 1970 to 30827");
    }
    SYSTEMTIME time = {};
    time.wYear = date.year;
    time.wMonth = date.month;
    time.wDay = date.day;
    // Rounded: three decimals are not exact in binary.
    const auto milliseconds = static_cast<std::int64_t>(moment.seconds.value_or(0) * 1000 + 1e-4);
    time.wHour = static_cast<std::uint16_t>(milliseconds / 3'600'000);
    time.wMinute = static_cast<std::uint16_t>(milliseconds / 60'000 % 60);
    time.wSecond = static_cast<std::uint16_t>(milliseconds / 1000 % 60);
    time.wMilliseconds = static_cast<std::uint16_t>(milliseconds % 1000);
    row.whole(static_cast<std::int64_t>(_systime2javatime(&time)));
}

void read_javatime(Fields& fields, Row& row) {
    constexpr std::int64_t LAST = 910'670'515'199'999;  // the last of the year 30827
    const std::int64_t count = fields.whole("milliseconds, 0 to 910670515199999", 0, LAST);
    SYSTEMTIME time = {};
    _javatime2systemtime(static_cast<std::uint64_t>(count), &time);
    const std::uint32_t mjd = _greg2mjd(time.wYear, time.wMonth, time.wDay);
    const double seconds = 3600 * time.wHour + 60 * time.wMinute + time.wSecond + time.wMilliseconds / 1000.0;
    row.text(moment_text(mjd, seconds, 3).append("Z"));
}

Work make_javatime(const CommandLine& line, const Format&) {
    return has_flag(line, INVERSE) ? read_javatime : write_javatime;
}

}  // namespace

const Command MJD = {
    "mjd",
    "",
    "Modified Julian Date of a calendar date",
    "Reads TIME: 2024-02-29, 2024-02-29T23:59:59.5 or the same with a Z behind it; Gregorian, from\n"
    "1858-11-17 to 65535-12-31, without leap seconds. Writes MJD: whole days since 1858-11-17, with a\n"
    "fraction where there is a time of day. A time of day behind a date without the T is refused. With\n"
    "--inverse reads MJD, and writes a date, with the time of day where there is a fraction.",
    {INVERSE, CSV, KEEP, PRECISION},
    {{"echo '2000-01-01T12:00:00' | basalt mjd --precision 0", "51544.50000"},
     {"echo '60369' | basalt mjd --inverse", "2024-02-29"}},
    make_mjd};

const Command GPS = {
    "gps",
    "",
    "GPS week and seconds of a calendar time",
    "Reads TIME as mjd does, from 1980-01-06 to 2159-06-11, in the scale of GPS: no leap second is added\n"
    "or taken away. Writes WEEK SECONDS: weeks since 1980-01-06 without starting over, seconds within the\n"
    "week. With --inverse reads those and writes TIME.",
    {INVERSE, CSV, KEEP, PRECISION},
    {{"echo '2019-04-07T00:00:00' | basalt gps --precision 1", "2048 0.0"},
     {"echo '2048 86399.5' | basalt gps --inverse --precision 1", "2019-04-07T23:59:59.5"}},
    make_gps};

const Command JAVATIME = {
    "javatime",
    "",
    "milliseconds since 1970 of a calendar time",
    "Reads TIME as mjd does, UTC, from 1970 to 30827; fractions of a millisecond are dropped. Writes\n"
    "MILLISECONDS since 1970-01-01T00:00:00Z. With --inverse reads those and writes TIME.",
    {INVERSE, CSV, KEEP},
    {{"echo '2001-09-09T01:46:40Z' | basalt javatime", "1000000000000"},
     {"echo '1000000000001' | basalt javatime --inverse", "2001-09-09T01:46:40.001Z"}},
    make_javatime};
