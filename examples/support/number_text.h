// Numbers as reports print them.
#ifndef EXAMPLES_NUMBER_TEXT_H
#define EXAMPLES_NUMBER_TEXT_H

#include <cstdint>
#include <string>

/// `value` with so many decimals, a point before them and a comma between thousands, in every locale; never
/// `-0`.
std::string number_text(double value, int decimals);
std::string number_text(std::int64_t value);

/// As number_text, without the commas: for columns that are read by machines too.
std::string fixed_text(double value, int decimals);

#endif
