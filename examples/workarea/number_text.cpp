#include "number_text.h"

#include <algorithm>
#include <charconv>
#include <cmath>

namespace {

/// Puts a comma between thousands of a number that begins with its digits.
std::string grouped(std::string digits) {
    const std::size_t whole = std::min(digits.find('.'), digits.size());
    for (std::size_t i = whole; i > 3; i -= 3) {
        digits.insert(i - 3, 1, ',');
    }
    return digits;
}

}  // namespace

std::string number_text(double value, int decimals) {
    char text[400];  // the largest double has 309 digits
    const auto result =
        std::to_chars(text, text + sizeof text, std::abs(value), std::chars_format::fixed, decimals);
    const std::string digits(text, result.ptr);
    const bool zero = digits.find_first_not_of("0.") == std::string::npos;
    std::string signed_digits(value < 0.0 && !zero ? "-" : "");
    signed_digits += grouped(digits);
    return signed_digits;
}

std::string number_text(std::int64_t value) {
    return number_text(static_cast<double>(value), 0);
}
