// Time scales, angle and length units.
#include <cstdint>
#include <limits>
#include <optional>
#include <stdexcept>
#include <string>

#include "basalt/geo.h"
#include "basalt/geo/angle_text.h"
#include "universal.h"

namespace basalt_python {

namespace {

// Whole numbers arrive as 64 bits; one out of the range of the library's type is refused.
template <class T>
T narrow(std::int64_t value) {
    if (value < std::numeric_limits<T>::min() || value > std::numeric_limits<T>::max()) {
        throw std::out_of_range("a whole number is out of range");
    }
    return static_cast<T>(value);
}
std::uint16_t bits16(std::int64_t value) {
    return narrow<std::uint16_t>(value);
}

using Whole = std::int64_t;
using pybind11::literals::operator""_a;

auto calendar_of(std::uint64_t milliseconds) {
    SYSTEMTIME t{};
    _javatime2systemtime(milliseconds, &t);
    return std::tuple{Whole{t.wYear},   Whole{t.wMonth},  Whole{t.wDay},          Whole{t.wHour},
                      Whole{t.wMinute}, Whole{t.wSecond}, Whole{t.wMilliseconds}, Whole{t.wDayOfWeek}};
}

std::string angle_text(double radians, int decimals, const std::string& style) {
    if (style != "sign" && style != "latitude" && style != "longitude") {
        throw std::invalid_argument("style is sign, latitude or longitude");
    }
    return basalt::format_angle(radians, decimals,
                                style == "sign"       ? basalt::AngleStyle::sign
                                : style == "latitude" ? basalt::AngleStyle::latitude
                                                      : basalt::AngleStyle::longitude);
}

double angle_of(const std::string& text) {
    const std::optional<double> radians = basalt::parse_angle(text);
    if (!radians) {
        throw std::invalid_argument("not an angle in degrees, minutes and seconds");
    }
    return *radians;
}

}  // namespace

void add_time_and_units(pybind11::module_& m) {
    add(m, "date_to_mjd",
        "date_to_mjd(year, month, day): Modified Julian Date, whole days from 1858-11-17; ValueError for a "
        "date that the calendar does not have (_greg2mjd).",
        [](Whole year, Whole month, Whole day) {
            const std::uint32_t mjd = _greg2mjd(bits16(year), bits16(month), bits16(day));
            std::uint16_t same_year = 0, same_month = 0, same_day = 0, weekday = 0;
            _mjd2greg(mjd, same_year, same_month, same_day, weekday);
            if (same_year != year || same_month != month || same_day != day) {
                throw std::out_of_range("the calendar has no such date");
            }
            return Whole{mjd};
        });
    add(m, "mjd_to_date", "mjd_to_date(mjd): (year, month, day, weekday), weekday 0 for Sunday (_mjd2greg).",
        [](Whole mjd) {
            std::uint16_t year = 0, month = 0, day = 0, weekday = 0;
            _mjd2greg(narrow<std::uint32_t>(mjd), year, month, day, weekday);
            return std::tuple{Whole{year}, Whole{month}, Whole{day}, Whole{weekday}};
        });
    add(m, "mjd_to_gps",
        "mjd_to_gps(mjd, seconds_of_day): (week, seconds_of_week), without leap seconds (_mjd2gps).",
        [](Whole mjd, double seconds) {
            std::uint16_t week = 0;
            double seconds_of_week = 0;
            _mjd2gps(narrow<std::uint32_t>(mjd), seconds, week, seconds_of_week);
            return std::tuple{Whole{week}, seconds_of_week};
        });
    add(m, "gps_to_mjd", "gps_to_mjd(week, seconds_of_week): MJD with its fraction (_gps2mjd).",
        [](Whole week, double seconds) { return _gps2mjd(bits16(week), seconds); });
    add(m, "calendar_to_java_time",
        "calendar_to_java_time(year, month, day, hour, minute, second, millisecond): milliseconds since "
        "1970, UTC; 2^64 - 1 for what is no time (_systime2javatime).",
        [](Whole year, Whole month, Whole day, Whole hour, Whole minute, Whole second, Whole millisecond) {
            SYSTEMTIME time{};
            time.wYear = bits16(year);
            time.wMonth = bits16(month);
            time.wDay = bits16(day);
            time.wHour = bits16(hour);
            time.wMinute = bits16(minute);
            time.wSecond = bits16(second);
            time.wMilliseconds = bits16(millisecond);
            return _systime2javatime(&time);
        });
    add(
        m, "java_time_to_calendar",
        "java_time_to_calendar(milliseconds): (year, month, day, hour, minute, second, millisecond, "
        "weekday) (_javatime2systemtime).",
        [](Whole milliseconds) {
            if (milliseconds < 0) {
                throw std::out_of_range("a whole number is out of range");
            }
            return calendar_of(static_cast<std::uint64_t>(milliseconds));
        },
        [](std::uint64_t milliseconds) { return calendar_of(milliseconds); });
    m.def("current_java_time", &_currentjavatime,
          "Milliseconds since 1970 by the machine's clock (_currentjavatime).");

    add(m, "degrees_to_radians", "degrees_to_radians(degrees): radians (_degtorad).",
        [](double degrees) { return _degtorad(degrees); });
    add(m, "factorial", "factorial(n): in double precision, infinite from 171 on (factorial).",
        [](Whole n) { return factorial(narrow<std::uint32_t>(n)); });
    add(m, "radians_to_dms",
        "radians_to_dms(radians): (degrees, minutes, seconds). The degrees have the sign; where they are 0, "
        "minutes and seconds have it (_radtodms).",
        [](double radians) {
            int degrees = 0, minutes = 0;
            double seconds = 0;
            _radtodms(radians, &degrees, &minutes, &seconds);
            if (radians < 0 && degrees == 0) {
                minutes = -minutes;
                seconds = -seconds;
            }
            return std::tuple{Whole{degrees}, Whole{minutes}, seconds};
        });
    add(m, "dms_to_radians",
        "dms_to_radians(degrees, minutes, seconds): radians; undoes radians_to_dms (_dmstorad).",
        [](Whole degrees, Whole minutes, double seconds) {
            double radians = 0;
            _dmstorad(narrow<int>(degrees), narrow<int>(minutes), seconds, &radians);
            return radians;
        });
    m.def("format_angle", &angle_text, "radians"_a, "decimals"_a = 0, "style"_a = "sign",
          "Text of an angle in radians: degrees, minutes and seconds with so many decimals, 0 to 9. By style "
          "-12-30-00, 12-30-00S (latitude) or 12-30-00W (longitude, within half a turn); rounded once, empty "
          "for NaN (basalt::format_angle).");
    m.def("parse_angle", &angle_of, "text"_a,
          "Radians of a text such as -12-30-00.5, 12:30.5S or W 12d30m; ValueError for one that is no angle "
          "(basalt::parse_angle).");
    add(m, "metres_to_feet_inches",
        "metres_to_feet_inches(metres, fraction_denominator): (positive, feet, inches, numerator, "
        "denominator) in US survey feet (_mtoftin).",
        [](double metres, Whole fraction) {
            bool positive = true;
            int feet = 0, numerator = 0, denominator = 0;
            double inches = 0;
            _mtoftin(metres, narrow<int>(fraction), &positive, &feet, &inches, &numerator, &denominator);
            return std::tuple{positive, Whole{feet}, inches, Whole{numerator}, Whole{denominator}};
        });
    add(m, "feet_inches_to_metres",
        "feet_inches_to_metres(feet, inches, numerator, denominator): metres (_ftintom).",
        [](Whole feet, double inches, Whole numerator, Whole denominator) {
            double metres = 0;
            _ftintom(narrow<int>(feet), inches, narrow<int>(numerator), narrow<int>(denominator), &metres);
            return metres;
        });
}

}  // namespace basalt_python
