#include "basalt/platform/cstring.h"

#include <algorithm>
#include <limits>
#include <stdexcept>
#include <string_view>

#include "src/platform/code_page.h"

using namespace basalt::platform;

namespace {

std::wstring_view text_or_empty(const wchar_t* text) {
    return text != nullptr ? std::wstring_view(text) : std::wstring_view();
}

constexpr auto MAX_LENGTH = static_cast<std::size_t>(std::numeric_limits<int>::max());

std::size_t clamp_to_size(int position, std::size_t size) {
    return std::min(static_cast<std::size_t>(std::max(position, 0)), size);
}

int position_or_none(std::size_t position) {
    return position == std::wstring::npos ? -1 : static_cast<int>(position);
}

void require_length(std::size_t length) {
    if (length > MAX_LENGTH) {
        throw std::length_error("CString");
    }
}

int sign(int comparison) {
    return (comparison > 0) - (comparison < 0);
}

bool is_space(wchar_t ch) {
    return active_code_page().is_space(ch);
}

}  // namespace

CString::CString(const wchar_t* text) {
    const std::wstring_view characters = text_or_empty(text);
    append(characters.data(), characters.size());
}

CString::CString(const wchar_t* text, int length) {
    if (text != nullptr && length > 0) {
        m_text.assign(text, static_cast<std::size_t>(length));
    }
}

CString::CString(const char* text) {
    if (text != nullptr) {
        const std::wstring wide = widen(text);
        append(wide.data(), wide.size());
    }
}

CString::CString(const char* text, int length) {
    if (text != nullptr && length > 0) {
        m_text = widen({text, static_cast<std::size_t>(length)});
    }
}

CString::CString(wchar_t character, int repeat)
    : m_text(static_cast<std::size_t>(std::max(repeat, 0)), character) {}

CString::CString(char character, int repeat) : CString(widen({&character, 1}).front(), repeat) {}

CString& CString::operator=(wchar_t character) {
    m_text.assign(1, character);
    return *this;
}

CString CString::Left(int count) const {
    return CString(m_text.substr(0, clamp_to_size(count, m_text.size())));
}

CString CString::Right(int count) const {
    return CString(m_text.substr(m_text.size() - clamp_to_size(count, m_text.size())));
}

CString CString::Mid(int first) const {
    return Mid(first, std::numeric_limits<int>::max());
}

CString CString::Mid(int first, int count) const {
    return CString(m_text.substr(clamp_to_size(first, m_text.size()), clamp_to_size(count, m_text.size())));
}

int CString::Find(wchar_t character, int start) const noexcept {
    return start < 0 ? -1 : position_or_none(m_text.find(character, static_cast<std::size_t>(start)));
}

int CString::Find(const wchar_t* text, int start) const noexcept {
    const bool can_match = text != nullptr && start >= 0;
    return can_match ? position_or_none(m_text.find(text, static_cast<std::size_t>(start))) : -1;
}

int CString::ReverseFind(wchar_t character) const noexcept {
    return position_or_none(m_text.rfind(character));
}

int CString::FindOneOf(const wchar_t* characters) const noexcept {
    return position_or_none(m_text.find_first_of(text_or_empty(characters)));
}

int CString::Compare(const wchar_t* other) const noexcept {
    return sign(m_text.compare(text_or_empty(other)));
}

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

void CString::SetAt(int position, wchar_t character) noexcept {
    if (position >= 0 && static_cast<std::size_t>(position) < m_text.size()) {
        m_text[static_cast<std::size_t>(position)] = character;
    }
}

void CString::append(const wchar_t* text, std::size_t length) {
    require_length(m_text.size() + length);
    m_text.append(text, length);
}

CString& CString::operator+=(const CString& other) {
    append(other.m_text.data(), other.m_text.size());
    return *this;
}

CString& CString::operator+=(const wchar_t* other) {
    const std::wstring_view text = text_or_empty(other);
    append(text.data(), text.size());
    return *this;
}

CString& CString::operator+=(wchar_t character) {
    append(&character, 1);
    return *this;
}

int CString::Insert(int position, wchar_t character) {
    require_length(m_text.size() + 1);
    m_text.insert(clamp_to_size(position, m_text.size()), 1, character);
    return GetLength();
}

int CString::Insert(int position, const wchar_t* text) {
    const std::wstring_view characters = text_or_empty(text);
    require_length(m_text.size() + characters.size());
    m_text.insert(clamp_to_size(position, m_text.size()), characters);
    return GetLength();
}

int CString::Delete(int position, int count) {
    m_text.erase(clamp_to_size(position, m_text.size()), clamp_to_size(count, m_text.size()));
    return GetLength();
}

int CString::Replace(wchar_t old_character, wchar_t new_character) noexcept {
    int count = 0;
    if (old_character != new_character) {
        for (wchar_t& ch : m_text) {
            count += ch == old_character;
            ch = ch == old_character ? new_character : ch;
        }
    }
    return count;
}

int CString::Replace(const wchar_t* old_text, const wchar_t* new_text) {
    const std::wstring_view old_part = text_or_empty(old_text);
    const std::wstring_view new_part = text_or_empty(new_text);
    if (old_part.empty()) {
        return 0;
    }
    std::wstring result;
    int count = 0;
    std::size_t done = 0;
    for (std::size_t match; (match = m_text.find(old_part, done)) != std::wstring::npos; ++count) {
        result.append(m_text, done, match - done).append(new_part);
        require_length(result.size());
        done = match + old_part.size();
    }
    result.append(m_text, done);
    require_length(result.size());
    m_text.swap(result);
    return count;
}

int CString::Remove(wchar_t character) noexcept {
    return static_cast<int>(std::erase(m_text, character));
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

// The characters may belong to the text itself, so both ends are found before either is trimmed.
CString& CString::Trim(const wchar_t* characters) {
    const std::wstring_view any = text_or_empty(characters);
    const std::size_t first = m_text.find_first_not_of(any);
    m_text.erase(m_text.find_last_not_of(any) + 1);  // none is -1
    m_text.erase(0, first);
    return *this;
}

CString& CString::TrimLeft() {
    m_text.erase(m_text.begin(), std::find_if_not(m_text.begin(), m_text.end(), is_space));
    return *this;
}

CString& CString::TrimLeft(wchar_t character) {
    m_text.erase(0, m_text.find_first_not_of(character));
    return *this;
}

CString& CString::TrimLeft(const wchar_t* characters) {
    m_text.erase(0, m_text.find_first_not_of(text_or_empty(characters)));
    return *this;
}

CString& CString::TrimRight() {
    m_text.erase(std::find_if_not(m_text.rbegin(), m_text.rend(), is_space).base(), m_text.end());
    return *this;
}

CString& CString::TrimRight(wchar_t character) {
    m_text.erase(m_text.find_last_not_of(character) + 1);
    return *this;
}

CString& CString::TrimRight(const wchar_t* characters) {
    m_text.erase(m_text.find_last_not_of(text_or_empty(characters)) + 1);
    return *this;
}

wchar_t* CString::GetBuffer(int least_length) {
    m_text.resize(std::max(m_text.size(), static_cast<std::size_t>(std::max(least_length, 0))));
    return m_text.data();
}

void CString::ReleaseBuffer(int length) noexcept {
    const std::size_t end = length < 0 ? m_text.find(L'\0') : static_cast<std::size_t>(length);
    m_text.resize(std::min(end, m_text.size()));
}
