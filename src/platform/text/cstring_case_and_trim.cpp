// What CString does by the environment's character classes: case and white space.

#include <algorithm>
#include <functional>
#include <string_view>

#include "basalt/platform/cstring.h"
#include "src/platform/code_page.h"
#include "src/platform/text/text_or_empty.h"

using basalt::platform::active_code_page;
using basalt::platform::CodePage;
using basalt::platform::text_or_empty;

namespace {

// By reference: a copy could take memory, which may be gone when one end is trimmed already.
template <class Matches>
void trim_left(std::wstring& text, const Matches& matches) {
    text.erase(text.begin(), std::find_if_not(text.begin(), text.end(), std::cref(matches)));
}

template <class Matches>
void trim_right(std::wstring& text, const Matches& matches) {
    text.erase(std::find_if_not(text.rbegin(), text.rend(), std::cref(matches)).base(), text.end());
}

auto is_white_space() {
    return [&code_page = active_code_page()](wchar_t ch) { return code_page.is_space(ch); };
}

// Over a copy of the characters: they may belong to the text being trimmed.
auto is_one_of(const wchar_t* characters) {
    return [set = std::wstring(text_or_empty(characters))](wchar_t ch) {
        return set.find(ch) != std::wstring::npos;
    };
}

auto is_equal_to(wchar_t character) {
    return [character](wchar_t ch) { return ch == character; };
}

}  // namespace

int CString::CompareNoCase(const wchar_t* other) const {
    const CodePage& code_page = active_code_page();
    const std::wstring_view others = text_or_empty(other);
    const std::size_t shared = std::min(m_text.size(), others.size());
    for (std::size_t i = 0; i < shared; ++i) {
        const wchar_t a = code_page.to_lower(m_text[i]);
        const wchar_t b = code_page.to_lower(others[i]);
        if (a != b) {
            return a < b ? -1 : 1;
        }
    }
    return (m_text.size() > shared) - (others.size() > shared);
}

CString& CString::MakeLower() {
    const CodePage& code_page = active_code_page();
    for (wchar_t& ch : m_text) {
        ch = code_page.to_lower(ch);
    }
    return *this;
}

CString& CString::MakeUpper() {
    const CodePage& code_page = active_code_page();
    for (wchar_t& ch : m_text) {
        ch = code_page.to_upper(ch);
    }
    return *this;
}

CString& CString::Trim() {
    return TrimRight().TrimLeft();
}

CString& CString::Trim(wchar_t character) {
    return TrimRight(character).TrimLeft(character);
}

CString& CString::Trim(const wchar_t* characters) {
    const auto matches = is_one_of(characters);
    trim_right(m_text, matches);
    trim_left(m_text, matches);
    return *this;
}

CString& CString::TrimLeft() {
    trim_left(m_text, is_white_space());
    return *this;
}

CString& CString::TrimLeft(wchar_t character) {
    trim_left(m_text, is_equal_to(character));
    return *this;
}

CString& CString::TrimLeft(const wchar_t* characters) {
    trim_left(m_text, is_one_of(characters));
    return *this;
}

CString& CString::TrimRight() {
    trim_right(m_text, is_white_space());
    return *this;
}

CString& CString::TrimRight(wchar_t character) {
    trim_right(m_text, is_equal_to(character));
    return *this;
}

CString& CString::TrimRight(const wchar_t* characters) {
    trim_right(m_text, is_one_of(characters));
    return *this;
}
