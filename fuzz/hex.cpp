// Hexadecimal text: every form of the codec against a plain one, and both directions against each other.
#include <algorithm>
#include <cctype>
#include <stdexcept>

#include "basalt/util/hex.h"
#include "fuzz/input.h"
#include "src/util/hex_codec.h"

using namespace basalt;
using namespace basalt::util;
using basalt::fuzz::require;
using Bytes = std::vector<unsigned char>;

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const auto are_digits = [](const std::string& text) {
        return std::all_of(text.begin(), text.end(), [](unsigned char ch) { return std::isxdigit(ch) != 0; });
    };
    std::vector<std::pair<decltype(&encode_hex), decltype(&decode_hex)>> forms = {
        {encode_hex, decode_hex}, {encode_hex_portable, decode_hex_portable}};
#if BASALT_HAS_VECTOR_HEX
    forms.emplace_back(&encode_hex_sse2, &decode_hex_sse2);
    if (can_use_avx2()) {
        forms.emplace_back(&encode_hex_avx2, &decode_hex_avx2);
    }
#endif
    const Bytes bytes(data, data + size);
    const std::string any(data, data + size);
    std::string text;
    std::string spoilt;  // in upper case, and one character is any
    for (const unsigned char byte : bytes) {
        text.append({"0123456789abcdef"[byte >> 4], "0123456789abcdef"[byte & 15]});
        spoilt.append({"0123456789ABCDEF"[byte >> 4], "0123456789ABCDEF"[byte & 15]});
    }
    spoilt[size > 0 ? data[0] * 7U % spoilt.size() : 0] = size > 0 ? any[size / 2] : '\0';
    for (const auto& [encode, decode] : forms) {  // in buffers of exactly their size
        std::vector<char> digits(text.size());
        encode(bytes.data(), size, digits.data());
        require(std::equal(digits.begin(), digits.end(), text.begin()));
        for (const std::string& pairs : {text, spoilt, any.substr(0, size / 2 * 2)}) {
            const std::vector<char> from(pairs.begin(), pairs.end());
            Bytes decoded(from.size() / 2);
            require(decode(from.data(), decoded.size(), decoded.data()) == are_digits(pairs));
            require(!are_digits(pairs) || decoded == HexStringToVector(pairs));
        }
    }
    require(VectorToHexString(bytes) == text && StringToHexString(any) == text);
    require(HexStringToVector(text) == bytes && IsHexString(any) == are_digits(any));
    require(IsHexString(text) && IsHexString(spoilt) == are_digits(spoilt));
    const Bytes decoded = HexStringToVector(any);
    const bool has_zero = std::find(decoded.begin(), decoded.end(), 0) != decoded.end();
    try {
        require(HexStringToString(any) == std::string(decoded.begin(), decoded.end()) && !has_zero);
    } catch (const std::runtime_error&) {
        require(has_zero);
    }
    return 0;
}
