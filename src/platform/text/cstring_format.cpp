// CString::Format: reads the format, and writes each argument as its conversion and its own type have it.

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

namespace {

using Argument = basalt::platform::FormatArgument;
using Kind = Argument::Kind;

constexpr int NO_PRECISION = -1;

// Largest width, and precision of a number: a format may not ask for gigabytes of blanks.
constexpr int MAX_FIELD = 1'000'000;

struct Conversion {
    bool left = false;  // '-'
    bool plus = false;
    bool blank = false;
    bool zero = false;
    bool alternate = false;  // '#'
    int width = 0;
    int precision = NO_PRECISION;
    unsigned integer_bytes = 0;  // 0: the argument's own width
    wchar_t type = L'\0';        // 0: the format ended first
};

bool is_in(wchar_t ch, std::wstring_view set) {
    return ch != L'\0' && set.find(ch) != std::wstring_view::npos;
}

class Formatter {
public:
    Formatter(const wchar_t* format, const Argument* arguments, std::size_t count)
        : m_format(format), m_arguments(arguments), m_end(arguments + count) {}

    std::wstring run() {
        while (*m_format != L'\0') {
            if (*m_format != L'%') {
                m_result += *m_format++;
                continue;
            }
            const wchar_t* const start = m_format++;
            const Conversion conversion = read_conversion();
            if (conversion.type == L'%') {
                m_result += L'%';
            } else if (is_in(conversion.type, L"diuoxXeEfFgGaAcCsSp")) {
                write(conversion);
            } else {
                m_result.append(start, m_format);
            }
        }
        return std::move(m_result);
    }

private:
    Conversion read_conversion() {
        Conversion conversion;
        read_flags(conversion);
        const int width = read_number();
        conversion.left = conversion.left || width < 0;
        conversion.width = std::min(std::abs(width), MAX_FIELD);
        if (*m_format == L'.') {
            ++m_format;
            conversion.precision = std::max(read_number(), NO_PRECISION);
        }
        read_size(conversion);
        if (*m_format != L'\0') {
            conversion.type = *m_format++;
        }
        return conversion;
    }

    void read_flags(Conversion& conversion) {
        for (;; ++m_format) {
            switch (*m_format) {
                case L'-':
                    conversion.left = true;
                    break;
                case L'+':
                    conversion.plus = true;
                    break;
                case L' ':
                    conversion.blank = true;
                    break;
                case L'0':
                    conversion.zero = true;
                    break;
                case L'#':
                    conversion.alternate = true;
                    break;
                default:
                    return;
            }
        }
    }

    // Digits, or '*' for the next argument; 0 where there is neither. Stops short of overflow.
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

    // Steps over a text where it comes next. Looks no further: the rest of the format may be long.
    bool skip(std::wstring_view text) {
        const bool comes_next = std::wcsncmp(m_format, text.data(), text.size()) == 0;
        m_format += comes_next ? text.size() : 0;
        return comes_next;
    }

    void read_size(Conversion& conversion) {
        if (skip(L"I32")) {
            conversion.integer_bytes = 4;
        } else if (skip(L"hh")) {
            conversion.integer_bytes = 1;
        } else if (skip(L"h")) {
            conversion.integer_bytes = 2;
        } else if (!skip(L"I64")) {
            while (is_in(*m_format, L"lwI")) {
                ++m_format;
            }
        }
    }

    void write(Conversion conversion) {
        if (m_arguments == m_end) {
            return;
        }
        const Argument& argument = *m_arguments++;
        const bool by_pointer = conversion.type == L'p';
        switch (argument.kind()) {
            case Kind::INTEGER:
                if (is_in(conversion.type, L"cC")) {
                    write_character(conversion, argument);
                } else if (by_pointer) {
                    write_address(conversion, static_cast<std::uint64_t>(argument.integer()));
                } else {
                    write_integer(conversion, argument);
                }
                break;
            case Kind::FLOATING:
                write_floating(conversion, argument.floating());
                break;
            case Kind::WIDE_TEXT:
                if (const auto* const text = static_cast<const wchar_t*>(argument.pointer()); by_pointer) {
                    write_address(conversion, reinterpret_cast<std::uintptr_t>(text));
                } else {
                    write_text(conversion, text != nullptr ? cut(text, conversion.precision) : NULL_TEXT);
                }
                break;
            case Kind::NARROW_TEXT:
                if (const auto* const text = static_cast<const char*>(argument.pointer()); by_pointer) {
                    write_address(conversion, reinterpret_cast<std::uintptr_t>(text));
                } else {
                    write_text(conversion, text != nullptr
                                               ? basalt::platform::widen(cut(text, conversion.precision))
                                               : std::wstring(NULL_TEXT));
                }
                break;
            case Kind::POINTER:
                write_address(conversion, reinterpret_cast<std::uintptr_t>(argument.pointer()));
                break;
        }
    }

    static constexpr std::wstring_view NULL_TEXT = L"(null)";

    // At most `precision` units; where that many are there, no zero need follow them.
    template <class Character>
    static std::basic_string_view<Character> cut(const Character* text, int precision) {
        if (precision == NO_PRECISION) {
            return text;
        }
        const Character* end = text;
        while (end - text < precision && *end != Character{}) {
            ++end;
        }
        return {text, static_cast<std::size_t>(end - text)};
    }

    void write_text(const Conversion& conversion, std::wstring_view text) {
        const auto width = static_cast<std::size_t>(conversion.width);
        const std::size_t padding = width > text.size() ? width - text.size() : 0;
        if (!conversion.left) {
            m_result.append(padding, L' ');
        }
        m_result.append(text);
        if (conversion.left) {
            m_result.append(padding, L' ');
        }
    }

    void write_character(const Conversion& conversion, const Argument& argument) {
        if (argument.size() == 1) {
            const auto byte = static_cast<char>(argument.integer());
            write_text(conversion, basalt::platform::widen({&byte, 1}));
        } else {
            const auto ch = static_cast<wchar_t>(argument.integer());
            write_text(conversion, {&ch, 1});
        }
    }

    void write_address(const Conversion& conversion, std::uint64_t address) {
        constexpr std::wstring_view DIGITS = L"0123456789ABCDEF";
        std::array<wchar_t, 16> text;
        for (auto digit = text.rbegin(); digit != text.rend(); ++digit, address >>= 4) {
            *digit = DIGITS[address & 0xF];
        }
        write_text(conversion, {text.data(), text.size()});
    }

    void write_integer(const Conversion& conversion, const Argument& argument) {
        // An argument narrower than an int counts as one, as ever in C.
        const unsigned own_bytes = std::max(argument.size(), 4U);
        const unsigned bytes = conversion.integer_bytes != 0 ? conversion.integer_bytes : own_bytes;
        const unsigned unused_bits = 64 - 8 * bytes;
        const std::uint64_t pattern = static_cast<std::uint64_t>(argument.integer()) << unused_bits;
        const char plain_type = argument.is_signed() ? 'd' : 'u';
        const char type = is_in(conversion.type, L"diuoxX") ? static_cast<char>(conversion.type) : plain_type;
        if (type == 'd' || type == 'i') {
            write_number(conversion, "ll", 'd',
                         static_cast<long long>(static_cast<std::int64_t>(pattern) >> unused_bits));
        } else {
            write_number(conversion, "ll", type, static_cast<unsigned long long>(pattern >> unused_bits));
        }
    }

    void write_floating(const Conversion& conversion, double value) {
        const bool is_suited = is_in(conversion.type, L"eEfFgGaA");
        write_number(conversion, "", is_suited ? static_cast<char>(conversion.type) : 'g', value);
    }

    template <class Number>
    void write_number(const Conversion& conversion, const char* size, char type, Number number) {
        std::string format = "%";
        format.append(conversion.left ? "-" : "")
            .append(conversion.plus ? "+" : "")
            .append(conversion.blank ? " " : "")
            .append(conversion.zero ? "0" : "")
            .append(conversion.alternate ? "#" : "")
            .append("*.*")
            .append(size)
            .append(1, type);
        const int precision = std::min(conversion.precision, MAX_FIELD);
        const auto print = [&](char* text, std::size_t room) {
            const int length = std::snprintf(text, room, format.c_str(), conversion.width, precision, number);
            // Lengths are limited, and no format is wrong: the C library found no memory.
            if (length < 0) {
                throw std::bad_alloc();
            }
            return static_cast<std::size_t>(length);
        };
        std::array<char, 64> usual;
        const std::size_t length = print(usual.data(), usual.size());
        // A locale's decimal point may be any character of its encoding.
        if (length < usual.size()) {
            m_result.append(basalt::platform::widen({usual.data(), length}));
        } else {
            std::string longer(length, '\0');
            print(longer.data(), length + 1);
            m_result.append(basalt::platform::widen(longer));
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
