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

template <class Source, class Destination>
bool are_valid(const Source* source, int length, const Destination* destination, int capacity) {
    const bool has_destination = capacity == 0 || (capacity > 0 && destination != nullptr);
    return source != nullptr && (length > 0 || length == -1) && has_destination;
}

template <class Character>
std::basic_string_view<Character> view_of(const Character* source, int length) {
    return length > 0
               ? std::basic_string_view<Character>(source, static_cast<std::size_t>(length))
               : std::basic_string_view<Character>(source, std::char_traits<Character>::length(source) + 1);
}

int result_of(std::size_t needed, int capacity) {
    if (needed > INT_MAX || (capacity != 0 && needed > static_cast<std::size_t>(capacity))) {
        return fail_with(ERROR_INSUFFICIENT_BUFFER, 0);
    }
    return static_cast<int>(needed);
}

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

int MultiByteToWideChar(UINT code_page, DWORD flags, const char* source, int length, wchar_t* destination,
                        int capacity) {
    if (code_page != CP_ACP || (flags & ~MB_PRECOMPOSED) != 0 ||
        !are_valid(source, length, destination, capacity)) {
        return fail_with(ERROR_INVALID_PARAMETER, 0);
    }
    const std::size_t needed =
        active_code_page().widen_to(view_of(source, length), destination, static_cast<std::size_t>(capacity));
    return result_of(needed, capacity);
}

// NOLINTBEGIN(readability-non-const-parameter): the Win32 signature
int WideCharToMultiByte(UINT code_page, DWORD flags, const wchar_t* source, int length, char* destination,
                        int capacity, const char* default_character, BOOL* used_default) {
    // NOLINTEND(readability-non-const-parameter)
    if (code_page != CP_ACP || flags != 0 || default_character != nullptr || used_default != nullptr ||
        !are_valid(source, length, destination, capacity)) {
        return fail_with(ERROR_INVALID_PARAMETER, 0);
    }
    return result_of(narrow_to(view_of(source, length), destination, static_cast<std::size_t>(capacity)),
                     capacity);
}

errno_t _itow_s(int value, wchar_t* text, std::size_t size, int radix) {
    if (text == nullptr || size == 0) {
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
