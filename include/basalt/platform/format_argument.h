/// @file
/// FormatArgument, one argument of CString::Format.
#ifndef BASALT_PLATFORM_FORMAT_ARGUMENT_H
#define BASALT_PLATFORM_FORMAT_ARGUMENT_H

#include <cstddef>
#include <cstdint>
#include <type_traits>

namespace basalt::platform {

/// One argument of CString::Format, converted implicitly from a number, character, enumerator, text or
/// pointer.
class FormatArgument {
public:
    /// What the argument is.
    enum class Kind : unsigned char {
        INTEGER,      ///< an integer, character or enumerator
        FLOATING,     ///< a floating-point number
        WIDE_TEXT,    ///< a wide text or null
        NARROW_TEXT,  ///< a narrow text or null
        POINTER       ///< any other pointer
    };

    /// An integer, character or enumerator.
    template <class T, std::enable_if_t<std::is_integral_v<T> || std::is_enum_v<T>, int> = 0>
    FormatArgument(T value) noexcept
        : m_kind(Kind::INTEGER),
          m_is_signed(std::is_enum_v<T> || std::is_signed_v<T>),
          m_size(sizeof(T)),
          m_integer(static_cast<std::int64_t>(value)) {}
    /// A floating-point number.
    FormatArgument(double value) noexcept : m_kind(Kind::FLOATING), m_floating(value) {}
    /// A wide text, not copied.
    FormatArgument(const wchar_t* text) noexcept : m_kind(Kind::WIDE_TEXT), m_pointer(text) {}
    /// A narrow text, not copied.
    FormatArgument(const char* text) noexcept : m_kind(Kind::NARROW_TEXT), m_pointer(text) {}
    /// A pointer.
    FormatArgument(const void* pointer) noexcept : m_kind(Kind::POINTER), m_pointer(pointer) {}
    /// The null pointer.
    FormatArgument(std::nullptr_t) noexcept : FormatArgument(static_cast<const void*>(nullptr)) {}

    /// What the argument is.
    Kind kind() const noexcept { return m_kind; }
    /// Whether an integer's type is signed.
    bool is_signed() const noexcept { return m_is_signed; }
    /// Size of the integer's type in bytes.
    unsigned size() const noexcept { return m_size; }
    /// The integer; an unsigned one of 64 bits as its bit pattern.
    std::int64_t integer() const noexcept { return m_integer; }
    /// The floating-point number.
    double floating() const noexcept { return m_floating; }
    /// The text or pointer.
    const void* pointer() const noexcept { return m_pointer; }

private:
    Kind m_kind;
    bool m_is_signed = false;
    unsigned char m_size = 0;
    union {
        std::int64_t m_integer;
        double m_floating;
        const void* m_pointer;
    };
};

}  // namespace basalt::platform

#endif
