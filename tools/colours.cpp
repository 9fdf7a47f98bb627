// The colour palette.
#include <basalt/graphics.h>

#include <optional>

#include "commands.h"
#include "input_error.h"
#include "number_parsing.h"

namespace {

COLORREF read_colour(Fields& fields) {
    const std::string_view field = fields.text("a colour RRGGBB");
    const std::optional<unsigned> rgb = parse_rgb(field);
    if (!rgb) {
        throw InputError("expected a colour RRGGBB or #RRGGBB, not " + quoted(field));
    }
    return RGB(static_cast<int>(*rgb >> 16), static_cast<int>(*rgb >> 8), static_cast<int>(*rgb));
}

void write_colour(COLORREF colour, Row& row) {
    constexpr char DIGITS[] = "0123456789ABCDEF";
    std::string text(1, '#');
    for (const BYTE channel : {GetRValue(colour), GetGValue(colour), GetBValue(colour)}) {
        text += DIGITS[channel >> 4];
        text += DIGITS[channel & 15];
    }
    row.text(text);
}

Work make_palette(const CommandLine& line, const Format&) {
    const std::string& what = line.operands[0];
    if (what == "nearest") {
        return [palette = ColorPalette()](Fields& fields, Row& row) {
            const unsigned char number = palette.FindClosestColor(read_colour(fields));
            row.whole(number);
            write_colour(palette[number], row);
        };
    }
    if (what == "colour") {
        return [palette = ColorPalette()](Fields& fields, Row& row) {
            const std::int64_t number = fields.whole("a number from 0 to 255", 0, 255);
            write_colour(palette[static_cast<unsigned char>(number)], row);
        };
    }
    throw InputError("expected nearest or colour, not " + quoted(what));
}

}  // namespace

const Command PALETTE = {
    "palette",
    "nearest|colour",
    "numbers and colours of the palette",
    "nearest: reads COLOUR as RRGGBB or #RRGGBB, and writes NUMBER COLOUR of the palette's nearest.\n"
    "colour: reads NUMBER, 0 to 255, and writes COLOUR. A line that begins with # is no comment here.",
    {CSV, KEEP},
    {{"echo 'fe0000 roof' | basalt palette nearest", "0 #FF0000 roof"},
     {"echo '6' | basalt palette colour", "#FFFFFF"}},
    make_palette,
    Lines::WITHOUT_COMMENTS};
