// The two character conversions into buffers of exactly their size, in the environment's encoding; and the
// coders of UTF-8, plain ASCII and, made by localedef in the folder that LOCPATH names, ISO-8859-1 and EUC-KR
// against the system's own routines. The C library keeps memory for each locale opened from such a folder, so
// that needs ASAN_OPTIONS=detect_leaks=0.
#include <locale.h>

#include <climits>
#include <cstdint>
#include <cstring>
#include <string>
#include <vector>

#include "basalt/frame.h"
#include "fuzz/input.h"
#include "src/platform/code_page.h"

namespace {

using namespace basalt::platform;
using basalt::fuzz::require;

// Both directions, cut and emptied as they are, against the whole conversion.
void check_buffers(const std::string& bytes, const std::wstring& wide, int n) {
    const auto room = static_cast<std::size_t>(n);
    std::vector<wchar_t> to_wide(room + 1, L'?');
    _char2tchar(bytes.c_str(), to_wide.data(), n);
    const std::string cut(bytes.c_str(), strnlen(bytes.c_str(), room));
    require(widen(cut) == to_wide.data());

    std::vector<char> to_narrow(room + 1, '?');
    _tchar2char(wide.c_str(), to_narrow.data(), n);
    const std::string all = narrow(wide.c_str());
    require((all.size() <= room ? all : "") == to_narrow.data());
}

// What comes of any bytes are characters, and those come back.
void check_code_page(const CodePage& code_page, const std::string& bytes) {
    const std::wstring wide = code_page.widen(bytes);
    require(wide.size() <= bytes.size());
    for (const wchar_t ch : wide) {
        require(is_unicode_scalar(ch));
    }
    std::vector<wchar_t> some(wide.size() / 2);
    require(code_page.widen_to(bytes, some.data(), some.size()) == wide.size());
    require(wide.compare(0, some.size(), some.data(), some.size()) == 0);
    if (wide.find(REPLACEMENT_CHARACTER) == wide.npos) {
        require(code_page.widen(code_page.narrow(wide)) == wide);
    }
}

// However a text is cut into pieces, it comes out as a whole; in lines, the same with more line ends.
void check_pieces(const CodePage& code_page, const std::wstring& wide, std::size_t most) {
    std::vector<char> bytes((wide.size() + 2) * MB_LEN_MAX);
    char* end = bytes.data();
    std::mbstate_t state{};
    for (std::wstring_view left = wide; !left.empty();) {
        end = code_page.narrow_piece(left, most, end, state);
    }
    require(std::string(bytes.data(), end) == code_page.narrow(wide));

    end = bytes.data();
    for (std::wstring_view left = wide; !left.empty();) {
        end = code_page.narrow_line_piece(left, most, end, state);
    }
    std::string lines;
    for (const char byte : code_page.narrow(wide.c_str())) {
        lines.append(byte == '\n' ? "\r" : "").append(1, byte);
    }
    require(std::string(bytes.data(), end) == lines);
}

std::wstring wide_units(const std::uint8_t* data, std::size_t size) {
    std::wstring wide;
    for (; size >= 3; data += 3, size -= 3) {
        wide += static_cast<wchar_t>(data[0] | data[1] << 8 | (data[2] & 0x1F) << 16);
    }
    return wide;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    static const CodePage code_pages[] = {CodePage(nullptr), CodePage("C"), CodePage("ISO-8859-1"),
                                          CodePage("EUC-KR")};
    static const locale_t utf8 = newlocale(LC_CTYPE_MASK, "C.UTF-8", nullptr);
    if (size == 0) {
        return 0;
    }
    const std::string bytes(reinterpret_cast<const char*>(data + 1), size - 1);
    const std::wstring wide = wide_units(data + 1, size - 1);
    check_buffers(bytes, wide, data[0]);
    for (const CodePage& code_page : code_pages) {
        check_code_page(code_page, bytes);
        check_pieces(code_page, wide, data[0] % 5 + 1);
    }
    if (utf8 != nullptr) {
        require(wide_from_utf8(bytes) == widen_by_locale(bytes, utf8));
        require(utf8_from_wide(wide) == narrow_by_locale(wide, utf8));
    }
    return 0;
}
