// CString::Format: numbers by the C library's printf, texts and padding here.

#include <algorithm>
#include <array>
#include <cstdio>
#include <cstdlib>
#include <cwchar>
#include <limits>
#include <new>
#include <string_view>

#include "basalt/platform/cstring.h"
#include "src/platform/code_page.h"

using basalt::platform::widen;

namespace {

using Argument = basalt::platform::FormatArgument;
using Kind = Argument::Kind;

constexpr int NO_PRECISION = -1;
// Largest width, and precision of a number: limits the memory that a format can request.
constexpr int MAX_FIELD = 1'000'000;

struct Conversion {
    std::string flags;
    int width = 0;  // negative: left-aligned
    int precision = NO_PRECISION;
    const char* size = nullptr;  // "hh", "h" or "", that of an int; null: the argument's own
    wchar_t type = L'\0';        // 0: the format ended first
};

bool is_in(wchar_t ch, std::wstring_view set) {
    return ch != L'\0' && set.find(ch) != std::wstring_view::npos;
}

// At most `precision` units. If there are that many, the text needs no terminator.
template <class Character>
std::basic_string_view<Character> truncated(const void* text, int precision) {
    const auto* const begin = static_cast<const Character*>(text);
    if (precision == NO_PRECISION) {
        return begin;
    }
    const Character* end = begin;
    while (end - begin < precision && *end != Character{}) {
        ++end;
    }
    return {begin, static_cast<std::size_t>(end - begin)};
}

class Formatter {
public:
    Formatter(const wchar_t* format, const Argument* arguments, std::size_t count)
        : m_format(format), m_arguments(arguments), m_end(arguments + count) {}

    std::wstring run() {
        while (*m_format != L'\0') {
            const wchar_t* const percent = std::wcschr(m_format, L'%');
            const wchar_t* const literal_end =
                percent != nullptr ? percent : m_format + std::wcslen(m_format);
            m_result.append(m_format, literal_end);
            m_format = literal_end;
            if (percent != nullptr) {
                const wchar_t* const start = m_format++;
                const Conversion conversion = read_conversion();
                if (conversion.type == L'%') {
                    m_result += L'%';
                } else if (!is_in(conversion.type, L"diuoxXeEfFgGaAcCsSp")) {
                    m_result.append(start, m_format);
                } else if (m_arguments != m_end) {
                    write(conversion, *m_arguments++);
                }
            }
        }
        return std::move(m_result);
    }

private:
    Conversion read_conversion() {
        Conversion conversion;
        for (; is_in(*m_format, L"-+ 0#"); ++m_format) {
            conversion.flags += static_cast<char>(*m_format);
        }
        const int width = std::clamp(read_number(), -MAX_FIELD, MAX_FIELD);
        conversion.width = conversion.flags.find('-') != std::string::npos ? -std::abs(width) : width;
        if (*m_format == L'.') {
            ++m_format;
            conversion.precision = std::max(read_number(), NO_PRECISION);
        }
        if (skip(L"I32")) {
            conversion.size = "";
        } else if (skip(L"hh")) {
            conversion.size = "hh";
        } else if (skip(L"h")) {
            conversion.size = "h";
        } else if (!skip(L"I64")) {
            while (is_in(*m_format, L"lwI")) {
                ++m_format;
            }
        }
        if (*m_format != L'\0') {
            conversion.type = *m_format++;
        }
        return conversion;
    }

    // Digits, or '*' for the next argument; 0 if there is neither. Saturates.
    int read_number() {
        constexpr std::int64_t LARGEST = std::numeric_limits<int>::max();
        std::int64_t number = 0;
        if (*m_format == L'*') {
            ++m_format;
            if (m_arguments != m_end) {
                const Argument& argument = *m_arguments++;
                number = argument.kind() == Kind::INTEGER ? argument.integer() : 0;
            }
            return static_cast<int>(std::clamp(number, -LARGEST, LARGEST));
        }
        for (; *m_format >= L'0' && *m_format <= L'9'; ++m_format) {
            number = std::min(number * 10 + (*m_format - L'0'), LARGEST);
        }
        return static_cast<int>(number);
    }

    // Skips a text if it is next. Its length bounds the comparison: the rest of the format may be long.
    bool skip(std::wstring_view text) {
        const bool is_next = std::wcsncmp(m_format, text.data(), text.size()) == 0;
        m_format += is_next ? text.size() : 0;
        return is_next;
    }

    void write(const Conversion& conversion, const Argument& argument) {
        switch (argument.kind()) {
            case Kind::INTEGER:
                return write_integer(conversion, argument);
            case Kind::FLOATING:
                return write_number(conversion, "",
                                    is_in(conversion.type, L"eEfFgGaA") ? conversion.type : L'g',
                                    argument.floating());
            default:
                return write_pointer(conversion, argument.kind(), argument.pointer());
        }
    }

    void write_pointer(const Conversion& conversion, Kind kind, const void* pointer) {
        if (conversion.type == L'p' || kind == Kind::POINTER) {
            write_address(conversion, reinterpret_cast<std::uintptr_t>(pointer));
        } else if (pointer == nullptr) {
            write_text(conversion, L"(null)");
        } else if (kind == Kind::WIDE_TEXT) {
            write_text(conversion, truncated<wchar_t>(pointer, conversion.precision));
        } else {
            write_text(conversion, widen(truncated<char>(pointer, conversion.precision)));
        }
    }

    void write_text(const Conversion& conversion, std::wstring_view text) {
        const auto width = static_cast<std::size_t>(std::abs(conversion.width));
        const std::size_t padding = width > text.size() ? width - text.size() : 0;
        m_result.append(conversion.width < 0 ? 0 : padding, L' ');
        m_result.append(text);
        m_result.append(conversion.width < 0 ? padding : 0, L' ');
    }

    void write_address(const Conversion& conversion, std::uint64_t address) {
        Conversion digits;
        digits.width = conversion.width;
        digits.precision = 16;
        write_number(digits, "ll", L'X', address);
    }

    void write_integer(const Conversion& conversion, const Argument& argument) {
        const std::int64_t value = argument.integer();
        if (conversion.type == L'p') {
            write_address(conversion, static_cast<std::uint64_t>(value));
        } else if (is_in(conversion.type, L"cC")) {
            const auto ch = static_cast<wchar_t>(value);
            const auto byte = static_cast<char>(value);
            write_text(conversion, argument.size() == 1 ? widen({&byte, 1}) : std::wstring(1, ch));
        } else {
            const wchar_t plain_type = argument.is_signed() ? L'd' : L'u';
            const wchar_t type = is_in(conversion.type, L"diuoxX") ? conversion.type : plain_type;
            if (conversion.size == nullptr && argument.size() > sizeof(int)) {
                write_number(conversion, "ll", type, value);
            } else {
                write_number(conversion, conversion.size != nullptr ? conversion.size : "", type,
                             static_cast<int>(value));
            }
        }
    }

    template <class Number>
    void write_number(const Conversion& conversion, const char* size, wchar_t type, Number number) {
        std::string format = "%";
        format.append(conversion.flags).append("*.*").append(size).append(1, static_cast<char>(type));
        const int precision = std::min(conversion.precision, MAX_FIELD);
        const auto print = [&](char* text, std::size_t capacity) {
            const int length =
                std::snprintf(text, capacity, format.c_str(), conversion.width, precision, number);
            // Lengths are limited and the format is valid: the C library is out of memory.
            if (length < 0) {
                throw std::bad_alloc();
            }
            return static_cast<std::size_t>(length);
        };
        std::array<char, 64> usual;
        const std::size_t length = print(usual.data(), usual.size());
        // The decimal point may be any character of the locale's encoding.
        if (length < usual.size()) {
            m_result.append(widen({usual.data(), length}));
        } else {
            std::string longer(length, '\0');
            print(longer.data(), length + 1);
            m_result.append(widen(longer));
        }
    }

    const wchar_t* m_format;
    const Argument* m_arguments;
    const Argument* m_end;
    std::wstring m_result;
};

}  // namespace

void CString::append_formatted(const wchar_t* format, const Argument* arguments, std::size_t count) {
    if (format != nullptr) {
        const std::wstring text = Formatter(format, arguments, count).run();
        append(text.data(), text.size());
    }
}
