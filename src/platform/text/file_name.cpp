#include "src/platform/text/file_name.h"

#include <algorithm>
#include <iterator>

#include "src/platform/text/utf8.h"

namespace basalt::platform {
namespace {

constexpr bool stands_for_byte(wchar_t ch) {
    return ch == BYTE_VALUES + L'\\' || (ch >= BYTE_VALUES + 0x80 && ch <= BYTE_VALUES + 0xFF);
}

void set_wide(std::string_view name, std::wstring& result) {
    result.resize(name.size());
    result.resize(write_wide(name, result.data(), result.size()));
    // The name itself may contain the replacement character.
    if (result.find(REPLACEMENT_CHARACTER) == std::wstring::npos || utf8_from_wide(result) == name) {
        return;
    }
    result.clear();
    for (const char byte : name) {
        result.push_back(wide_from_byte(byte));
    }
}

}  // namespace

std::string file_name_from_wide(std::wstring_view name) {
    std::string result;
    result.reserve(name.size());
    for (const wchar_t ch : name) {
        if (ch == L'\\') {
            result.push_back('/');
        } else if (stands_for_byte(ch)) {
            result.push_back(static_cast<char>(ch & 0xFF));
        } else if (is_unicode_scalar(ch)) {
            char bytes[MAX_UTF8_BYTES];
            result.append(bytes, encode_utf8(ch, bytes));
        } else {
            return {};
        }
    }
    return result;
}

bool FileName::set(std::wstring_view name) {
    if (name.size() < std::size(m_short) && write_printing(name, m_short) == name.size()) {
        // Stores every byte, unlike std::replace, so that the compiler vectorises it.
        for (std::size_t i = 0; i < name.size(); ++i) {
            m_short[i] = m_short[i] == '\\' ? '/' : m_short[i];
        }
        m_short[name.size()] = '\0';
        m_name = m_short;
        return true;
    }
    m_long = file_name_from_wide(name);
    m_name = m_long.c_str();
    return !m_long.empty() || name.empty();
}

void wide_from_system_name(std::string_view name, std::wstring& result) {
    set_wide(name, result);
    std::replace(result.begin(), result.end(), L'\\', static_cast<wchar_t>(BYTE_VALUES + L'\\'));
}

std::wstring wide_from_file_name(std::string_view name) {
    std::wstring wide;
    set_wide(name, wide);
    return wide;
}

}  // namespace basalt::platform
