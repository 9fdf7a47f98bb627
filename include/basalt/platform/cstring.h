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

/// Wide text with value semantics, one unit per character. It is counted and may hold zeros; text passed or
/// returned as a plain pointer ends at the first.
///
/// A null pointer is the empty text. Positions count from 0; unless said otherwise, a position or count
/// outside the text is clamped. Narrow text is in the active code page: the encoding of the environment's
/// locale, UTF-8 if that names none. A call without an overload for a narrow character takes its number as a
/// wide one.
/// Bad input: no call fails; std::bad_alloc and std::length_error (more than 2^31 - 1 characters) leave the
/// text unchanged.
/// Threads: reentrant; one object is used by one thread at a time, or by many for reading.
class BASALT_API CString {
public:
    /// @cond
    // Not for hosts. Public because Clang checks the access of a friend template's default arguments.
    static int order(const CString& a, const CString& b) noexcept { return a.m_text.compare(b.m_text); }
    static int order(const CString& a, const wchar_t* b) noexcept { return a.Compare(b); }
    static int order(const wchar_t* a, const CString& b) noexcept { return -b.Compare(a); }
    static int order(const CString& a, wchar_t b) noexcept { return a.Compare(std::wstring(1, b).c_str()); }
    static int order(wchar_t a, const CString& b) noexcept { return -order(b, a); }
    template <class A, class B>
    using IfTexts = decltype(order(std::declval<const A&>(), std::declval<const B&>()));
    /// @endcond

private:
    template <class Character>  // an overload for char would make calls with an int ambiguous
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
    /// Becomes one character.
    CString& operator=(wchar_t character);
    /// Becomes one narrow character.
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
    /// Same as GetString().
    operator const wchar_t*() const noexcept { return m_text.c_str(); }
    /// The character at a position; 0 outside the text.
    wchar_t GetAt(std::ptrdiff_t position) const noexcept {
        return static_cast<std::size_t>(position) < m_text.size() ? m_text[static_cast<std::size_t>(position)]
                                                                  : L'\0';
    }
    /// Same as GetAt().
    wchar_t operator[](std::ptrdiff_t position) const noexcept { return GetAt(position); }
    /// @}
    /// @name Parts, as new texts
    /// @{
    /// The first `count` characters.
    CString Left(int count) const;
    /// The last `count` characters.
    CString Right(int count) const;
    /// The characters from position `first` to the end.
    CString Mid(int first) const;
    /// `count` characters from position `first`.
    CString Mid(int first, int count) const;
    /// The leading characters that are all among the given ones.
    CString SpanIncluding(const wchar_t* characters) const {
        return CString(m_text.substr(0, m_text.find_first_not_of(or_empty(characters))));
    }
    /// The leading characters of which none is among the given ones.
    CString SpanExcluding(const wchar_t* characters) const {
        return CString(m_text.substr(0, m_text.find_first_of(or_empty(characters))));
    }
    /// The next part between separators, any of the given characters; parts are never empty.
    /// @param start where to search, 0 at first; set behind the part, or to -1 with an empty result when no
    /// part is left
    CString Tokenize(const wchar_t* separators, int& start) const {
        const wchar_t* const any = or_empty(separators);
        const auto from = start >= 0 ? static_cast<std::size_t>(start) : m_text.size();
        const std::size_t first = m_text.find_first_not_of(any, from);
        if (first == std::wstring::npos) {
            start = -1;
            return {};
        }
        const std::size_t end = m_text.find_first_of(any, first);
        start = end != std::wstring::npos ? static_cast<int>(end) + 1 : GetLength();
        return CString(m_text.substr(first, end - first));
    }
    /// @}
    /// @name Searching
    /// The position of the first match at or after `start`, or of the last match; -1 if there is none, also
    /// for a start outside the text and a null pointer. The empty text matches at every start.
    /// @{
    /// The first such character.
    int Find(wchar_t character, int start = 0) const noexcept;
    /// The first such text.
    int Find(const wchar_t* text, int start = 0) const noexcept;
    /// The last such character.
    int ReverseFind(wchar_t character) const noexcept;
    /// The first of any of the given characters.
    int FindOneOf(const wchar_t* characters) const noexcept;
    /// @}
    /// @name Comparison
    /// -1, 0 or 1: this text is before, equal to or after the other.
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
    /// Replaces the character at a position; a position outside the text is ignored.
    void SetAt(int position, wchar_t character) noexcept;
    /// Appends a text up to its zero.
    void Append(const wchar_t* text) { *this += text; }
    /// Appends `length` characters, zeros included.
    void Append(const wchar_t* text, int length) { *this += CString(text, length); }
    /// Appends a character.
    void AppendChar(wchar_t character) { *this += character; }
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
    /// Inserts a character before a position; returns the new length.
    int Insert(int position, wchar_t character);
    /// Inserts a text before a position; returns the new length.
    int Insert(int position, const wchar_t* text);
    /// Removes `count` characters; returns the new length.
    int Delete(int position, int count = 1);
    /// Replaces each such character; returns their number, 0 if both are the same.
    int Replace(wchar_t old_character, wchar_t new_character) noexcept;
    /// Replaces each such text, found from the left without overlap; returns their number. An empty old text
    /// matches nowhere.
    int Replace(const wchar_t* old_text, const wchar_t* new_text);
    /// Removes every such character; returns their number.
    int Remove(wchar_t character) noexcept;
    /// Reverses the order of the characters.
    CString& MakeReverse() {
        m_text = std::wstring(m_text.rbegin(), m_text.rend());
        return *this;
    }
    /// Each character to lower case, in the environment's locale.
    CString& MakeLower();
    /// Each character to upper case, in the environment's locale.
    CString& MakeUpper();
    /// Removes white space from both ends.
    CString& Trim();
    /// Removes a character from both ends.
    CString& Trim(wchar_t character);
    /// Removes any of the characters from both ends.
    CString& Trim(const wchar_t* characters);
    /// Removes white space from the front.
    CString& TrimLeft();
    /// Removes a character from the front.
    CString& TrimLeft(wchar_t character);
    /// Removes any of the characters from the front.
    CString& TrimLeft(const wchar_t* characters);
    /// Removes white space from the end.
    CString& TrimRight();
    /// Removes a character from the end.
    CString& TrimRight(wchar_t character);
    /// Removes any of the characters from the end.
    CString& TrimRight(const wchar_t* characters);
    /// @}
    /// @name Direct access
    /// @{
    /// A buffer of at least `least_length` characters and a zero, holding the text. The caller may write to
    /// it until ReleaseBuffer() and uses no other member meanwhile.
    wchar_t* GetBuffer(int least_length = 0);
    /// Makes the buffer's first `length` characters the text, or those before the first zero for -1.
    void ReleaseBuffer(int length = -1) noexcept;
    /// A buffer of exactly `length` characters, which are the text at once.
    wchar_t* GetBufferSetLength(int length) {
        m_text.resize(length > 0 ? static_cast<std::size_t>(length) : 0);
        return m_text.data();
    }
    /// @}

    /// Becomes the text of a format and its arguments: `%[flags][width][.precision][size]type` with the types
    /// d i u o x X, e E f F g G a A, c C, s S, p, and `%%`; `*` takes a width or precision from the
    /// arguments. Sizes are hh h l ll w I I32 I64; hh, h and I32 narrow an integer, the others keep its own
    /// width. `p` writes 16 upper-case digits. Precision limits a wide text's characters and a narrow text's
    /// bytes. A width, and a number's precision, is limited to 1,000,000. The decimal point is that of the
    /// process's locale.
    /// Arguments carry their types: %s and %S both accept wide text, CString and narrow text. An argument
    /// that does not match its type is written in its plain form, a missing one is skipped, an unknown type
    /// is copied. Arguments may come from the object itself.
    template <class... Arguments>
    void Format(const wchar_t* format, const Arguments&... arguments) {
        CString text;
        text.AppendFormat(format, arguments...);
        m_text.swap(text.m_text);
    }
    /// Appends the text that Format() would make.
    template <class... Arguments>
    void AppendFormat(const wchar_t* format, const Arguments&... arguments) {
        // One more than needed: an array may not be empty.
        using basalt::platform::FormatArgument;
        const FormatArgument all[] = {FormatArgument(arguments)..., FormatArgument(nullptr)};
        append_formatted(format, all, sizeof...(arguments));
    }

    /// @name Concatenation and comparison
    /// One side is a CString; the other may be a text, a pointer to one or a character. Comparison is by the
    /// characters' codes.
    /// @{
    /// The two texts, concatenated.
    template <class B, class = IfTexts<CString, B>>
    friend CString operator+(CString a, const B& b) {
        return std::move(a += b);
    }
    /// The two texts, concatenated.
    template <class Character,
              std::enable_if_t<std::is_integral_v<Character> || std::is_enum_v<Character>, int> = 0>
    friend CString operator+(Character a, const CString& b) {
        return (CString() += a) + b;
    }
    /// Whether the first text equals the second.
    template <class A, class B, class = IfTexts<A, B>>
    friend bool operator==(const A& a, const B& b) noexcept(noexcept(order(a, b))) {
        return order(a, b) == 0;
    }
    /// Whether the first text differs from the second.
    template <class A, class B, class = IfTexts<A, B>>
    friend bool operator!=(const A& a, const B& b) noexcept(noexcept(order(a, b))) {
        return order(a, b) != 0;
    }
    /// Whether the first text is before the second.
    template <class A, class B, class = IfTexts<A, B>>
    friend bool operator<(const A& a, const B& b) noexcept(noexcept(order(a, b))) {
        return order(a, b) < 0;
    }
    /// Whether the first text is after the second.
    template <class A, class B, class = IfTexts<A, B>>
    friend bool operator>(const A& a, const B& b) noexcept(noexcept(order(a, b))) {
        return order(a, b) > 0;
    }
    /// Whether the first text equals or is before the second.
    template <class A, class B, class = IfTexts<A, B>>
    friend bool operator<=(const A& a, const B& b) noexcept(noexcept(order(a, b))) {
        return order(a, b) <= 0;
    }
    /// Whether the first text equals or is after the second.
    template <class A, class B, class = IfTexts<A, B>>
    friend bool operator>=(const A& a, const B& b) noexcept(noexcept(order(a, b))) {
        return order(a, b) >= 0;
    }
    /// @}
private:
    explicit CString(std::wstring&& text) noexcept : m_text(std::move(text)) {}
    static const wchar_t* or_empty(const wchar_t* text) noexcept { return text != nullptr ? text : L""; }
    void append(const wchar_t* text, std::size_t length);
    void append_formatted(const wchar_t* format, const basalt::platform::FormatArgument* arguments,
                          std::size_t count);

    std::wstring m_text;
};

#endif
