// UTF-8 and wide text, whatever the locale: file names and debugger output.
#ifndef BASALT_SRC_PLATFORM_TEXT_UTF8_H
#define BASALT_SRC_PLATFORM_TEXT_UTF8_H

#include <cstddef>
#include <string>
#include <string_view>

namespace basalt::platform {

// What stands for a byte that is not part of a character.
inline constexpr wchar_t REPLACEMENT_CHARACTER = L'\xFFFD';

inline constexpr std::size_t MAX_UTF8_BYTES = 4;

// Whether the value is a character: neither a surrogate nor beyond 0x10FFFF.
constexpr bool is_unicode_scalar(wchar_t ch) {
    const auto value = static_cast<char32_t>(ch);
    return value < 0xD800 || (value >= 0xE000 && value <= 0x10FFFF);
}

// Writes the characters from ' ' to 0x7F at the front, one byte each, into room for the whole text and
// answers their count; what it writes behind them has no meaning.
std::size_t write_printing(std::wstring_view text, char* bytes);

// Writes one character's bytes ('?' when it is none) and answers their count, 1 to 4.
std::size_t encode_utf8(wchar_t ch, char* bytes);

// Every character in its bytes, zeros included; '?' for a value that is no character.
std::string utf8_from_wide(std::wstring_view text);

// The same into room for MAX_UTF8_BYTES a character; answers the end of what was written.
char* write_utf8(std::wstring_view text, char* bytes);
// The same as text mode does it: up to the first zero, with CR LF for each LF. Moves `bytes` to the end of
// what was written; answers the count of characters before the zero.
std::size_t write_utf8_lines(std::wstring_view text, char*& bytes);

// Every byte sequence in its character, zeros included; REPLACEMENT_CHARACTER for each byte that belongs to
// none (overlong forms, surrogates, values beyond 0x10FFFF and a character cut short at the end as well).
std::wstring wide_from_utf8(std::string_view text);
// The same into room for some characters: writes those that fit and answers the count of all, which is at
// most one a byte.
std::size_t write_wide(std::string_view text, wchar_t* characters, std::size_t room);

}  // namespace basalt::platform

#endif
