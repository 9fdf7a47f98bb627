// The two character conversions into buffers of exactly their size, in the environment's encoding; and UTF-8,
// plain ASCII and, if LOCPATH has them, ISO-8859-1 and EUC-KR, whole and in pieces, against the C library. It
// keeps memory for each locale from LOCPATH, so that needs ASAN_OPTIONS=detect_leaks=0.
#include <locale.h>

#include <climits>
#include <cstring>
#include <cwchar>
#include <vector>

#include "basalt/frame.h"
#include "fuzz/input.h"
#include "src/platform/code_page.h"

namespace {

using namespace basalt::platform;
using basalt::fuzz::require;

// Both directions by the C library's routines, one character at a time.
std::wstring widened(std::string_view bytes, locale_t locale) {
    uselocale(locale);
    std::wstring wide;
    for (std::size_t length = 0; !bytes.empty(); bytes.remove_prefix(length)) {
        std::mbstate_t state{};
        wchar_t ch = 0;
        length = std::mbrtowc(&ch, bytes.data(), bytes.size(), &state);
        const bool is_invalid = length > bytes.size() || !is_unicode_scalar(ch);
        wide += is_invalid ? REPLACEMENT_CHARACTER : ch;
        length = is_invalid || length == 0 ? 1 : length;
    }
    uselocale(LC_GLOBAL_LOCALE);
    return wide;
}
std::string narrowed(const std::wstring& wide, locale_t locale) {
    uselocale(locale);
    std::string bytes;
    for (const wchar_t ch : wide) {
        std::mbstate_t state{};
        char some[MB_LEN_MAX];
        const std::size_t length = std::wcrtomb(some, ch, &state);
        const bool is_invalid = length - 1 >= sizeof some || !is_unicode_scalar(ch);
        bytes += is_invalid ? "?" : std::string(some, length);
    }
    uselocale(LC_GLOBAL_LOCALE);
    return bytes;
}

void check(const CodePage& code_page, locale_t locale, const std::string& bytes, const std::wstring& wide,
           int piece) {
    require(code_page.widen(bytes) == widened(bytes, locale));
    const std::string expected = narrowed(wide, locale);
    std::string all;
    std::string lines;
    std::vector<char> some(static_cast<std::size_t>(piece) * MB_LEN_MAX);
    for (std::wstring_view left = wide; !left.empty();) {
        all.append(some.data(), code_page.narrow_piece(left, static_cast<std::size_t>(piece), some.data()));
    }
    for (std::wstring_view left = wide; !left.empty();) {
        lines.append(some.data(),
                     code_page.narrow_line_piece(left, static_cast<std::size_t>(piece), some.data()));
    }
    require(all == expected && code_page.narrow(wide) == expected);
    std::string expected_lines;
    for (const char byte : narrowed(wide.c_str(), locale)) {
        expected_lines.append(byte == '\n' ? "\r" : "").append(1, byte);
    }
    require(lines == expected_lines);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    static const char* const NAMES[] = {"C.UTF-8", "C", "ISO-8859-1", "EUC-KR"};
    static const CodePage code_pages[] = {CodePage(NAMES[0]), CodePage(NAMES[1]), CodePage(NAMES[2]),
                                          CodePage(NAMES[3])};
    basalt::fuzz::Input input(data, size);
    const int n = input.byte();
    const std::string bytes(input.data(), input.data() + input.left());
    std::wstring wide;
    while (!input.is_over()) {
        wide += static_cast<wchar_t>(input.word() >> (input.byte() % 32));
    }
    std::vector<wchar_t> to_wide(static_cast<std::size_t>(n) + 1, L'?');
    _char2tchar(bytes.c_str(), to_wide.data(), n);
    require(widen({bytes.c_str(), strnlen(bytes.c_str(), static_cast<std::size_t>(n))}) == to_wide.data());
    std::vector<char> to_narrow(static_cast<std::size_t>(n) + 1, '?');
    _tchar2char(wide.c_str(), to_narrow.data(), n);
    const std::string all = narrow(wide.c_str());
    require((all.size() <= static_cast<std::size_t>(n) ? all : "") == to_narrow.data());
    for (std::size_t i = 0; i < std::size(NAMES); ++i) {
        static locale_t locales[std::size(NAMES)];
        locales[i] = locales[i] != nullptr ? locales[i] : newlocale(LC_CTYPE_MASK, NAMES[i], nullptr);
        if (locales[i] != nullptr) {
            check(code_pages[i], locales[i], bytes, wide, n % 5 + 1);
        }
    }
    return 0;
}
