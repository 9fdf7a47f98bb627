#include "time_text.h"

#include <basalt/geo.h>

#include <charconv>
#include <cmath>

#include "input_error.h"
#include "number_parsing.h"

namespace {

/// Reads a text from the left; each step fails by leaving `good` false.
struct Scanner {
    std::string_view left;
    bool good = true;

    /// As many digits as there are between the bounds.
    int digits(std::size_t least, std::size_t most) {
        std::size_t count = 0;
        int value = 0;
        for (; count < most && count < left.size() && left[count] >= '0' && left[count] <= '9'; ++count) {
            value = 10 * value + (left[count] - '0');
        }
        good = good && count >= least;
        left.remove_prefix(count);
        return value;
    }
    bool has(char c) {
        const bool found = !left.empty() && left[0] == c;
        left.remove_prefix(found ? 1 : 0);
        return found;
    }
    void expect(char c) { good = has(c) && good; }
    /// Seconds with their decimals.
    double seconds() {
        const std::string_view text = left;
        digits(2, 2);
        if (has('.')) {
            const std::size_t before = left.size();
            left.remove_prefix(std::min(left.find_first_not_of("0123456789"), left.size()));
            good = good && left.size() < before;
        }
        return good ? parse_number(text.substr(0, text.size() - left.size())).value_or(60.0) : 60.0;
    }
};

std::string padded(int value, std::size_t width) {
    std::string digits = std::to_string(value);
    return digits.insert(0, width > digits.size() ? width - digits.size() : 0, '0');
}

}  // namespace

Date date_of(std::uint32_t mjd) {
    Date date = {};
    std::uint16_t day_of_week = 0;
    _mjd2greg(mjd, date.year, date.month, date.day, day_of_week);
    return date;
}

Moment parse_moment(std::string_view text) {
    const auto fail = [text](const char* expected) {
        throw InputError("expected " + std::string(expected) + ", not " + quoted(text));
    };
    Scanner scanner{text};
    const int year = scanner.digits(4, 5);
    scanner.expect('-');
    const int month = scanner.digits(2, 2);
    scanner.expect('-');
    const int day = scanner.digits(2, 2);
    Moment moment = {};
    if (scanner.good && scanner.has('T')) {
        const int hour = scanner.digits(2, 2);
        scanner.expect(':');
        const int minute = scanner.digits(2, 2);
        scanner.expect(':');
        const double second = scanner.seconds();
        scanner.has('Z');
        if (hour > 23 || minute > 59 || second >= 60) {
            scanner.good = false;
        }
        moment.seconds = 3600 * hour + 60 * minute + second;
    }
    if (!scanner.good || !scanner.left.empty()) {
        fail(A_TIME);
    }
    if (year > 65535 || month < 1 || month > 12 || day < 1) {
        fail("a date from 1858-11-17 to 65535-12-31");
    }
    moment.mjd = _greg2mjd(static_cast<std::uint16_t>(year), static_cast<std::uint16_t>(month),
                           static_cast<std::uint16_t>(day));
    // A day past the month's end converts back to another day; days before the first MJD wrap beyond the
    // last.
    const Date date = date_of(moment.mjd);
    if (moment.mjd > LAST_MJD || date.year != year || date.month != month || date.day != day) {
        fail("a date from 1858-11-17 to 65535-12-31");
    }
    return moment;
}

std::string date_text(const Date& date) {
    return padded(date.year, 4) + "-" + padded(date.month, 2) + "-" + padded(date.day, 2);
}

std::string moment_text(std::uint32_t mjd, double seconds, int digits) {
    // In integer units of the last digit, so that no second rounds up to 60.
    const auto unit = static_cast<std::int64_t>(std::llround(std::pow(10, digits)));
    std::int64_t count = std::llround(seconds * static_cast<double>(unit));
    if (count >= SECONDS_OF_DAY * unit) {
        count -= SECONDS_OF_DAY * unit;
        ++mjd;
    }
    if (mjd > LAST_MJD) {
        throw InputError("the day is behind 65535-12-31");
    }
    const auto second = static_cast<int>(count / unit);
    std::string text = date_text(date_of(mjd));
    text.append("T").append(padded(second / 3600, 2)).append(":").append(padded(second / 60 % 60, 2));
    text.append(":").append(padded(second % 60, 2));
    if (digits > 0) {
        text.append(".").append(padded(static_cast<int>(count % unit), static_cast<std::size_t>(digits)));
    }
    return text;
}
