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

constexpr char UTF8_LOCALE[] = "C.UTF-8";

constinit std::atomic<CodePage*> s_open = nullptr;  // the active one, once it is

// Puts a locale in force for the calling thread and the one before back at the end.
class ScopedLocale {
public:
    explicit ScopedLocale(locale_t locale) : m_before(uselocale(locale)) {}
    ~ScopedLocale() { uselocale(m_before); }
    ScopedLocale(const ScopedLocale&) = delete;
    ScopedLocale& operator=(const ScopedLocale&) = delete;

private:
    locale_t m_before;
};

// The name of the environment's locale; null where it names none or the one without an encoding.
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

constexpr auto FAILED = static_cast<std::size_t>(-1);

// Some encodings keep a character back until the next one has told whether both make one (BIG5-HKSCS and
// TCVN, for instance). Writes the bytes of what was kept and answers their count.
std::size_t encode_kept(char* bytes, std::mbstate_t& state) {
    if (std::mbsinit(&state) != 0) {
        return 0;
    }
    const std::size_t length = std::wcrtomb(bytes, L'\0', &state);
    state = {};
    return length != FAILED ? length - 1 : 0;  // without the zero's own byte
}

// Writes one character's bytes in the locale in force ('?' when it has none) and answers their count.
std::size_t encode_in_scope(wchar_t ch, char* bytes, std::mbstate_t& state) {
    std::mbstate_t before = state;
    const std::size_t length = is_unicode_scalar(ch) ? std::wcrtomb(bytes, ch, &state) : FAILED;
    if (length != FAILED && std::mbsinit(&state) == 0) {
        return length;
    }
    char kept[MB_LEN_MAX];
    const std::size_t kept_length = encode_kept(kept, before);
    // The C library leaves out those of U+E0000 to U+E007F that an encoding lacks: no failure, and no bytes.
    if (length != FAILED && !std::equal(bytes, bytes + length, kept, kept + kept_length)) {
        return length;
    }
    std::copy_n(kept, kept_length, bytes);
    bytes[kept_length] = '?';
    state = {};
    return kept_length + 1;
}

// Answers the end of what was written, with what is kept back if that is the end of the text.
char* narrow_by_locale_to(std::wstring_view piece, bool is_last, locale_t locale, char* bytes,
                          std::mbstate_t& state) {
    const ScopedLocale scope(locale);
    for (const wchar_t ch : piece) {
        bytes += encode_in_scope(ch, bytes, state);
    }
    return is_last ? bytes + encode_kept(bytes, state) : bytes;
}

// What stands for a byte that belongs to no character.
using Substitute = wchar_t (*)(char byte);

wchar_t replacement(char) {
    return REPLACEMENT_CHARACTER;
}

std::size_t widen_by_locale_to(std::string_view text, locale_t locale, Substitute substitute,
                               wchar_t* characters, std::size_t room) {
    constexpr auto NOTHING = static_cast<wchar_t>(-1);
    const ScopedLocale scope(locale);
    std::size_t count = 0;
    const auto put = [&](wchar_t ch) {
        if (count < room) {
            characters[count] = ch;
        }
        ++count;
    };
    const auto put_kept = [&](std::mbstate_t& state) {
        wchar_t ch = NOTHING;
        if (std::mbsinit(&state) == 0 && std::mbrtowc(&ch, "", 1, &state) <= 1 && ch != L'\0' &&
            ch != NOTHING) {
            put(ch);
        }
    };
    std::mbstate_t state{};
    while (!text.empty()) {
        std::mbstate_t before = state;
        wchar_t ch = NOTHING;
        std::size_t length = std::mbrtowc(&ch, text.data(), text.size(), &state);
        // The two failures, invalid and cut short, are the two largest counts. A lead byte in front of
        // ordinary text may answer either, so neither swallows more than the one byte.
        const bool is_taken = ch == NOTHING ? length > 0 : is_unicode_scalar(ch);
        if (length > text.size() || !is_taken) {
            put_kept(before);
            ch = substitute(text.front());
            length = 1;
            state = {};
        }
        if (ch != NOTHING) {
            put(ch);
        }
        if (ch == L'\0') {
            length = 1;  // answered as 0
        } else if (length == 0) {
            state = {};  // what was kept is out, but the C library gives it for ever in Shift_JISX0213
        }
        text.remove_prefix(length);
    }
    put_kept(state);
    return count;
}

std::wstring widen_by_locale(std::string_view text, locale_t locale, Substitute substitute) {
    std::wstring result(text.size(), L'\0');
    const auto convert = [&] {
        return widen_by_locale_to(text, locale, substitute, result.data(), result.size());
    };
    const std::size_t count = convert();
    result.resize(count);
    if (count > text.size()) {
        convert();  // a byte of TSCII is up to three characters
    }
    return result;
}

}  // namespace

CodePage::CodePage(const char* locale_name)
    : m_locale(locale_name != nullptr ? open_locale(locale_name) : nullptr), m_is_utf8(m_locale == nullptr) {
    if (m_locale == nullptr) {
        m_locale = open_locale(UTF8_LOCALE);
    } else {
        m_is_utf8 = std::string_view(nl_langinfo_l(CODESET, m_locale)) == "UTF-8";
    }
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

std::wstring CodePage::widen(std::string_view text) const {
    return m_is_utf8 ? wide_from_utf8(text) : widen_by_locale(text, m_locale);
}

std::wstring CodePage::widen_name(std::string_view name) const {
    return m_is_utf8 ? wide_from_file_name(name) : widen_by_locale(name, m_locale, wide_from_byte);
}

std::size_t CodePage::widen_to(std::string_view text, wchar_t* characters, std::size_t room) const {
    return m_is_utf8 ? write_wide(text, characters, room)
                     : widen_by_locale_to(text, m_locale, replacement, characters, room);
}

std::string CodePage::narrow(std::wstring_view text) const {
    return m_is_utf8 ? utf8_from_wide(text) : narrow_by_locale(text, m_locale);
}

char* CodePage::narrow_piece(std::wstring_view& text, std::size_t most, char* bytes,
                             std::mbstate_t& state) const {
    const std::wstring_view piece = text.substr(0, most);
    text.remove_prefix(piece.size());
    return m_is_utf8 ? write_utf8(piece, bytes)
                     : narrow_by_locale_to(piece, text.empty(), m_locale, bytes, state);
}

char* CodePage::narrow_line_piece(std::wstring_view& text, std::size_t most, char* bytes,
                                  std::mbstate_t& state) const {
    std::wstring_view piece = text.substr(0, most);
    if (m_is_utf8) {
        const std::size_t done = write_utf8_lines(piece, bytes);
        text.remove_prefix(done < piece.size() ? text.size() : done);
        return bytes;
    }
    const std::size_t zero = piece.find(L'\0');
    piece = piece.substr(0, zero);
    text.remove_prefix(zero != std::wstring_view::npos ? text.size() : piece.size());
    for (std::size_t line_end; (line_end = piece.find(L'\n')) != std::wstring_view::npos;
         piece.remove_prefix(line_end + 1)) {
        bytes = narrow_by_locale_to(piece.substr(0, line_end), true, m_locale, bytes, state);
        *bytes++ = '\r';
        *bytes++ = '\n';
    }
    return narrow_by_locale_to(piece, text.empty(), m_locale, bytes, state);
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
    // Not destroyed with the statics: a host's own may convert text until the last of them has gone.
    alignas(CodePage) static std::byte s_storage[sizeof(CodePage)];
    static const CodePage& s_environment = []() -> const CodePage& {
        auto* const page = new (s_storage) CodePage(environment_locale_name());
        s_open.store(page);
        return *page;
    }();
    return s_environment;
}

// At unload, and after all statics at the end of the process.
[[gnu::destructor]] static void close_active_code_page() {
    if (CodePage* const page = s_open.load()) {
        page->close();
    }
}

std::wstring widen_by_locale(std::string_view text, locale_t locale) {
    return widen_by_locale(text, locale, replacement);
}

std::string narrow_by_locale(std::wstring_view text, locale_t locale) {
    const ScopedLocale scope(locale);
    std::string result;
    result.reserve(text.size());
    std::mbstate_t state{};
    char bytes[MB_LEN_MAX];
    for (const wchar_t ch : text) {
        result.append(bytes, encode_in_scope(ch, bytes, state));
    }
    return result.append(bytes, encode_kept(bytes, state));
}

}  // namespace basalt::platform
