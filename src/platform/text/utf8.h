// UTF-8 and wide text, independent of the locale: file names and debugger output.
#ifndef BASALT_SRC_PLATFORM_TEXT_UTF8_H
#define BASALT_SRC_PLATFORM_TEXT_UTF8_H

#include <cstddef>
#include <string>
#include <string_view>

namespace basalt::platform {

// Replaces each byte that is not part of a character.
inline constexpr wchar_t REPLACEMENT_CHARACTER = L'\xFFFD';

inline constexpr std::size_t MAX_UTF8_BYTES = 4;

// Whether the value is a character: neither a surrogate nor beyond 0x10FFFF.
constexpr bool is_unicode_scalar(wchar_t ch) {
    const auto value = static_cast<char32_t>(ch);
    return value < 0xD800 || (value >= 0xE000 && value <= 0x10FFFF);
}

// Copies the leading characters from ' ' to 0x7F, one byte each, and returns their number. The buffer has as
// many bytes as the text has characters; those behind the copied ones are unspecified.
std::size_t write_printing(std::wstring_view text, char* bytes);

// Writes one character ('?' for an invalid one) and returns the number of bytes, 1 to MAX_UTF8_BYTES.
std::size_t encode_utf8(wchar_t ch, char* bytes);

// Removes a text from its front and writes it into a buffer of MAX_UTF8_BYTES per character; returns the end
// of the output. As lines: with CR LF for each LF, and up to the first zero.
char* write_utf8(std::wstring_view& text, char* bytes, bool as_lines = false);
std::string utf8_from_wide(std::wstring_view text);

// Decodes bytes, zeros included, with REPLACEMENT_CHARACTER for each byte that is not part of a character:
// overlong forms, surrogates, values beyond 0x10FFFF and truncated characters. Writes up to `capacity`
// characters and returns the number in the whole text, at most one per byte.
std::size_t write_wide(std::string_view text, wchar_t* characters, std::size_t capacity);

}  // namespace basalt::platform

#endif
