// The active code page: the encoding of narrow text, taken from the environment's locale.
//
// It is the encoding named by LC_ALL, LC_CTYPE or LANG (the first that is not empty) when the process first
// asks, and UTF-8 when none is set, when it is "C" or "POSIX" and when the named locale is not installed.
// The locale the host may have set for its process or thread is neither read nor changed.
#ifndef BASALT_SRC_PLATFORM_CODE_PAGE_H
#define BASALT_SRC_PLATFORM_CODE_PAGE_H

#include <locale.h>

#include <cwchar>
#include <string>
#include <string_view>

#include "src/platform/text/utf8.h"

namespace basalt::platform {

// One locale's encoding and character classes. Every operation is thread-safe and takes counted text, in
// which a zero is a character like any other.
class CodePage {
public:
    // By the name of an installed locale; any other name, or null, is UTF-8. "C" is the locale of that name.
    explicit CodePage(const char* locale_name);
    ~CodePage();
    CodePage(const CodePage&) = delete;
    CodePage& operator=(const CodePage&) = delete;

    // REPLACEMENT_CHARACTER for each byte that belongs to no character, a character cut short at the end too.
    std::wstring widen(std::string_view text) const;
    // The same into room for some characters: writes those that fit and answers the count of all, which is
    // hardly ever more than one a byte.
    std::size_t widen_to(std::string_view text, wchar_t* characters, std::size_t room) const;
    // A file's name: what belongs to no character becomes what file_name_from_wide leads back to the same
    // bytes.
    std::wstring widen_name(std::string_view name) const;
    // '?' for each character that the encoding lacks.
    std::string narrow(std::wstring_view text) const;
    // The same piece by piece: takes up to `most` characters off the front of a text and writes them into
    // room for MB_LEN_MAX bytes each and once more; answers the end of what was written. What an encoding
    // keeps back until it knows the next character stays in `state`, at first all zero, and goes with the
    // last piece.
    char* narrow_piece(std::wstring_view& text, std::size_t most, char* bytes, std::mbstate_t& state) const;
    // The same as text mode does it: with CR LF for each LF, and the text is over at its first zero.
    char* narrow_line_piece(std::wstring_view& text, std::size_t most, char* bytes,
                            std::mbstate_t& state) const;

    wchar_t to_lower(wchar_t ch) const;
    wchar_t to_upper(wchar_t ch) const;
    bool is_space(wchar_t ch) const;

    // Gives the locale back; what is left is UTF-8 with ASCII classes.
    void close() noexcept;

private:
    // Null when closed, and where not even the system's UTF-8 locale is installed: ASCII classes then.
    locale_t m_locale;
    bool m_is_utf8;
};

// The environment's, opened at the first use and closed when the library is unloaded or all statics are gone.
const CodePage& active_code_page();

inline std::wstring widen(std::string_view text) {
    return active_code_page().widen(text);
}
inline std::string narrow(std::wstring_view text) {
    return active_code_page().narrow(text);
}

// The two conversions by way of a locale's own routines, one character at a time: what CodePage does for
// every encoding but UTF-8.
std::wstring widen_by_locale(std::string_view text, locale_t locale);
std::string narrow_by_locale(std::wstring_view text, locale_t locale);

}  // namespace basalt::platform

#endif
