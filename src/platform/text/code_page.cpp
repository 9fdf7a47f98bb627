#include "src/platform/code_page.h"

#include <langinfo.h>

#include <algorithm>
#include <atomic>
#include <climits>
#include <cstddef>
#include <cstdlib>
#include <cwchar>
#include <cwctype>
#include <new>

#include "src/platform/text/file_name.h"

namespace basalt::platform {

namespace {

constexpr auto FAILED = static_cast<std::size_t>(-1);

constinit std::atomic<CodePage*> s_active = nullptr;  // null: not opened yet

// Sets the calling thread's locale and restores the previous one.
class ScopedLocale {
public:
    explicit ScopedLocale(locale_t locale) : m_before(uselocale(locale)) {}
    ~ScopedLocale() { uselocale(m_before); }
    ScopedLocale(const ScopedLocale&) = delete;
    ScopedLocale& operator=(const ScopedLocale&) = delete;

private:
    locale_t m_before;
};

// Null for no locale and for those without an encoding.
const char* environment_locale_name() {
    for (const char* const variable : {"LC_ALL", "LC_CTYPE", "LANG"}) {
        const char* const value = std::getenv(variable);
        if (value != nullptr && *value != '\0') {
            const std::string_view name = value;
            return name == "C" || name == "POSIX" ? nullptr : value;
        }
    }
    return nullptr;
}

locale_t open_locale(const char* name) {
    return newlocale(LC_CTYPE_MASK, name, nullptr);
}

// Whether a letter is complete without the one behind it. Not so in TCVN, where a mark may follow.
bool is_stateless(locale_t locale) {
    const ScopedLocale scope(locale);
    std::mbstate_t state{};
    return std::mbrtowc(nullptr, "a", 1, &state) == 1 && std::mbsinit(&state) != 0;
}

// Writes one character in the thread's locale and returns the number of bytes.
std::size_t encode_by_locale(wchar_t ch, char* bytes) {
    std::mbstate_t state{};
    std::size_t length = is_unicode_scalar(ch) ? std::wcrtomb(bytes, ch, &state) : FAILED;
    if (length != FAILED && std::mbsinit(&state) == 0) {
        // BIG5-HKSCS buffers letters that a mark may follow; a zero flushes them.
        const std::size_t flushed = std::wcrtomb(bytes + length, L'\0', &state);
        length = flushed != FAILED ? length + flushed - 1 : FAILED;
    }
    // No bytes and no failure: the C library drops U+E0000 to U+E007F where the encoding lacks them.
    if (length == FAILED || length == 0) {
        *bytes = '?';
        return 1;
    }
    return length;
}

std::size_t widen_by_locale(std::string_view text, locale_t locale, wchar_t (*substitute)(char byte),
                            wchar_t* characters, std::size_t capacity) {
    const ScopedLocale scope(locale);
    std::size_t count = 0;
    for (; !text.empty(); ++count) {
        std::mbstate_t state{};
        wchar_t ch = L'\0';
        std::size_t length = std::mbrtowc(&ch, text.data(), text.size(), &state);
        // The failures, invalid and incomplete, are the two largest counts. A lead byte in front of ordinary
        // text may return either, so neither consumes more than one byte.
        if (length > text.size() || !is_unicode_scalar(ch)) {
            ch = substitute(text.front());
            length = 1;
        }
        if (count < capacity) {
            characters[count] = ch;
        }
        text.remove_prefix(std::max<std::size_t>(length, 1));  // 0 for a zero
    }
    return count;
}

wchar_t replacement(char) {
    return REPLACEMENT_CHARACTER;
}

}  // namespace

CodePage::CodePage(const char* locale_name)
    : m_locale(locale_name != nullptr ? open_locale(locale_name) : nullptr) {
    if (m_locale != nullptr && is_stateless(m_locale)) {
        m_is_utf8 = std::string_view(nl_langinfo_l(CODESET, m_locale)) == "UTF-8";
        return;
    }
    close();
    m_locale = open_locale("C.UTF-8");
}

CodePage::~CodePage() {
    close();
}

void CodePage::close() noexcept {
    if (m_locale != nullptr) {
        freelocale(m_locale);
        m_locale = nullptr;
        m_is_utf8 = true;
    }
}

std::size_t CodePage::widen_to(std::string_view text, wchar_t* characters, std::size_t capacity) const {
    return m_is_utf8 ? write_wide(text, characters, capacity)
                     : widen_by_locale(text, m_locale, replacement, characters, capacity);
}

std::wstring CodePage::widen(std::string_view text) const {
    std::wstring result(text.size(), L'\0');
    result.resize(widen_to(text, result.data(), result.size()));
    return result;
}

std::wstring CodePage::widen_name(std::string_view name) const {
    if (m_is_utf8) {
        return wide_from_file_name(name);
    }
    std::wstring result(name.size(), L'\0');
    result.resize(widen_by_locale(name, m_locale, wide_from_byte, result.data(), result.size()));
    return result;
}

char* CodePage::encode(std::wstring_view& text, std::size_t most, char* bytes, bool as_lines) const {
    std::wstring_view piece = text.substr(0, most);
    const std::size_t size = piece.size();
    if (m_is_utf8) {
        bytes = write_utf8(piece, bytes, as_lines);
    } else {
        const ScopedLocale scope(m_locale);
        for (; !piece.empty() && !(as_lines && piece.front() == L'\0'); piece.remove_prefix(1)) {
            if (as_lines && piece.front() == L'\n') {
                *bytes++ = '\r';
            }
            bytes += encode_by_locale(piece.front(), bytes);
        }
    }
    text.remove_prefix(piece.empty() ? size : text.size());
    return bytes;
}

char* CodePage::narrow_piece(std::wstring_view& text, std::size_t most, char* bytes) const {
    return encode(text, most, bytes, false);
}

char* CodePage::narrow_line_piece(std::wstring_view& text, std::size_t most, char* bytes) const {
    return encode(text, most, bytes, true);
}

wchar_t CodePage::to_lower(wchar_t ch) const {
    if (m_locale != nullptr) {
        return static_cast<wchar_t>(towlower_l(static_cast<wint_t>(ch), m_locale));
    }
    return ch >= L'A' && ch <= L'Z' ? ch - L'A' + L'a' : ch;
}

wchar_t CodePage::to_upper(wchar_t ch) const {
    if (m_locale != nullptr) {
        return static_cast<wchar_t>(towupper_l(static_cast<wint_t>(ch), m_locale));
    }
    return ch >= L'a' && ch <= L'z' ? ch - L'a' + L'A' : ch;
}

bool CodePage::is_space(wchar_t ch) const {
    if (m_locale != nullptr) {
        return iswspace_l(static_cast<wint_t>(ch), m_locale) != 0;
    }
    return ch == L' ' || (ch >= L'\t' && ch <= L'\r');
}

const CodePage& active_code_page() {
    // Not destroyed with the statics: a host's own may still convert text.
    alignas(CodePage) static std::byte s_storage[sizeof(CodePage)];
    static const CodePage& s_environment = []() -> const CodePage& {
        auto* const page = new (s_storage) CodePage(environment_locale_name());
        s_active.store(page);
        return *page;
    }();
    return s_environment;
}

// Runs at unload, and after all statics at the end of the process.
[[gnu::destructor]] static void close_active_code_page() {
    if (CodePage* const page = s_active.load()) {
        page->close();
    }
}

}  // namespace basalt::platform
