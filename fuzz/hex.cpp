// Hexadecimal text: every form of the codec against the plain one, and both directions against each other.
#include <algorithm>
#include <cctype>
#include <stdexcept>

#include "basalt/util/hex.h"
#include "fuzz/input.h"
#include "src/util/hex_codec.h"

namespace {

using namespace basalt;
using namespace basalt::util;
using basalt::fuzz::require;
using Bytes = std::vector<unsigned char>;

struct Form {
    void (*encode)(const unsigned char*, std::size_t, char*);
    bool (*decode)(const char*, std::size_t, unsigned char*);
};

const std::vector<Form>& forms() {
    static const std::vector<Form> all = [] {
        std::vector<Form> found{{encode_hex, decode_hex}, {encode_hex_portable, decode_hex_portable}};
#if BASALT_HAS_VECTOR_HEX
        found.push_back({encode_hex_sse2, decode_hex_sse2});
        if (can_use_avx2()) {
            found.push_back({encode_hex_avx2, decode_hex_avx2});
        }
#endif
        return found;
    }();
    return all;
}

bool is_digit(char ch) {
    return std::isxdigit(static_cast<unsigned char>(ch)) != 0;
}

// In buffers of exactly the size needed, so that the sanitizer sees accesses beyond.
void check(const Bytes& bytes, const std::string& pairs, const std::string& text) {
    const std::vector<char> any(pairs.begin(), pairs.end());
    for (const auto& [encode, decode] : forms()) {
        std::vector<char> digits(2 * bytes.size());
        Bytes back(bytes.size());
        Bytes some(any.size() / 2);
        encode(bytes.data(), bytes.size(), digits.data());
        require(std::equal(digits.begin(), digits.end(), text.begin(), text.end()));
        require(decode(digits.data(), bytes.size(), back.data()) && back == bytes);
        require(decode(any.data(), some.size(), some.data()) ==
                std::all_of(any.begin(), any.end(), is_digit));
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const Bytes bytes(data, data + size);
    const std::string any(data, data + size);
    std::string text;
    for (const unsigned char byte : bytes) {
        text.append({"0123456789abcdef"[byte >> 4], "0123456789abcdef"[byte & 15]});
    }
    check(bytes, any.substr(0, size / 2 * 2), text);
    std::string spoilt = text;  // one character is replaced, the others change their case
    std::transform(text.begin(), text.end(), spoilt.begin(),
                   [](char ch) { return static_cast<char>(std::toupper(ch)); });
    if (size > 0) {
        spoilt[data[0] * 7 % spoilt.size()] = any[size / 2];
    }
    check(bytes, spoilt, text);
    require(VectorToHexString(bytes) == text && StringToHexString(any) == text &&
            HexStringToVector(text) == bytes);
    require(IsHexString(any) == std::all_of(any.begin(), any.end(), is_digit));
    const Bytes decoded = HexStringToVector(any);
    const bool has_zero = std::find(decoded.begin(), decoded.end(), 0) != decoded.end();
    try {
        require(HexStringToString(any) == std::string(decoded.begin(), decoded.end()) && !has_zero);
    } catch (const std::runtime_error&) {
        require(has_zero);
    }
    return 0;
}
