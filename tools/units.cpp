// Angles in degrees, minutes and seconds; lengths in feet and inches.
#include <basalt/geo.h>

#include <climits>
#include <cmath>
#include <optional>

#include "commands.h"
#include "input_error.h"
#include "number_parsing.h"

namespace {

constexpr Option DENOMINATOR = {"--denominator", "N",
                                "inches as a whole number and a fraction, to the nearest one over N"};

/// Whole degrees or feet from text: -0 is negative, and the library's -0 is not.
struct Signed {
    int size;
    bool negative;
};

Signed read_signed(Fields& fields, const char* what) {
    const std::string_view field = fields.text(what);
    const std::optional<std::int64_t> value = parse_integer(field);
    if (!value || *value < -INT_MAX || *value > INT_MAX) {
        throw InputError("expected " + std::string(what) + ", not " + quoted(field));
    }
    return {static_cast<int>(std::abs(*value)), field[0] == '-'};
}

/// Writes the sign unless all fields round to 0.
void write_signed(Row& row, int size, bool negative, bool all_zero) {
    const std::string digits = std::to_string(size);
    row.text(negative && !all_zero ? std::string(1, '-').append(digits) : digits);
}

bool rounds_to_zero(double value, int digits) {
    return std::round(value * std::pow(10, digits)) == 0;
}

/// Rounds minutes and seconds to a number of decimals and carries 60.
struct Sexagesimal {
    int degrees;
    int minutes;
    double seconds;
};

Sexagesimal rounded(double radians, int digits) {
    Sexagesimal angle = {};
    _radtodms(radians, &angle.degrees, &angle.minutes, &angle.seconds);
    if (!std::isfinite(angle.seconds) || angle.degrees == INT_MAX) {
        throw InputError("the angle is too large for degrees, minutes and seconds");
    }
    const double unit = std::pow(10, digits);
    if (std::round(angle.seconds * unit) >= 60 * unit) {
        angle.seconds = 0;
        ++angle.minutes;
    } else if (std::round(angle.seconds * unit) < 0) {
        // The library rounds an angle just below a whole minute up to it.
        angle.seconds += 60;
        --angle.minutes;
    }
    const int carried = angle.minutes == 60 ? 1 : angle.minutes < 0 ? -1 : 0;
    angle.minutes -= 60 * carried;
    angle.degrees += carried;
    return angle;
}

Work make_dms(const CommandLine& line, const Format& format) {
    if (has_flag(line, INVERSE)) {
        return [](Fields& fields, Row& row) {
            const Signed degrees = read_signed(fields, "whole degrees");
            const auto minutes = static_cast<int>(fields.whole("whole minutes, 0 to 59", 0, 59));
            const double seconds = fields.number("seconds, 0 to below 60", 0, std::nextafter(60.0, 0.0));
            double radians = 0;
            _dmstorad(degrees.size, minutes, seconds, &radians);
            row.angle(degrees.negative ? -radians : radians);
        };
    }
    return [digits = format.arc_second_digits()](Fields& fields, Row& row) {
        const double radians = fields.angle("an angle");
        const Sexagesimal angle = rounded(std::abs(radians), digits);
        const bool zero = angle.degrees == 0 && angle.minutes == 0 && rounds_to_zero(angle.seconds, digits);
        write_signed(row, angle.degrees, radians < 0, zero);
        row.whole(angle.minutes);
        row.number(angle.seconds, digits);
    };
}

/// A fraction N/D, if that is the next field.
std::optional<std::pair<int, int>> read_fraction(Fields& fields) {
    const std::string_view rest = fields.rest();
    const std::string_view field = rest.substr(0, rest.find_first_of(" \t,"));
    const std::size_t slash = field.find('/');
    if (slash == std::string_view::npos) {
        return std::nullopt;
    }
    const std::optional<std::int64_t> over = parse_integer(field.substr(0, slash));
    const std::optional<std::int64_t> under = parse_integer(field.substr(slash + 1));
    if (!over || !under) {
        return std::nullopt;
    }
    if (*under < 1 || *under > INT_MAX || *over < 0 || *over >= *under) {
        throw InputError("expected a fraction below 1, not " + quoted(field));
    }
    fields.text("a fraction");
    return std::pair(static_cast<int>(*over), static_cast<int>(*under));
}

void read_feet(Fields& fields, Row& row) {
    const Signed feet = read_signed(fields, "whole feet");
    const double inches = fields.number("inches, 0 to below 12", 0, std::nextafter(12.0, 0.0));
    const auto [over, under] = read_fraction(fields).value_or(std::pair(0, 0));
    double metres = 0;
    _ftintom(feet.size, inches, over, under, &metres);
    row.metres(feet.negative ? -metres : metres);
}

void write_feet(double metres, int denominator, const Format& format, Row& row) {
    bool positive = false;
    int feet = 0;
    double inches = 0;
    int over = 0;
    int under = 0;
    _mtoftin(metres, denominator, &positive, &feet, &inches, &over, &under);
    if (feet == INT_MAX) {
        throw InputError("the length is too large for feet and inches");
    }
    const double unit = std::pow(10, format.precision);
    // The library drops a fraction that rounds up to a whole inch and leaves the inches.
    const bool carried = over == 0 && inches - std::floor(inches) >= 0.5;
    inches = denominator == 0 ? std::round(inches * unit) / unit : std::floor(inches) + (carried ? 1 : 0);
    if (inches >= 12) {
        inches -= 12;
        ++feet;
    }
    write_signed(row, feet, !positive, feet == 0 && inches == 0 && over == 0);
    if (denominator == 0) {
        row.number(inches, format.precision);
        return;
    }
    row.whole(static_cast<std::int64_t>(inches));
    row.text(over == 0 ? "0/1" : std::to_string(over).append(1, '/').append(std::to_string(under)));
}

Work make_ftin(const CommandLine& line, const Format& format) {
    const std::string* given = value_of(line, DENOMINATOR);
    if (has_flag(line, INVERSE)) {
        if (given != nullptr) {
            throw InputError("--denominator does not go with --inverse, which takes any fraction");
        }
        return read_feet;
    }
    const std::optional<std::int64_t> denominator = given != nullptr ? parse_integer(*given) : 0;
    if (!denominator || *denominator < (given != nullptr ? 1 : 0) || *denominator > 1'000'000) {
        throw InputError("--denominator takes a whole number from 1 to 1000000, not " + quoted(*given));
    }
    return [format, denominator = static_cast<int>(*denominator)](Fields& fields, Row& row) {
        write_feet(fields.number("a length in metres"), denominator, format, row);
    };
}

}  // namespace

const Command DMS = {
    "dms",
    "",
    "an angle in degrees, minutes and seconds",
    "Reads ANGLE. Writes DEGREES MINUTES SECONDS; the sign stands before the degrees, -0 too. With\n"
    "--inverse reads those, minutes and seconds below 60, and writes ANGLE.",
    {INVERSE, DEGREES, RADIANS, CSV, KEEP, PRECISION},
    {{"echo '-0.5125 P1' | basalt dms --degrees --precision 0", "-0 30 45.00 P1"},
     {"echo '-0 30 45' | basalt dms --degrees --inverse --precision 0", "-0.51250"}},
    make_dms};

const Command FTIN = {
    "ftin",
    "",
    "a length in feet and inches",
    "Reads LENGTH in metres. Writes FEET INCHES: US survey feet of 1200/3937 m; the sign stands before\n"
    "the feet, -0 too. With --inverse reads FEET INCHES, with or without a fraction N/D behind them, and\n"
    "writes LENGTH.",
    {INVERSE, DENOMINATOR, CSV, KEEP, PRECISION},
    {{"echo '30.48' | basalt ftin --precision 2", "100 0.00"},
     {"echo '1.9' | basalt ftin --denominator 16", "6 2 13/16"},
     {"echo '6 2 13/16' | basalt ftin --inverse", "1.9002"}},
    make_ftin};
