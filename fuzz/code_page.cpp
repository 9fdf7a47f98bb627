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

using namespace basalt::platform;
using basalt::fuzz::require;

namespace {

// Against the C library's routines for one character at a time, in the thread's locale.
void check(const CodePage& code_page, const std::string& bytes, const std::wstring& wide, std::size_t most) {
    std::wstring widened;
    for (std::size_t done = 0, length = 0; done < bytes.size(); done += length) {
        std::mbstate_t state{};
        wchar_t ch = 0;
        length = std::mbrtowc(&ch, &bytes[done], bytes.size() - done, &state);
        const bool is_valid = length <= bytes.size() && is_unicode_scalar(ch);
        widened += is_valid ? ch : REPLACEMENT_CHARACTER;
        length = is_valid && length > 0 ? length : 1;
    }
    require(code_page.widen(bytes) == widened);
    std::string narrowed;
    std::string lines;
    for (bool is_over = false; const wchar_t ch : wide) {
        std::mbstate_t state{};
        char some[MB_LEN_MAX];
        const std::size_t length = is_unicode_scalar(ch) ? std::wcrtomb(some, ch, &state) : 0;
        const std::string encoded = length - 1 < sizeof some ? std::string(some, length) : "?";
        narrowed += encoded;
        is_over = is_over || ch == L'\0';
        lines += is_over ? "" : ch == L'\n' ? "\r\n" : encoded;
    }
    std::vector<char> piece(most * MB_LEN_MAX);
    const auto in_pieces = [&](auto next) {
        std::string all;
        for (std::wstring_view left = wide; !left.empty();) {
            all.append(piece.data(), (code_page.*next)(left, most, piece.data()));
        }
        return all;
    };
    require(in_pieces(&CodePage::narrow_piece) == narrowed);
    require(in_pieces(&CodePage::narrow_line_piece) == lines);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    basalt::fuzz::Input input(data, size);
    const std::size_t n = input.byte();
    const std::string bytes(input.data(), input.data() + input.left());
    std::wstring wide;
    while (!input.is_over()) {
        wide += static_cast<wchar_t>(input.word() >> (input.byte() % 32));
    }
    std::vector<wchar_t> to_wide(n + 1, L'?');
    _char2tchar(bytes.c_str(), to_wide.data(), static_cast<int>(n));
    require(widen(bytes.substr(0, n).c_str()) == to_wide.data());
    std::vector<char> to_narrow(n + 1, '?');
    _tchar2char(wide.c_str(), to_narrow.data(), static_cast<int>(n));
    std::wstring_view text = wide.c_str();
    std::vector<char> all(text.size() * MB_LEN_MAX + 1);
    *active_code_page().narrow_piece(text, text.size(), all.data()) = '\0';
    require((std::strlen(all.data()) <= n ? all.data() : std::string()) == to_narrow.data());
    for (const char* const name : {"C.UTF-8", "C", "ISO-8859-1", "EUC-KR"}) {
        if (const locale_t locale = newlocale(LC_CTYPE_MASK, name, nullptr)) {
            const CodePage code_page(name);
            uselocale(locale);
            check(code_page, bytes, wide, n % 5 + 1);
            uselocale(LC_GLOBAL_LOCALE);
            freelocale(locale);
        }
    }
    return 0;
}
