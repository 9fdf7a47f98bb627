#include "src/platform/text_conversion.h"

#include <algorithm>
#include <cerrno>
#include <charconv>
#include <climits>
#include <cstdint>
#include <cstring>
#include <iterator>
#include <string_view>

#include "src/platform/code_page.h"
#include "src/platform/system/failure.h"

using namespace basalt::platform;

namespace {

// Writes the leading pieces that fit and returns the number of bytes in the whole text.
std::size_t narrow_to(std::wstring_view text, char* destination, std::size_t capacity) {
    constexpr std::size_t PIECE = 64;
    char bytes[PIECE * MB_LEN_MAX];
    std::size_t count = 0;
    while (!text.empty()) {
        const char* const end = active_code_page().narrow_piece(text, PIECE, bytes);
        const auto length = static_cast<std::size_t>(end - bytes);
        if (count + length <= capacity) {
            std::memcpy(destination + count, bytes, length);
        }
        count += length;
    }
    return count;
}

}  // namespace

int MultiByteToWideChar(UINT /*code_page*/, DWORD /*flags*/, const char* source, int length,
                        wchar_t* destination, int capacity) {
    if (length <= 0) {
        return fail_with(ERROR_INVALID_PARAMETER, 0);
    }
    const std::string_view text(source, static_cast<std::size_t>(length));
    return static_cast<int>(
        active_code_page().widen_to(text, destination, static_cast<std::size_t>(capacity)));
}

// NOLINTBEGIN(readability-non-const-parameter): the Win32 signature
int WideCharToMultiByte(UINT /*code_page*/, DWORD /*flags*/, const wchar_t* source, int length,
                        char* destination, int capacity, const char* /*default_character*/,
                        BOOL* /*used_default*/) {
    // NOLINTEND(readability-non-const-parameter)
    if (length <= 0) {
        return fail_with(ERROR_INVALID_PARAMETER, 0);
    }
    const std::wstring_view text(source, static_cast<std::size_t>(length));
    const std::size_t needed = narrow_to(text, destination, static_cast<std::size_t>(capacity));
    return needed <= static_cast<std::size_t>(capacity) ? static_cast<int>(needed)
                                                        : fail_with(ERROR_INSUFFICIENT_BUFFER, 0);
}

errno_t _itow_s(int value, wchar_t* text, std::size_t size, int radix) {
    if (size == 0) {
        return EINVAL;
    }
    text[0] = L'\0';
    if (radix < 2 || radix > 36) {
        return EINVAL;
    }
    char digits[32];  // radix 2 needs as many
    const std::to_chars_result end = radix == 10 ? std::to_chars(std::begin(digits), std::end(digits), value)
                                                 : std::to_chars(std::begin(digits), std::end(digits),
                                                                 static_cast<std::uint32_t>(value), radix);
    if (static_cast<std::size_t>(end.ptr - digits) >= size) {
        return ERANGE;
    }
    *std::copy(digits, end.ptr, text) = L'\0';
    return 0;
}
