#include "src/platform/text/utf8.h"

#if defined(__SSE2__)
#include <emmintrin.h>
#endif

#include <algorithm>
#include <bit>
#include <cstdint>
#include <cstring>

namespace basalt::platform {

namespace {

// Number of leading ASCII bytes, eight at a time: names and messages are nearly all ASCII.
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

#if defined(__SSE2__)
// Narrows sixteen characters and returns how many leading ones are from ' ' to 0x7F. Narrowing saturates, to
// 0xFF and 0; as signed bytes all but the printing characters are below ' '.
std::size_t copy_sixteen(const wchar_t* text, char* bytes) {
    const auto four = [text](std::size_t offset) {
        return _mm_loadu_si128(reinterpret_cast<const __m128i*>(text + offset));
    };
    const __m128i packed =
        _mm_packus_epi16(_mm_packs_epi32(four(0), four(4)), _mm_packs_epi32(four(8), four(12)));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(bytes), packed);
    const __m128i is_printing = _mm_cmpgt_epi8(packed, _mm_set1_epi8(' ' - 1));
    return static_cast<std::size_t>(std::countr_one(static_cast<unsigned>(_mm_movemask_epi8(is_printing))));
}
#endif

struct Decoded {
    wchar_t ch;
    std::size_t length;
};

constexpr Decoded INVALID = {REPLACEMENT_CHARACTER, 1};

// The first character of a text that is not empty.
Decoded decode_front(std::string_view text) {
    const auto lead = static_cast<unsigned char>(text[0]);
    if (lead < 0x80) {
        return {static_cast<wchar_t>(lead), 1};
    }
    if (lead < 0xC0 || lead > 0xF4) {
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

std::size_t write_printing(std::wstring_view text, char* bytes) {
    std::size_t count = 0;
#if defined(__SSE2__)
    // The last sixteen overlap the ones before.
    if (text.size() >= 16) {
        const std::size_t last = text.size() - 16;
        for (; count < last; count += 16) {
            const std::size_t printing = copy_sixteen(text.data() + count, bytes + count);
            if (printing < 16) {
                return count + printing;
            }
        }
        return last + copy_sixteen(text.data() + last, bytes + last);
    }
#endif
    for (; count < text.size() && text[count] >= L' ' && text[count] < 0x80; ++count) {
        bytes[count] = static_cast<char>(text[count]);
    }
    return count;
}

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

char* write_utf8(std::wstring_view& text, char* bytes, bool as_lines) {
    for (;;) {
        const std::size_t printing = write_printing(text, bytes);
        bytes += printing;
        text.remove_prefix(printing);
        if (text.empty() || (as_lines && text.front() == L'\0')) {
            return bytes;
        }
        if (as_lines && text.front() == L'\n') {
            *bytes++ = '\r';
        }
        bytes += encode_utf8(text.front(), bytes);
        text.remove_prefix(1);
    }
}

std::string utf8_from_wide(std::wstring_view text) {
    constexpr std::size_t PIECE = 64;
    char bytes[PIECE * MAX_UTF8_BYTES];
    std::string result;
    result.reserve(text.size());
    while (!text.empty()) {
        std::wstring_view piece = text.substr(0, PIECE);
        text.remove_prefix(piece.size());
        result.append(bytes, write_utf8(piece, bytes));
    }
    return result;
}

std::size_t write_wide(std::string_view text, wchar_t* characters, std::size_t capacity) {
    std::size_t count = 0;
    while (!text.empty()) {
        const std::size_t ascii = ascii_prefix(text);
        if (count < capacity) {
            std::copy_n(text.begin(), std::min(ascii, capacity - count), characters + count);
        }
        count += ascii;
        text.remove_prefix(ascii);
        while (!text.empty() && static_cast<unsigned char>(text[0]) >= 0x80) {
            const Decoded front = decode_front(text);
            if (count < capacity) {
                characters[count] = front.ch;
            }
            ++count;
            text.remove_prefix(front.length);
        }
    }
    return count;
}

}  // namespace basalt::platform
