#include "src/platform/utf8.h"

#if defined(__SSE2__)
#include <emmintrin.h>
#endif

#include <cstdint>
#include <cstring>

namespace basalt::platform {

namespace {

// How many bytes at the front are ASCII, found eight at a time: names and messages are nearly all ASCII.
std::size_t ascii_prefix(std::string_view text) {
    constexpr std::uint64_t HIGH_BITS = 0x8080808080808080;
    std::size_t count = 0;
    for (; text.size() - count >= sizeof(std::uint64_t); count += sizeof(std::uint64_t)) {
        std::uint64_t eight;
        std::memcpy(&eight, text.data() + count, sizeof eight);
        if ((eight & HIGH_BITS) != 0) {
            break;
        }
    }
    while (count < text.size() && static_cast<unsigned char>(text[count]) < 0x80) {
        ++count;
    }
    return count;
}

// Copies the ASCII characters at the front and answers their count. Sixteen at a time where the processor
// always can: half the time of writing a log line otherwise.
std::size_t copy_ascii_prefix(std::wstring_view text, char* bytes) {
    std::size_t count = 0;
#if defined(__SSE2__)
    const auto four = [&](std::size_t offset) {
        return _mm_loadu_si128(reinterpret_cast<const __m128i*>(text.data() + count + offset));
    };
    const __m128i beyond_ascii = _mm_set1_epi32(~0x7F);
    for (; text.size() - count >= 16; count += 16) {
        const __m128i a = four(0), b = four(4), c = four(8), d = four(12);
        const __m128i all = _mm_or_si128(_mm_or_si128(a, b), _mm_or_si128(c, d));
        const __m128i is_ascii = _mm_cmpeq_epi32(_mm_and_si128(all, beyond_ascii), _mm_setzero_si128());
        if (_mm_movemask_epi8(is_ascii) != 0xFFFF) {
            break;
        }
        const __m128i packed = _mm_packus_epi16(_mm_packs_epi32(a, b), _mm_packs_epi32(c, d));
        _mm_storeu_si128(reinterpret_cast<__m128i*>(bytes + count), packed);
    }
#endif
    for (; count < text.size() && static_cast<char32_t>(text[count]) < 0x80; ++count) {
        bytes[count] = static_cast<char>(text[count]);
    }
    return count;
}

struct Decoded {
    wchar_t ch;
    std::size_t length;
};

constexpr Decoded INVALID = {REPLACEMENT_CHARACTER, 1};

// The character at the front of a text that is not empty.
Decoded decode_front(std::string_view text) {
    const auto lead = static_cast<unsigned char>(text[0]);
    if (lead < 0x80) {
        return {static_cast<wchar_t>(lead), 1};
    }
    // 0xC0 and 0xC1 could only begin overlong forms.
    if (lead < 0xC2 || lead > 0xF4) {
        return INVALID;
    }
    const std::size_t length = lead < 0xE0 ? 2 : lead < 0xF0 ? 3 : 4;
    if (text.size() < length) {
        return INVALID;
    }
    char32_t value = lead & (0xFFU >> (length + 1));
    for (std::size_t i = 1; i < length; ++i) {
        const auto byte = static_cast<unsigned char>(text[i]);
        if ((byte & 0xC0) != 0x80) {
            return INVALID;
        }
        value = value << 6 | (byte & 0x3FU);
    }
    constexpr char32_t SMALLEST[] = {0, 0, 0x80, 0x800, 0x10000};
    const auto ch = static_cast<wchar_t>(value);
    return value >= SMALLEST[length] && is_unicode_scalar(ch) ? Decoded{ch, length} : INVALID;
}

}  // namespace

std::size_t encode_utf8(wchar_t ch, char* bytes) {
    const auto value = static_cast<char32_t>(ch);
    if (value < 0x80) {
        bytes[0] = static_cast<char>(value);
        return 1;
    }
    if (!is_unicode_scalar(ch)) {
        bytes[0] = '?';
        return 1;
    }
    const std::size_t length = value < 0x800 ? 2 : value < 0x10000 ? 3 : 4;
    char32_t rest = value;
    for (std::size_t i = length - 1; i > 0; --i) {
        bytes[i] = static_cast<char>(0x80 | (rest & 0x3F));
        rest >>= 6;
    }
    bytes[0] = static_cast<char>(0xFF00U >> length | rest);
    return length;
}

std::string utf8_from_wide(std::wstring_view text) {
    std::string result;
    result.reserve(text.size());
    for (const wchar_t ch : text) {
        if (static_cast<char32_t>(ch) < 0x80) {
            result.push_back(static_cast<char>(ch));
        } else {
            char bytes[MAX_UTF8_BYTES];
            result.append(bytes, encode_utf8(ch, bytes));
        }
    }
    return result;
}

char* write_utf8(std::wstring_view text, char* bytes) {
    while (!text.empty()) {
        const std::size_t ascii = copy_ascii_prefix(text, bytes);
        bytes += ascii;
        text.remove_prefix(ascii);
        if (!text.empty()) {
            bytes += encode_utf8(text.front(), bytes);
            text.remove_prefix(1);
        }
    }
    return bytes;
}

std::wstring wide_from_utf8(std::string_view text) {
    std::wstring result;
    result.reserve(text.size());
    while (!text.empty()) {
        const std::size_t ascii = ascii_prefix(text);
        result.append(text.begin(), text.begin() + ascii);
        text.remove_prefix(ascii);
        while (!text.empty() && static_cast<unsigned char>(text[0]) >= 0x80) {
            const Decoded front = decode_front(text);
            result.push_back(front.ch);
            text.remove_prefix(front.length);
        }
    }
    return result;
}

}  // namespace basalt::platform
