#include "picture.h"

#include <basalt/graphics.h>

#include "drawing.h"
#include "legend.h"
#include "map.h"

PictureSize write_picture(const Outcome& outcome, WorkArea& area) {
    constexpr int LONGER_SIDE = 680;
    const Relief relief(area);
    const Map map = lay_out_map(outcome, relief, LONGER_SIDE);
    Drawing picture(draw_map(map));
    const std::string& file = *outcome.options.picture;
    if (!outcome.options.legend) {
        picture.save(file);
        return {map.width, map.height, map.metres_per_pixel};
    }
    const Canvas paper = page_for(map);
    Drawing page(paper);
    BitBlt(page.dc(), map_left(map), MAP_TOP, map.width, map.height, picture.dc(), 0, 0, SRCCOPY);
    draw_legend(map, page);
    page.save(file);
    return {paper.width(), paper.height(), map.metres_per_pixel};
}
