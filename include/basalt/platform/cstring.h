/// @file
/// CString, the interface's wide text type.
#ifndef BASALT_PLATFORM_CSTRING_H
#define BASALT_PLATFORM_CSTRING_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <type_traits>
#include <utility>

#include "basalt/export.h"

/// Wide text with value semantics, one unit a character, counted: it may hold zeros, though whatever takes or
/// gives a plain pointer ends at the first.
///
/// Wherever text is taken by pointer, null is the empty text. Positions count from 0; a position or count
/// outside the text is brought to the nearest end, unless said otherwise, and is never an error. Narrow text
/// is in the active code page: the encoding of the environment's locale, UTF-8 where that names none.
///
/// Bad input: no call fails; std::bad_alloc and std::length_error (more than 2^31 - 1 characters) leave the
/// text as it was. Threads: reentrant; one object is used by one thread at a time, or by many for reading.
class BASALT_API CString {
public:
    class FormatArgument;

    /// @name Construction
    /// A negative length or repeat count gives the empty text.
    /// @{
    CString() noexcept = default;
    CString(std::nullptr_t) noexcept {}
    CString(const wchar_t* text);
    CString(const wchar_t* text, int length);
    CString(const char* text);
    CString(const char* text, int length);
    explicit CString(wchar_t character, int repeat = 1);
    explicit CString(char character, int repeat = 1);
    CString& operator=(wchar_t character);
    /// @}

    /// @name Reading
    /// @{
    int GetLength() const noexcept { return static_cast<int>(m_text.size()); }
    bool IsEmpty() const noexcept { return m_text.empty(); }
    /// The text with a zero after it, valid until the object is next changed.
    const wchar_t* GetString() const noexcept { return m_text.c_str(); }
    operator const wchar_t*() const noexcept { return m_text.c_str(); }
    /// The character at a position; 0 outside the text.
    wchar_t GetAt(std::ptrdiff_t position) const noexcept {
        return static_cast<std::size_t>(position) < m_text.size() ? m_text[static_cast<std::size_t>(position)]
                                                                  : L'\0';
    }
    wchar_t operator[](std::ptrdiff_t position) const noexcept { return GetAt(position); }
    /// @}

    /// @name Parts, as a text of their own
    /// @{
    CString Left(int count) const;
    CString Right(int count) const;
    CString Mid(int first) const;
    CString Mid(int first, int count) const;
    /// @}

    /// @name Searching
    /// The position of the first match at or after `start`, or of the last match; -1 when there is none, also
    /// for a start outside the text and a null pointer. The empty text is found at every start.
    /// @{
    int Find(wchar_t character, int start = 0) const noexcept;
    int Find(const wchar_t* text, int start = 0) const noexcept;
    int ReverseFind(wchar_t character) const noexcept;
    /// The first of any of the characters given.
    int FindOneOf(const wchar_t* characters) const noexcept;
    /// @}

    /// @name Comparison
    /// -1, 0 or 1 as this text comes before, is or comes after the other, by the characters' codes; without
    /// regard to case, by their lower-case forms in the environment's locale.
    /// @{
    int Compare(const wchar_t* other) const noexcept;
    int CompareNoCase(const wchar_t* other) const;
    /// @}

    /// @name Changing
    /// @{
    void Empty() noexcept { m_text.clear(); }
    /// Outside the text: nothing changes.
    void SetAt(int position, wchar_t character) noexcept;
    CString& operator+=(const CString& other);
    CString& operator+=(const wchar_t* other);
    CString& operator+=(wchar_t character);
    /// Insert and Delete return the new length.
    int Insert(int position, wchar_t character);
    int Insert(int position, const wchar_t* text);
    int Delete(int position, int count = 1);
    /// The number of matches, found from the left without overlap. An empty old text matches nothing.
    int Replace(wchar_t old_character, wchar_t new_character) noexcept;
    int Replace(const wchar_t* old_text, const wchar_t* new_text);
    /// The number of characters taken out.
    int Remove(wchar_t character) noexcept;
    /// Character by character, in the environment's locale.
    CString& MakeLower();
    CString& MakeUpper();
    /// White space, or the characters given, off both ends or one.
    CString& Trim();
    CString& Trim(wchar_t character);
    CString& Trim(const wchar_t* characters);
    CString& TrimLeft();
    CString& TrimLeft(wchar_t character);
    CString& TrimLeft(const wchar_t* characters);
    CString& TrimRight();
    CString& TrimRight(wchar_t character);
    CString& TrimRight(const wchar_t* characters);
    /// @}

    /// @name Direct access
    /// @{
    /// Room for at least `least_length` characters and a zero, holding the text; the caller may write there
    /// until ReleaseBuffer, and uses no other member meanwhile.
    wchar_t* GetBuffer(int least_length = 0);
    /// Makes what was written the text: its first `length` characters, or those before the first zero for -1.
    void ReleaseBuffer(int length = -1) noexcept;
    /// @}

    /// Makes the text of a format and arguments: `%[flags][width][.precision][size]type` with the types
    /// d i u o x X, e E f F g G a A, c C, s S, p, and `%%`; `*` takes a width or precision from the
    /// arguments. Sizes are hh h l ll w I I32 I64; hh, h and I32 narrow an integer, the others keep its own
    /// width. `p` writes 16 upper-case digits. Precision limits a wide text's characters and a narrow text's
    /// bytes. A width, and a number's precision, ends at 1,000,000. A decimal point is that of the process's
    /// locale.
    ///
    /// Arguments bring their types along: a text is written as what it is, wide (CString too) or narrow, by
    /// %s and %S alike. An argument that does not suit its type is written in its plain form, a missing one
    /// not at all, an unknown type as it stands. Arguments may come from the object itself.
    template <class... Arguments>
    void Format(const wchar_t* format, const Arguments&... arguments) {
        CString text;
        text.AppendFormat(format, arguments...);
        m_text.swap(text.m_text);
    }
    /// Appends what Format would make.
    template <class... Arguments>
    void AppendFormat(const wchar_t* format, const Arguments&... arguments);

    friend CString operator+(CString a, const CString& b) { return std::move(a += b); }
    friend CString operator+(CString a, const wchar_t* b) { return std::move(a += b); }
    friend CString operator+(const wchar_t* a, const CString& b) { return CString(a) + b; }
    friend CString operator+(CString a, wchar_t b) { return std::move(a += b); }
    friend CString operator+(wchar_t a, const CString& b) { return CString(a) + b; }

    friend bool operator==(const CString& a, const CString& b) noexcept { return a.m_text == b.m_text; }
    friend bool operator!=(const CString& a, const CString& b) noexcept { return a.m_text != b.m_text; }
    friend bool operator<(const CString& a, const CString& b) noexcept { return a.m_text < b.m_text; }
    friend bool operator>(const CString& a, const CString& b) noexcept { return a.m_text > b.m_text; }
    friend bool operator<=(const CString& a, const CString& b) noexcept { return a.m_text <= b.m_text; }
    friend bool operator>=(const CString& a, const CString& b) noexcept { return a.m_text >= b.m_text; }

    friend bool operator==(const CString& a, const wchar_t* b) noexcept { return a.Compare(b) == 0; }
    friend bool operator!=(const CString& a, const wchar_t* b) noexcept { return a.Compare(b) != 0; }
    friend bool operator<(const CString& a, const wchar_t* b) noexcept { return a.Compare(b) < 0; }
    friend bool operator>(const CString& a, const wchar_t* b) noexcept { return a.Compare(b) > 0; }
    friend bool operator<=(const CString& a, const wchar_t* b) noexcept { return a.Compare(b) <= 0; }
    friend bool operator>=(const CString& a, const wchar_t* b) noexcept { return a.Compare(b) >= 0; }

    friend bool operator==(const wchar_t* a, const CString& b) noexcept { return b == a; }
    friend bool operator!=(const wchar_t* a, const CString& b) noexcept { return b != a; }
    friend bool operator<(const wchar_t* a, const CString& b) noexcept { return b > a; }
    friend bool operator>(const wchar_t* a, const CString& b) noexcept { return b < a; }
    friend bool operator<=(const wchar_t* a, const CString& b) noexcept { return b >= a; }
    friend bool operator>=(const wchar_t* a, const CString& b) noexcept { return b <= a; }

private:
    void append(const wchar_t* text, std::size_t length);
    void append_formatted(const wchar_t* format, const FormatArgument* arguments, std::size_t count);

    std::wstring m_text;
};

/// One argument of CString::Format, made by itself of a number, character, enumerator, text or pointer.
class CString::FormatArgument {
public:
    enum class Kind : unsigned char { INTEGER, FLOATING, WIDE_TEXT, NARROW_TEXT, POINTER };

    template <class T, std::enable_if_t<std::is_integral_v<T> || std::is_enum_v<T>, int> = 0>
    FormatArgument(T value) noexcept
        : m_kind(Kind::INTEGER),
          m_is_signed(std::is_enum_v<T> || std::is_signed_v<T>),
          m_size(sizeof(T)),
          m_integer(static_cast<std::int64_t>(value)) {}
    FormatArgument(double value) noexcept : m_kind(Kind::FLOATING), m_floating(value) {}
    FormatArgument(const wchar_t* text) noexcept : m_kind(Kind::WIDE_TEXT), m_pointer(text) {}
    FormatArgument(const char* text) noexcept : m_kind(Kind::NARROW_TEXT), m_pointer(text) {}
    FormatArgument(const CString& text) noexcept : FormatArgument(text.GetString()) {}
    FormatArgument(const void* pointer) noexcept : m_kind(Kind::POINTER), m_pointer(pointer) {}
    FormatArgument(std::nullptr_t) noexcept : FormatArgument(static_cast<const void*>(nullptr)) {}

    Kind kind() const noexcept { return m_kind; }
    bool is_signed() const noexcept { return m_is_signed; }
    /// Bytes of the integer's type.
    unsigned size() const noexcept { return m_size; }
    std::int64_t integer() const noexcept { return m_integer; }
    double floating() const noexcept { return m_floating; }
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

template <class... Arguments>
void CString::AppendFormat(const wchar_t* format, const Arguments&... arguments) {
    // One more than there are, since an array may not be empty.
    const FormatArgument all[] = {FormatArgument(arguments)..., FormatArgument(nullptr)};
    append_formatted(format, all, sizeof...(arguments));
}

#endif
