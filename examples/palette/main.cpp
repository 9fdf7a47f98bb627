// The palette's ranges, its colours nearest to others, and a chart of them all.

#include <basalt/graphics.h>

#include <cstddef>
#include <string>
#include <vector>

#include "chart.h"
#include "nearest.h"
#include "number_text.h"
#include "options.h"
#include "program.h"
#include "scene.h"
#include "text_table.h"

namespace {

std::string hexadecimal(COLORREF colour) {
    constexpr char DIGITS[] = "0123456789ABCDEF";
    std::string text = "#";
    for (const BYTE channel : {GetRValue(colour), GetGValue(colour), GetBValue(colour)}) {
        text += DIGITS[channel >> 4];
        text += DIGITS[channel & 15];
    }
    return text;
}

std::string range_of(int number) {
    if (number <= ColorPalette::GetSecondPaletteEndIndex()) {
        return "second";
    }
    if (number <= ColorPalette::GetLargePaletteEndIndex()) {
        return "large";
    }
    return number <= ColorPalette::GetThirdPaletteEndIndex() ? "third" : "none";
}

std::string list_ranges() {
    TextTable table({"range", "first", "last", "holds"});
    const auto add = [&table](const char* name, int first, int last, const char* holds) {
        table.add({name, std::to_string(first), std::to_string(last), holds});
    };
    add("second", ColorPalette::GetSecondPaletteStartIndex(), ColorPalette::GetSecondPaletteEndIndex(),
        "basic colours");
    add("large", ColorPalette::GetLargePaletteStartIndex(), ColorPalette::GetLargePaletteEndIndex(),
        "hues and shades");
    add("third", ColorPalette::GetThirdPaletteStartIndex(), ColorPalette::GetThirdPaletteEndIndex(), "greys");
    return "Ranges\n" + table.text();
}

std::string list_nearest(const ColorPalette& palette, const std::vector<COLORREF>& colours) {
    TextTable table({"colour", "number", "nearest", "range", "text over it"});
    for (const COLORREF colour : colours) {
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
    table.add({"largest difference of a channel", std::to_string(matched.largest_difference)});
    return "Picture\n" + table.text();
}

std::string run(const CommandLine& line) {
    const Options options = parse_options(line);
    const ColorPalette palette;
    std::string report = options.colours.empty() ? list_ranges() : list_nearest(palette, options.colours);
    if (options.picture) {
        report.append("\n").append(draw_chart(palette, *options.picture));
    }
    return report;
}

}  // namespace

int main(int count, char** arguments) {
    return run_program({"palette", SYNTAX, run}, count, arguments);
}
