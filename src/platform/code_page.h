// The active code page: the encoding of narrow text, taken from the environment's locale.
//
// LC_ALL, LC_CTYPE or LANG (the first that is not empty) names it when the process first converts text. UTF-8
// when none is set, for "C" and "POSIX", for a locale that is not installed and for encodings in which a
// character depends on its neighbours. The host's process and thread locales are neither read nor changed.
#ifndef BASALT_SRC_PLATFORM_CODE_PAGE_H
#define BASALT_SRC_PLATFORM_CODE_PAGE_H

#include <locale.h>

#include <string>
#include <string_view>

#include "src/platform/text/utf8.h"

namespace basalt::platform {

// One locale's encoding and character classes. Text is counted: zeros are ordinary characters.
// Threads: thread-safe, except close().
class CodePage {
public:
    // By the name of an installed locale; any other name, or null, is UTF-8. "C" is the locale of that name.
    explicit CodePage(const char* locale_name);
    ~CodePage();
    CodePage(const CodePage&) = delete;
    CodePage& operator=(const CodePage&) = delete;

    // Narrow to wide, with REPLACEMENT_CHARACTER for each byte that is not part of a character, including a
    // character truncated at the end.
    std::wstring widen(std::string_view text) const;
    // The same into a buffer: writes up to `capacity` characters and returns the number in the whole text, at
    // most one per byte.
    std::size_t widen_to(std::string_view text, wchar_t* characters, std::size_t capacity) const;
    // The same for a file name, with values that file_name_from_wide() converts back to the same bytes.
    std::wstring widen_name(std::string_view name) const;

    // Wide to narrow in pieces, with '?' for each character that the encoding lacks: removes up to `most`
    // characters from the front of the text, writes them into a buffer of MB_LEN_MAX bytes per character and
    // returns the end of the output.
    char* narrow_piece(std::wstring_view& text, std::size_t most, char* bytes) const;
    // The same in text mode: CR LF for each LF, and the text ends at its first zero.
    char* narrow_line_piece(std::wstring_view& text, std::size_t most, char* bytes) const;

    wchar_t to_lower(wchar_t ch) const;
    wchar_t to_upper(wchar_t ch) const;
    bool is_space(wchar_t ch) const;

    // Releases the locale; the object is UTF-8 with ASCII classes from then on.
    void close() noexcept;

private:
    char* encode(std::wstring_view& text, std::size_t most, char* bytes, bool as_lines) const;

    locale_t m_locale;  // null: closed, or no UTF-8 locale is installed; ASCII classes
    bool m_is_utf8 = true;
};

// The environment's, opened at the first use and closed when the library is unloaded.
const CodePage& active_code_page();

inline std::wstring widen(std::string_view text) {
    return active_code_page().widen(text);
}

}  // namespace basalt::platform

#endif
