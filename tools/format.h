// How lines are read and written, as the options say.
#ifndef TOOLS_FORMAT_H
#define TOOLS_FORMAT_H

struct Format {
    static constexpr int MOST_DIGITS = 9;

    bool csv = false;      ///< commas separate the fields that are read, else blanks
    char separator = ' ';  ///< between fields that are written
    bool degrees = false;  ///< angles are degrees, else radians
    bool keep = false;     ///< the line as it was comes before its results
    int precision = 4;     ///< decimals of metres and seconds

    /// @name Decimals of other quantities, none coarser than those of metres and seconds
    /// @{
    int angle_digits() const { return precision + (degrees ? 5 : 7); }
    int arc_second_digits() const { return precision + 2; }
    int day_digits() const { return precision + 5; }
    /// @}
};

#endif
