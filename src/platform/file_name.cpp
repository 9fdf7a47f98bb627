#include "src/platform/file_name.h"

#include <unistd.h>

#include <cerrno>

#include "basalt/platform/error.h"
#include "src/platform/error_from_errno.h"
#include "src/platform/utf8.h"

namespace basalt::platform {
namespace {

// Low surrogates, which no UTF-8 holds.
constexpr wchar_t FIRST_BYTE = 0xDC80;
constexpr wchar_t LAST_BYTE = 0xDCFF;

}  // namespace

bool file_name_from_wide(std::wstring_view name, std::string& result) {
    // Names are nearly all ASCII, which goes straight into its place: a third of the time of appending it.
    result.resize(name.size());
    std::size_t ascii = 0;
    for (; ascii < name.size() && static_cast<char32_t>(name[ascii]) < 0x80; ++ascii) {
        result[ascii] = name[ascii] == L'\\' ? '/' : static_cast<char>(name[ascii]);
    }
    result.resize(ascii);
    for (const wchar_t ch : name.substr(ascii)) {
        if (ch == L'\\') {
            result.push_back('/');
        } else if (ch >= FIRST_BYTE && ch <= LAST_BYTE) {
            result.push_back(static_cast<char>(ch & 0xFF));
        } else if (is_unicode_scalar(ch)) {
            char bytes[MAX_UTF8_BYTES];
            result.append(bytes, encode_utf8(ch, bytes));
        } else {
            return false;
        }
    }
    return true;
}

std::wstring wide_from_file_name(std::string_view name) {
    std::wstring wide = wide_from_utf8(name);
    // The replacement character is a character too: only a name that does not come back was no UTF-8.
    if (wide.find(REPLACEMENT_CHARACTER) == std::wstring::npos || utf8_from_wide(wide) == name) {
        return wide;
    }
    wide.clear();
    for (const char byte : name) {
        const auto value = static_cast<unsigned char>(byte);
        wide.push_back(static_cast<wchar_t>(value < 0x80 ? value : 0xDC00 + value));
    }
    return wide;
}

DWORD error_of_path(const std::string& path, int number) {
    if (number != ENOENT) {
        return error_from_errno(number);
    }
    const std::size_t separator = path.find_last_of('/');
    const std::string folder = separator == std::string::npos ? "." : path.substr(0, separator + 1);
    return path.empty() || access(folder.c_str(), F_OK) != 0 ? ERROR_PATH_NOT_FOUND : ERROR_FILE_NOT_FOUND;
}

}  // namespace basalt::platform
