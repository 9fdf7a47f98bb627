// Hexadecimal text: every form of the codec against the portable one, and both directions against each other.
#include <algorithm>
#include <cstdint>
#include <stdexcept>
#include <string>
#include <vector>

#include "basalt/util/hex.h"
#include "fuzz/input.h"
#include "src/util/hex_codec.h"

namespace {

using namespace basalt;
using namespace basalt::util;
using basalt::fuzz::require;
using Bytes = std::vector<unsigned char>;

// In buffers of exactly the size needed, so that the sanitizer sees what reaches beyond.
template <class Decode>
void check_decode(const Decode& decode, const std::string& text, bool is_hex, const Bytes& expected) {
    const std::vector<char> digits(text.begin(), text.end());
    Bytes bytes(text.size() / 2);
    require(decode(digits.data(), bytes.size(), bytes.data()) == is_hex);
    require(!is_hex || bytes == expected);
}

template <class Encode>
void check_encode(const Encode& encode, const Bytes& bytes, const std::string& expected) {
    std::vector<char> digits(2 * bytes.size());
    encode(bytes.data(), bytes.size(), digits.data());
    require(std::equal(digits.begin(), digits.end(), expected.begin(), expected.end()));
}

void check_round_trip(const Bytes& bytes) {
    const std::string text = VectorToHexString(bytes);
    require(text.size() == 2 * bytes.size() && IsHexString(text));
    require(HexStringToVector(text) == bytes);
    check_encode(encode_hex_portable, bytes, text);
#if BASALT_HAS_VECTOR_HEX
    check_encode(encode_hex_sse2, bytes, text);
    if (can_use_avx2()) {
        check_encode(encode_hex_avx2, bytes, text);
    }
#endif
}

void check_any_text(const std::string& text) {
    const std::string pairs = text.substr(0, text.size() / 2 * 2);
    const bool is_hex = IsHexString(pairs);
    const Bytes bytes = HexStringToVector(text);
    require(bytes.size() <= text.size() / 2);
    check_decode(decode_hex_portable, pairs, is_hex, bytes);
#if BASALT_HAS_VECTOR_HEX
    check_decode(decode_hex_sse2, pairs, is_hex, bytes);
    if (can_use_avx2()) {
        check_decode(decode_hex_avx2, pairs, is_hex, bytes);
    }
#endif
    const bool has_zero = std::find(bytes.begin(), bytes.end(), 0) != bytes.end();
    try {
        const std::string decoded = HexStringToString(text);
        require(!has_zero &&
                std::equal(bytes.begin(), bytes.end(), decoded.begin(), decoded.end(),
                           [](unsigned char a, char b) { return a == static_cast<unsigned char>(b); }));
    } catch (const std::runtime_error&) {
        require(has_zero);
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    check_round_trip(Bytes(data, data + size));
    check_any_text(std::string(data, data + size));
    return 0;
}
