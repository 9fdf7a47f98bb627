#include "options.h"

#include <charconv>
#include <cstddef>
#include <cstdint>
#include <string_view>

#include "input_error.h"
#include "number_parsing.h"

const Syntax SYNTAX = {
    "Usage: palette [COLOUR]... [--picture FILE]\n"
    "\n"
    "Finds the palette's colours nearest to others, given as RRGGBB or #RRGGBB, and the colour for text "
    "over\n"
    "them. Without a colour: lists the palette's ranges.\n"
    "\n"
    "  --picture FILE  draw all colours with their numbers, and a scene beside its nearest colours, as a "
    "BMP\n"
    "                  file\n"
    "  --help          print this and exit\n"
    "  --version       print the version and exit\n"
    "\n"
    "Exit status: 0 success, 1 report or picture could not be written or memory ran out, 2 bad arguments.\n",
    {"--picture"},
    {},
};

namespace {

COLORREF parse_colour(std::string_view given) {
    const std::string_view digits = given.substr(!given.empty() && given[0] == '#' ? 1 : 0);
    constexpr std::size_t DIGITS = 6;
    std::uint32_t value = 0;
    const auto [end, error] = std::from_chars(digits.data(), digits.data() + digits.size(), value, 16);
    if (digits.size() != DIGITS || error != std::errc() || end != digits.data() + digits.size()) {
        throw InputError("a colour is six hexadecimal digits RRGGBB, not " + quoted(given));
    }
    return RGB(static_cast<int>(value >> 16), static_cast<int>(value >> 8), static_cast<int>(value));
}

}  // namespace

Options parse_options(const CommandLine& line) {
    Options options;
    for (const std::string& colour : line.operands) {
        options.colours.push_back(parse_colour(colour));
    }
    if (!line.options.empty()) {
        options.picture = file_value(line.options[0]);
    }
    return options;
}
