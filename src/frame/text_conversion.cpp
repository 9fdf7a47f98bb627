#include <cstddef>
#include <cstdint>
#include <cwchar>

#include "basalt/frame.h"
#include "src/platform/text_conversion.h"

namespace {

// The text's length, at most n.
template <class Character>
int length_up_to(const Character* text, int n) {
    int length = 0;
    while (length < n && text[length] != 0) {
        ++length;
    }
    return length;
}

// The terminator's index has 16 bits.
std::uint16_t terminator_index(int converted) {
    return static_cast<std::uint16_t>(converted);
}

}  // namespace

void _tchar2wchar(const wchar_t* source, wchar_t* destination, int n) {
    const int length = length_up_to(source, n);
    std::wmemmove(destination, source, static_cast<std::size_t>(length));
    destination[length] = L'\0';
}

void _wchar2tchar(const wchar_t* source, wchar_t* destination, int n) {
    _tchar2wchar(source, destination, n);
}

void _tchar2tchar(const wchar_t* source, wchar_t* destination, int n) {
    _tchar2wchar(source, destination, n);
}

void _char2tchar(const char* source, wchar_t* destination, int n) {
    const int converted =
        MultiByteToWideChar(CP_ACP, MB_PRECOMPOSED, source, length_up_to(source, n), destination, n);
    destination[terminator_index(converted)] = L'\0';
}

void _tchar2char(const wchar_t* source, char* destination, int n) {
    // With a capacity of 0 the result would be the number of bytes needed.
    int converted = 0;
    if (n > 0) {
        const auto length = static_cast<int>(std::wcslen(source));
        converted = WideCharToMultiByte(CP_ACP, 0, source, length, destination, n, nullptr, nullptr);
    }
    destination[terminator_index(converted)] = '\0';
}

void _int2tchar(int value, wchar_t* destination, int n, int radix) {
    _itow_s(value, destination, static_cast<std::size_t>(n), radix);
    destination[n] = L'\0';
}
