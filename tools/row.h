// The output line.
#ifndef TOOLS_ROW_H
#define TOOLS_ROW_H

#include <cstdint>
#include <string>
#include <string_view>

#include "format.h"

/// Appends fields to a text, the same in every locale. A number that rounds to zero has no sign; one that is
/// not finite is an InputError.
class Row {
public:
    Row(std::string& text, const Format& format) : m_text(text), m_format(format) {}

    void number(double value, int digits);
    void metres(double value) { number(value, m_format.precision); }
    void seconds(double value) { number(value, m_format.precision); }
    /// @name Angles in radians, written as the options say
    /// @{
    void angle(double radians) { number(in_unit(radians), m_format.angle_digits()); }
    /// From 0 to below a turn, after rounding too.
    void bearing(double radians);
    /// From minus half a turn to half a turn.
    void longitude(double radians);
    /// @}
    void whole(std::int64_t value);
    void text(std::string_view value);
    /// Any text: quoted with --csv where it contains a comma, quote or blank at its ends.
    void any_text(std::string_view value);

private:
    double in_unit(double radians) const;
    void separate();

    std::string& m_text;
    const Format& m_format;
    bool m_first = true;
};

#endif
