// The fields of a line, read from the left.
#ifndef TOOLS_FIELDS_H
#define TOOLS_FIELDS_H

#include <cfloat>
#include <cstddef>
#include <cstdint>
#include <string_view>

#include "format.h"

/// Fields between blanks, or between commas with optional blanks. A mismatch is an InputError that
/// says what was expected: `what`, a few words with the unit.
class Fields {
public:
    Fields(std::string_view line, const Format& format) : m_format(format), m_line(line) {}

    std::string_view text(const char* what);
    /// A finite number from `low` to `high`.
    double number(const char* what, double low = -DBL_MAX, double high = DBL_MAX);
    std::int64_t whole(const char* what, std::int64_t low, std::int64_t high);
    /// @name Angles as the options say, in radians
    /// @{
    /// A number, or degrees, minutes and seconds as basalt::parse_angle() reads them, without the letters
    /// given.
    double angle(const char* what, std::string_view wrong_letters = "NSEWnsew");
    double latitude();
    double longitude() { return angle("a longitude", "NSns"); }
    /// @}

    /// The rest of the line as one field.
    std::string_view whole_line();
    /// Whether there is no further field.
    bool ended() const { return m_format.csv ? m_ended : rest().empty(); }
    /// What was not read, without blanks at its ends.
    std::string_view rest() const;

private:
    [[noreturn]] void fail(const char* what, std::string_view found) const;

    const Format& m_format;
    std::string_view m_line;
    std::size_t m_at = 0;
    bool m_ended = false;  ///< no comma, and so no field, follows
};

#endif
