#include "chart.h"

#include <basalt/frame.h>

#include "text.h"

namespace {

constexpr COLORREF PAPER = RGB(255, 255, 255);
constexpr COLORREF INK = RGB(38, 38, 38);
constexpr COLORREF OUTLINE = RGB(150, 150, 150);
constexpr int MARGIN = 16;
constexpr int GAP = 16;
constexpr int LINE = 24;
constexpr int PER_HUE = 10;
constexpr int HUES = 24;
constexpr int CELL_WIDTH = (2 * SCENE_WIDTH + GAP) / HUES;
constexpr int CELL_HEIGHT = 24;
constexpr int WIDTH = 2 * MARGIN + 2 * SCENE_WIDTH + GAP;
constexpr int LARGE_TOP = MARGIN + LINE + 40 + GAP;
constexpr int SCENES_TOP = LARGE_TOP + LINE + PER_HUE * CELL_HEIGHT + GAP;
constexpr int HEIGHT = SCENES_TOP + LINE + SCENE_HEIGHT + MARGIN;

/// A colour's number in the middle of its field, in the colour the library has for text over it.
void draw_number(Drawing& page, const ColorPalette& palette, int number, const RECT& field) {
    const COLORREF colour = palette[static_cast<unsigned char>(number)];
    page.text((field.left + field.right) / 2, (field.top + field.bottom - Drawing::text_height(1)) / 2,
              std::to_string(number), _complementarycolor(colour), 1, Align::CENTRE);
}

/// A row of rounded fields, from one number to another.
void draw_row(Drawing& page, const ColorPalette& palette, int first, int last, int left, int top) {
    constexpr int FIELD_WIDTH = 44;
    constexpr int FIELD_HEIGHT = 40;
    constexpr int ROUNDING = 14;  // diameter
    for (int number = first; number <= last; ++number) {
        const int x = left + (number - first) * (FIELD_WIDTH + 6);
        const RECT field = {x, top, x + FIELD_WIDTH, top + FIELD_HEIGHT};
        _gradientfill(page.dc(), field.left, field.top, field.right, field.bottom, ROUNDING, PAPER, OUTLINE,
                      1.0F, GRADIENT_FILL_RECT_V);
        _gradientfill(page.dc(), field.left + 1, field.top + 1, field.right - 1, field.bottom - 1,
                      ROUNDING - 2, OUTLINE, palette[static_cast<unsigned char>(number)], 1.0F,
                      GRADIENT_FILL_RECT_V);
        draw_number(page, palette, number, field);
    }
}

std::string range_text(const char* name, int first, int last) {
    return std::string(name) + " " + std::to_string(first) + " - " + std::to_string(last);
}

void draw_hues(Drawing& page, const ColorPalette& palette) {
    const int first = ColorPalette::GetLargePaletteStartIndex();
    page.text(MARGIN, LARGE_TOP, range_text("LARGE", first, ColorPalette::GetLargePaletteEndIndex()), INK);
    for (int i = 0; i < HUES * PER_HUE; ++i) {
        const int left = MARGIN + i / PER_HUE * CELL_WIDTH;
        const int top = LARGE_TOP + LINE + i % PER_HUE * CELL_HEIGHT;
        const RECT field = {left, top, left + CELL_WIDTH, top + CELL_HEIGHT};
        page.fill(field, palette[static_cast<unsigned char>(first + i)]);
        draw_number(page, palette, first + i, field);
    }
}

void draw_picture(Drawing& page, const Canvas& picture, int left, const std::string& title) {
    page.text(left, SCENES_TOP, title, INK);
    const Drawing drawing(picture);
    BitBlt(page.dc(), left, SCENES_TOP + LINE, picture.width(), picture.height(), drawing.dc(), 0, 0,
           SRCCOPY);
}

}  // namespace

void write_chart(const ColorPalette& palette, const Canvas& scene, const Matched& matched,
                 const std::string& file) {
    _operatingsystem();  // gradients are drawn once the system is known
    Drawing page(Canvas(WIDTH, HEIGHT, PAPER));
    const int basic = ColorPalette::GetSecondPaletteStartIndex();
    const int last_basic = ColorPalette::GetSecondPaletteEndIndex();
    const int greys = ColorPalette::GetThirdPaletteStartIndex();
    const int last_grey = ColorPalette::GetThirdPaletteEndIndex();
    constexpr int GREYS_LEFT = 520;
    constexpr int LAST = 255;
    page.text(MARGIN, MARGIN, range_text("SECOND", basic, last_basic), INK);
    draw_row(page, palette, basic, last_basic, MARGIN, MARGIN + LINE);
    page.text(GREYS_LEFT, MARGIN, range_text("THIRD", greys, last_grey), INK);
    draw_row(page, palette, greys, last_grey, GREYS_LEFT, MARGIN + LINE);
    draw_row(page, palette, LAST, LAST, WIDTH - MARGIN - 44, MARGIN + LINE);
    draw_hues(page, palette);
    draw_picture(page, scene, MARGIN, "COMPUTED");
    draw_picture(page, matched.picture, MARGIN + SCENE_WIDTH + GAP,
                 "NEAREST: " + std::to_string(matched.colours_used) + " COLOURS, MEAN OFF BY " +
                     number_text(matched.mean_difference, 1));
    page.save(file);
}
