// Numbers and colours from text, the same in every locale.
#ifndef CONSOLE_NUMBER_PARSING_H
#define CONSOLE_NUMBER_PARSING_H

#include <charconv>
#include <cmath>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

/// The number that `text` as a whole spells (`-1.5`, `+2e3`, also `nan` and `inf`); nothing if it spells none
/// or one outside the range of the type.
template <typename Number>
std::optional<Number> parse_any_number(std::string_view text) {
    // from_chars rejects a leading plus, which exports of surveying programs contain.
    if (text.size() > 1 && text[0] == '+' && text[1] != '-' && text[1] != '+') {
        text.remove_prefix(1);
    }
    Number value{};
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value);
    if (error != std::errc() || end != text.data() + text.size()) {
        return std::nullopt;
    }
    return value;
}

/// As parse_any_number, finite numbers only.
inline std::optional<double> parse_number(std::string_view text) {
    const std::optional<double> value = parse_any_number<double>(text);
    return value && std::isfinite(*value) ? value : std::nullopt;
}

inline std::optional<std::int64_t> parse_integer(std::string_view text) {
    return parse_any_number<std::int64_t>(text);
}

/// The colour that `RRGGBB` or `#RRGGBB` spells, as 0xRRGGBB; nothing for any other text.
inline std::optional<unsigned> parse_rgb(std::string_view text) {
    text.remove_prefix(text.starts_with('#') ? 1 : 0);
    unsigned value = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value, 16);
    const bool is_whole = text.size() == 6 && error == std::errc() && end == text.data() + text.size();
    return is_whole ? std::optional(value) : std::nullopt;
}

/// Whether a word begins as numbers do, with a digit, a sign or a point, or is `nan` or `inf`. A name does
/// not.
inline bool begins_number(std::string_view word) {
    return word.find_first_of("+-.0123456789") == 0 || parse_any_number<double>(word);
}

/// `text` quoted for a message: shortened, with control characters replaced.
inline std::string quoted(std::string_view text) {
    constexpr std::size_t LONGEST = 40;
    std::string shown = "'";
    for (const char c : text.substr(0, LONGEST)) {
        shown += (c >= ' ' && c <= '~') ? c : '?';
    }
    return shown + (text.size() > LONGEST ? "...'" : "'");
}

#endif
