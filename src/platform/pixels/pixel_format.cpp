#include "src/platform/pixels/pixel_format.h"

#include <algorithm>
#include <array>

namespace basalt::platform {

namespace {

constexpr std::array<std::uint32_t, 2> TWO = {0x000000, 0xFFFFFF};

constexpr std::array<std::uint32_t, 16> SIXTEEN = {0x000000, 0x800000, 0x008000, 0x808000, 0x000080, 0x800080,
                                                   0x008080, 0xC0C0C0, 0x808080, 0xFF0000, 0x00FF00, 0xFFFF00,
                                                   0x0000FF, 0xFF00FF, 0x00FFFF, 0xFFFFFF};

// The first ten and last ten system colours; between them the cube of six levels a channel without its
// corners, which are system colours, and 28 greys.
constexpr std::array<std::uint32_t, 256> make_mix() {
    std::array<std::uint32_t, 256> mix = {0x000000, 0x800000, 0x008000, 0x808000, 0x000080,
                                          0x800080, 0x008080, 0xC0C0C0, 0xC0DCC0, 0xA6CAF0};
    std::size_t at = 10;
    for (std::uint32_t i = 0; i < 216; ++i) {
        const std::uint32_t red = i / 36;
        const std::uint32_t green = i / 6 % 6;
        const std::uint32_t blue = i % 6;
        if (red % 5 != 0 || green % 5 != 0 || blue % 5 != 0) {
            mix[at++] = red * 51 << 16 | green * 51 << 8 | blue * 51;
        }
    }
    for (std::uint32_t i = 1; i <= 28; ++i) {
        mix[at++] = i * 255 / 29 * 0x010101;
    }
    for (const std::uint32_t word : {0xFFFBF0U, 0xA0A0A4U, 0x808080U, 0xFF0000U, 0x00FF00U, 0xFFFF00U,
                                     0x0000FFU, 0xFF00FFU, 0x00FFFFU, 0xFFFFFFU}) {
        mix[at++] = word;
    }
    return mix;
}
constexpr std::array<std::uint32_t, 256> MIX = make_mix();

constexpr bool all_differ() {
    std::array<std::uint32_t, 256> sorted = MIX;
    std::sort(sorted.begin(), sorted.end());
    return std::adjacent_find(sorted.begin(), sorted.end()) == sorted.end();
}
static_assert(all_differ() && MIX[255] == 0xFFFFFF);

std::uint32_t squared_distance(std::uint32_t a, std::uint32_t b) {
    const auto square = [a, b](int shift) {
        const int difference = static_cast<int>(a >> shift & 0xFF) - static_cast<int>(b >> shift & 0xFF);
        return static_cast<std::uint32_t>(difference * difference);
    };
    return square(0) + square(8) + square(16);
}

std::uint32_t nearest_entry(std::span<const std::uint32_t> table, std::uint32_t word) {
    std::uint32_t best = 0;
    std::uint32_t least = squared_distance(table[0], word);
    for (std::uint32_t i = 1; i < table.size() && least > 0; ++i) {
        const std::uint32_t distance = squared_distance(table[i], word);
        if (distance < least) {
            least = distance;
            best = i;
        }
    }
    return best;
}

}  // namespace

std::span<const std::uint32_t> colour_table(int depth) {
    switch (depth) {
        case 1:
            return TWO;
        case 4:
            return SIXTEEN;
        case 8:
            return MIX;
        default:
            return {};
    }
}

std::uint32_t word_of_value(int depth, std::uint32_t value) {
    if (depth <= 8) {
        return colour_table(depth)[value];
    }
    return depth == 16 ? word_of_555(value) : value & COLOUR_BITS;
}

std::uint32_t value_of_word(int depth, std::uint32_t word) {
    if (depth <= 8) {
        return nearest_entry(colour_table(depth), word);
    }
    return depth == 16 ? nearest_555(word) : word & COLOUR_BITS;
}

ValueConverter::ValueConverter(int from, int to) : m_from(from), m_to(to) {
    if (from <= 8 && from != to) {
        std::uint32_t* entry = m_table;
        for (const std::uint32_t word : colour_table(from)) {
            *entry++ = value_of_word(to, word);
        }
    }
}

ValueConverter::ValueConverter(int from, int to, COLORREF text, COLORREF background,
                               COLORREF source_background)
    : m_from(from), m_to(to), m_by_background(to == 1) {
    if (from == to) {
        return;
    }
    if (from == 1) {
        m_table[0] = value_of_colour(to, text);
        m_table[1] = value_of_colour(to, background);
    } else if (to == 1) {
        m_background = value_of_colour(from, source_background);
    } else {
        *this = ValueConverter(from, to);
    }
}

void ValueConverter::convert(std::span<std::uint32_t> values) const {
    if (m_from == m_to) {
        return;
    }
    if (m_by_background) {
        const std::uint32_t colour_mask = colour_bits(m_from);
        for (std::uint32_t& value : values) {
            value = (value & colour_mask) == m_background ? 1 : 0;
        }
    } else if (m_from <= 8) {
        for (std::uint32_t& value : values) {
            value = m_table[value];
        }
    } else if (m_from != 16 && m_to > 16) {
        for (std::uint32_t& value : values) {
            value &= COLOUR_BITS;
        }
    } else {
        // Neighbours are often equal, and the search through a table is slow.
        std::uint32_t last = values.empty() ? 0 : values[0];
        std::uint32_t result = value_of_word(m_to, word_of_value(m_from, last));
        for (std::uint32_t& value : values) {
            if (value != last) {
                last = value;
                result = value_of_word(m_to, word_of_value(m_from, last));
            }
            value = result;
        }
    }
}

}  // namespace basalt::platform
