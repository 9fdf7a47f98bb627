#include "src/platform/integer_text.h"

#include <algorithm>
#include <cerrno>
#include <charconv>
#include <cstdint>
#include <iterator>

errno_t _itow_s(int value, wchar_t* text, std::size_t size, int radix) {
    if (text == nullptr || size == 0) {
        return EINVAL;
    }
    text[0] = L'\0';
    if (radix < 2 || radix > 36) {
        return EINVAL;
    }
    char digits[32];  // as many as radix 2 needs
    const std::to_chars_result end = radix == 10 ? std::to_chars(std::begin(digits), std::end(digits), value)
                                                 : std::to_chars(std::begin(digits), std::end(digits),
                                                                 static_cast<std::uint32_t>(value), radix);
    if (static_cast<std::size_t>(end.ptr - digits) >= size) {
        return ERANGE;
    }
    *std::copy(digits, end.ptr, text) = L'\0';
    return 0;
}
