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

std::string unsigned_text(double value, int decimals) {
    char text[400];  // the largest double has 309 digits
    const auto result =
        std::to_chars(text, text + sizeof text, std::abs(value), std::chars_format::fixed, decimals);
    return {text, result.ptr};
}

std::string sign_of(double value, const std::string& digits) {
    const bool zero = digits.find_first_not_of("0.") == std::string::npos;
    return value < 0.0 && !zero ? "-" : "";
}

}  // namespace

std::string number_text(double value, int decimals) {
    const std::string digits = unsigned_text(value, decimals);
    return sign_of(value, digits) + grouped(digits);
}

std::string number_text(std::int64_t value) {
    return number_text(static_cast<double>(value), 0);
}

std::string fixed_text(double value, int decimals) {
    const std::string digits = unsigned_text(value, decimals);
    return sign_of(value, digits) + digits;
}
