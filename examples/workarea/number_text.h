// Numbers as the report prints them.
#ifndef WORKAREA_NUMBER_TEXT_H
#define WORKAREA_NUMBER_TEXT_H

#include <cstdint>
#include <string>

/// `value` with so many decimals, a point before them and a comma between thousands, in every locale; never
/// `-0`.
std::string number_text(double value, int decimals);
std::string number_text(std::int64_t value);

#endif
