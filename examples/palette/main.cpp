// The palette's ranges, its colours nearest to others, and a chart of them all.

#include <basalt/graphics.h>
#include <fmt/format.h>

#include <optional>
#include <string>
#include <vector>

#include "chart.h"
#include "input_error.h"
#include "program_options.h"
#include "scene.h"
#include "text.h"

namespace {

COLORREF parse_colour(const std::string& given) {
    const std::optional<unsigned> rgb = parse_rgb(given);
    if (!rgb) {
        throw InputError("a colour is six hexadecimal digits RRGGBB, not " + quoted(given));
    }
    return RGB(static_cast<int>(*rgb >> 16), static_cast<int>(*rgb >> 8), static_cast<int>(*rgb));
}

std::string hexadecimal(COLORREF colour) {
    return fmt::format("#{:02X}{:02X}{:02X}", GetRValue(colour), GetGValue(colour), GetBValue(colour));
}

struct Range {
    const char* name;
    int first;
    int last;
    const char* holds;
};

const Range RANGES[] = {
    {"second", ColorPalette::GetSecondPaletteStartIndex(), ColorPalette::GetSecondPaletteEndIndex(),
     "basic colours"},
    {"large", ColorPalette::GetLargePaletteStartIndex(), ColorPalette::GetLargePaletteEndIndex(),
     "hues and shades"},
    {"third", ColorPalette::GetThirdPaletteStartIndex(), ColorPalette::GetThirdPaletteEndIndex(), "greys"}};

const char* range_of(int number) {
    for (const Range& range : RANGES) {
        if (number >= range.first && number <= range.last) {
            return range.name;
        }
    }
    return "none";
}

std::string list_ranges() {
    TextTable table({"range", "first", "last", "holds"});
    for (const Range& range : RANGES) {
        table.add({range.name, std::to_string(range.first), std::to_string(range.last), range.holds});
    }
    return "Ranges\n" + table.text();
}

std::string list_nearest(const ColorPalette& palette, const std::vector<std::string>& colours) {
    TextTable table({"colour", "number", "nearest", "range", "text over it"});
    for (const std::string& text : colours) {
        const COLORREF colour = parse_colour(text);
        const unsigned char number = palette.FindClosestColor(colour);
        table.add({hexadecimal(colour), std::to_string(number), hexadecimal(palette[number]),
                   range_of(number), hexadecimal(_complementarycolor(palette[number]))});
    }
    return "Nearest colours\n" + table.text();
}

std::string draw_chart(const ColorPalette& palette, const std::string& file) {
    const Canvas scene = make_scene(SCENE_WIDTH, SCENE_HEIGHT);
    const Matched matched = match(scene, palette);
    write_chart(palette, scene, matched, file);
    TextTable table({"file", file});
    table.add({"pixels of the scene", number_text(matched.pixels)});
    table.add({"colours used", std::to_string(matched.colours_used)});
    table.add({"mean difference of a channel", number_text(matched.mean_difference, 3)});
    return "\nPicture\n" + table.text();
}

}  // namespace

int main(int count, char** arguments) {
    std::optional<std::string> picture;
    return run_program(
        {"palette",
         "Usage: palette [COLOUR]... [--picture FILE]\n\n"
         "Finds the palette's colours nearest to others, given as RRGGBB or #RRGGBB, and the colour for\n"
         "text over them. Without a colour: lists the palette's ranges.\n",
         "Exit status: 0 success, 1 report or picture could not be written or memory ran out, 2 bad\n"
         "arguments.\n",
         {{"--picture", "FILE",
           "draw all colours with their numbers, and a scene in its nearest colours, as a BMP file",
           file_into(picture)}},
         [&picture](const std::vector<std::string>& colours) {
             const ColorPalette palette;
             const std::string report = colours.empty() ? list_ranges() : list_nearest(palette, colours);
             return report + (picture ? draw_chart(palette, *picture) : "");
         }},
        count, arguments);
}
