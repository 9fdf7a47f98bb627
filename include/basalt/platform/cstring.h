/// @file
/// CString, the interface's wide text type.
#ifndef BASALT_PLATFORM_CSTRING_H
#define BASALT_PLATFORM_CSTRING_H

#include <cstddef>
#include <string>
#include <type_traits>
#include <utility>

#include "basalt/export.h"
#include "basalt/platform/format_argument.h"

/// Wide text with value semantics, one unit a character, counted: it may hold zeros, though whatever takes or
/// gives a plain pointer ends at the first.
///
/// Wherever text is taken by pointer, null is the empty text. Positions count from 0; a position or count
/// outside the text is brought to the nearest end, unless said otherwise, and is never an error. Narrow text
/// is in the active code page: the encoding of the environment's locale, UTF-8 where that names none. A call
/// that has no form for a narrow character takes its number for a wide one.
///
/// Bad input: no call fails; std::bad_alloc and std::length_error (more than 2^31 - 1 characters) leave the
/// text as it was.
///
/// Threads: reentrant; one object is used by one thread at a time, or by many for reading.
class BASALT_API CString {
    // No plain overload for char: numbers, which become wide characters, would suit both alike.
    template <class Character>
    using IfNarrow = std::enable_if_t<std::is_same_v<Character, char>, int>;

public:
    /// @name Construction
    /// A negative length or repeat count gives the empty text.
    /// @{

    /// The empty text.
    CString() noexcept = default;
    /// The empty text.
    CString(std::nullptr_t) noexcept {}
    /// A wide text up to its zero.
    CString(const wchar_t* text);
    /// `length` wide characters, zeros included.
    CString(const wchar_t* text, int length);
    /// A narrow text up to its zero.
    CString(const char* text);
    /// `length` bytes of narrow text, zeros included.
    CString(const char* text, int length);
    /// One character, `repeat` times.
    explicit CString(wchar_t character, int repeat = 1);
    /// One narrow character, `repeat` times.
    explicit CString(char character, int repeat = 1);
    /// Becomes the one character.
    CString& operator=(wchar_t character);
    /// Becomes the one narrow character.
    template <class Character, IfNarrow<Character> = 0>
    CString& operator=(Character character) {
        return *this = CString(character);
    }
    /// @}

    /// @name Reading
    /// @{

    /// The number of characters.
    int GetLength() const noexcept { return static_cast<int>(m_text.size()); }
    /// Whether there is no character.
    bool IsEmpty() const noexcept { return m_text.empty(); }
    /// The text with a zero after it, valid until the object is next changed.
    const wchar_t* GetString() const noexcept { return m_text.c_str(); }
    /// What GetString gives.
    operator const wchar_t*() const noexcept { return m_text.c_str(); }
    /// The character at a position; 0 outside the text.
    wchar_t GetAt(std::ptrdiff_t position) const noexcept {
        return static_cast<std::size_t>(position) < m_text.size() ? m_text[static_cast<std::size_t>(position)]
                                                                  : L'\0';
    }
    /// What GetAt gives.
    wchar_t operator[](std::ptrdiff_t position) const noexcept { return GetAt(position); }
    /// @}

    /// @name Parts, as a text of their own
    /// @{

    /// The first `count` characters.
    CString Left(int count) const;
    /// The last `count` characters.
    CString Right(int count) const;
    /// The characters from position `first` to the end.
    CString Mid(int first) const;
    /// `count` characters from position `first`.
    CString Mid(int first, int count) const;
    /// @}

    /// @name Searching
    /// The position of the first match at or after `start`, or of the last match; -1 when there is none, also
    /// for a start outside the text and a null pointer. The empty text is found at every start.
    /// @{

    /// The first such character.
    int Find(wchar_t character, int start = 0) const noexcept;
    /// The first such text.
    int Find(const wchar_t* text, int start = 0) const noexcept;
    /// The last such character.
    int ReverseFind(wchar_t character) const noexcept;
    /// The first of any of the characters given.
    int FindOneOf(const wchar_t* characters) const noexcept;
    /// @}

    /// @name Comparison
    /// -1, 0 or 1 as this text comes before, is or comes after the other.
    /// @{

    /// By the characters' codes.
    int Compare(const wchar_t* other) const noexcept;
    /// By the codes of the lower-case forms, in the environment's locale.
    int CompareNoCase(const wchar_t* other) const;
    /// @}

    /// @name Changing
    /// @{

    /// Becomes the empty text.
    void Empty() noexcept { m_text.clear(); }
    /// Replaces the character at a position; outside the text nothing changes.
    void SetAt(int position, wchar_t character) noexcept;
    /// Appends a text.
    CString& operator+=(const CString& other);
    /// Appends a text up to its zero.
    CString& operator+=(const wchar_t* other);
    /// Appends a character.
    CString& operator+=(wchar_t character);
    /// Appends a narrow character.
    template <class Character, IfNarrow<Character> = 0>
    CString& operator+=(Character character) {
        return *this += CString(character);
    }
    /// Puts a character in front of a position; gives the new length.
    int Insert(int position, wchar_t character);
    /// Puts a text in front of a position; gives the new length.
    int Insert(int position, const wchar_t* text);
    /// Takes `count` characters out; gives the new length.
    int Delete(int position, int count = 1);
    /// Replaces each such character; gives their number, 0 for the same character twice.
    int Replace(wchar_t old_character, wchar_t new_character) noexcept;
    /// Replaces each such text, found from the left without overlap; gives their number. An empty old text is
    /// found nowhere.
    int Replace(const wchar_t* old_text, const wchar_t* new_text);
    /// Takes every such character out; gives their number.
    int Remove(wchar_t character) noexcept;
    /// Each character to lower case, in the environment's locale.
    CString& MakeLower();
    /// Each character to upper case, in the environment's locale.
    CString& MakeUpper();
    /// Takes white space off both ends.
    CString& Trim();
    /// Takes a character off both ends.
    CString& Trim(wchar_t character);
    /// Takes any of the characters off both ends.
    CString& Trim(const wchar_t* characters);
    /// Takes white space off the front.
    CString& TrimLeft();
    /// Takes a character off the front.
    CString& TrimLeft(wchar_t character);
    /// Takes any of the characters off the front.
    CString& TrimLeft(const wchar_t* characters);
    /// Takes white space off the end.
    CString& TrimRight();
    /// Takes a character off the end.
    CString& TrimRight(wchar_t character);
    /// Takes any of the characters off the end.
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

    /// @name Joining and comparing
    /// By the characters' codes.
    /// @{

    /// The two, joined.
    friend CString operator+(CString a, const CString& b) { return std::move(a += b); }
    /// The two, joined.
    friend CString operator+(CString a, const wchar_t* b) { return std::move(a += b); }
    /// The two, joined.
    friend CString operator+(const wchar_t* a, const CString& b) { return CString(a) + b; }
    /// The two, joined.
    friend CString operator+(CString a, wchar_t b) { return std::move(a += b); }
    /// The two, joined.
    friend CString operator+(wchar_t a, const CString& b) { return CString(a) + b; }
    /// The two, joined.
    template <class Character, IfNarrow<Character> = 0>
    friend CString operator+(CString a, Character b) {
        return std::move(a += b);
    }
    /// The two, joined.
    template <class Character, IfNarrow<Character> = 0>
    friend CString operator+(Character a, const CString& b) {
        return CString(a) + b;
    }

    /// Whether the texts are the same.
    friend bool operator==(const CString& a, const CString& b) noexcept { return a.m_text == b.m_text; }
    /// Whether the texts differ.
    friend bool operator!=(const CString& a, const CString& b) noexcept { return a.m_text != b.m_text; }
    /// Whether the first comes before the second.
    friend bool operator<(const CString& a, const CString& b) noexcept { return a.m_text < b.m_text; }
    /// Whether the first comes after the second.
    friend bool operator>(const CString& a, const CString& b) noexcept { return a.m_text > b.m_text; }
    /// Whether the first does not come after the second.
    friend bool operator<=(const CString& a, const CString& b) noexcept { return a.m_text <= b.m_text; }
    /// Whether the first does not come before the second.
    friend bool operator>=(const CString& a, const CString& b) noexcept { return a.m_text >= b.m_text; }

    /// Whether the texts are the same.
    friend bool operator==(const CString& a, const wchar_t* b) noexcept { return a.Compare(b) == 0; }
    /// Whether the texts differ.
    friend bool operator!=(const CString& a, const wchar_t* b) noexcept { return a.Compare(b) != 0; }
    /// Whether the first comes before the second.
    friend bool operator<(const CString& a, const wchar_t* b) noexcept { return a.Compare(b) < 0; }
    /// Whether the first comes after the second.
    friend bool operator>(const CString& a, const wchar_t* b) noexcept { return a.Compare(b) > 0; }
    /// Whether the first does not come after the second.
    friend bool operator<=(const CString& a, const wchar_t* b) noexcept { return a.Compare(b) <= 0; }
    /// Whether the first does not come before the second.
    friend bool operator>=(const CString& a, const wchar_t* b) noexcept { return a.Compare(b) >= 0; }

    /// Whether the texts are the same.
    friend bool operator==(const wchar_t* a, const CString& b) noexcept { return b == a; }
    /// Whether the texts differ.
    friend bool operator!=(const wchar_t* a, const CString& b) noexcept { return b != a; }
    /// Whether the first comes before the second.
    friend bool operator<(const wchar_t* a, const CString& b) noexcept { return b > a; }
    /// Whether the first comes after the second.
    friend bool operator>(const wchar_t* a, const CString& b) noexcept { return b < a; }
    /// Whether the first does not come after the second.
    friend bool operator<=(const wchar_t* a, const CString& b) noexcept { return b >= a; }
    /// Whether the first does not come before the second.
    friend bool operator>=(const wchar_t* a, const CString& b) noexcept { return b <= a; }
    /// @}

private:
    void append(const wchar_t* text, std::size_t length);
    void append_formatted(const wchar_t* format, const basalt::platform::FormatArgument* arguments,
                          std::size_t count);

    std::wstring m_text;
};

template <class... Arguments>
void CString::AppendFormat(const wchar_t* format, const Arguments&... arguments) {
    // One more than there are, since an array may not be empty.
    using basalt::platform::FormatArgument;
    const FormatArgument all[] = {FormatArgument(arguments)..., FormatArgument(nullptr)};
    append_formatted(format, all, sizeof...(arguments));
}

#endif
