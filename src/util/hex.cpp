#include "basalt/util/hex.h"

#include <algorithm>
#include <stdexcept>
#include <string_view>

#include "src/platform/code_page.h"
#include "src/util/hex_codec.h"

namespace basalt {

namespace {

using util::decode_hex;
using util::encode_hex;

std::string encode(const unsigned char* bytes, std::size_t count) {
    std::string digits(2 * count, '\0');
    encode_hex(bytes, count, digits.data());
    return digits;
}

// The byte of any two characters; for digits it is their value.
unsigned char decode_pair(char32_t first, char32_t second) {
    const unsigned high = first & 0xFF;
    const unsigned low = second & 0xFF;
    const unsigned high_part = (high > '9' ? high - 7 : high) << 4;
    const unsigned low_part = low > '9' ? low - 0x57 : low - 0x30;
    return static_cast<unsigned char>(high_part | low_part);
}

// For text with other characters than digits, which counts in wide lower-case characters.
template <class Bytes>
Bytes decode_any(std::string_view text) {
    const platform::CodePage& code_page = platform::active_code_page();
    const std::wstring wide = code_page.widen(text);
    const auto lower = [&](wchar_t ch) { return static_cast<char32_t>(code_page.to_lower(ch)); };
    Bytes bytes;
    bytes.reserve(wide.size() / 2);
    for (std::size_t i = 0; i + 1 < wide.size(); i += 2) {
        const unsigned char byte = decode_pair(lower(wide[i]), lower(wide[i + 1]));
        bytes.push_back(static_cast<typename Bytes::value_type>(byte));
    }
    return bytes;
}

// If all characters are digits, none is the zero that would end the text.
template <class Bytes>
Bytes decode(const std::string& hex) {
    Bytes bytes(hex.size() / 2, 0);
    if (!decode_hex(hex.data(), bytes.size(), reinterpret_cast<unsigned char*>(bytes.data()))) {
        bytes = decode_any<Bytes>(hex.c_str());
    }
    return bytes;
}

bool has_zero(const std::string& text) {
    // The wide reads of find() would stall on bytes that were just stored one by one.
    if (text.size() < 16) {
        return std::find(text.begin(), text.end(), '\0') != text.end();
    }
    return text.find('\0') != std::string::npos;
}

}  // namespace

std::string StringToHexString(const std::string& s) {
    return encode(reinterpret_cast<const unsigned char*>(s.data()), s.size());
}

std::string VectorToHexString(const std::vector<unsigned char>& v) {
    return encode(v.data(), v.size());
}

bool IsHexChar(char c) {
    return IsHexTCHAR(static_cast<unsigned char>(c));
}

bool IsHexTCHAR(wchar_t c) {
    return (c >= L'0' && c <= L'9') || (c >= L'A' && c <= L'F') || (c >= L'a' && c <= L'f');
}

bool IsHexString(const std::string& s) {
    return std::all_of(s.begin(), s.end(), IsHexChar);
}

std::string HexStringToString(const std::string& hex) {
    auto text = decode<std::string>(hex);
    if (has_zero(text)) {
        throw std::runtime_error("Null terminator in hex string");
    }
    return text;
}

std::vector<unsigned char> HexStringToVector(const std::string& hex) {
    return decode<std::vector<unsigned char>>(hex);
}

}  // namespace basalt
