#include "report.h"

#include <fmt/format.h>

#include <algorithm>
#include <cmath>
#include <numbers>

#include "text.h"

namespace {

constexpr double MEGA = 1e6;

std::string section(const char* title) {
    return fmt::format("\n{}\n", title);
}

std::string words(const char* label, const std::string& text) {
    return fmt::format("  {:<22}{}\n", label, text);
}

/// A number aligned to the right, with its unit.
std::string line(const char* label, const std::string& value, const std::string& rest = {}) {
    return words(label, fmt::format("{:>18}{}{}", value, rest.empty() ? "" : " ", rest));
}

std::string degrees(double value) {
    return number_text(value, 6);
}

std::string percent(double part) {
    return number_text(100.0 * part, 2);
}

std::string box(double west, double south, double east, double north) {
    return fmt::format("{} to {}, {} to {} deg", degrees(west), degrees(east), degrees(south),
                       degrees(north));
}

std::string slope_angle(double slope) {
    return "% (" + number_text(std::atan(slope) * 180.0 / std::numbers::pi, 2) + " deg)";
}

std::string at_cell(const GridFrame& frame, const Extreme& cell) {
    return fmt::format("m  at {}, {}", degrees(frame.centre_longitude(cell.x)),
                       degrees(frame.centre_latitude(cell.y)));
}

std::string terrain_section(const Outcome& o) {
    const GridFrame& frame = o.area.frame();
    const int x = frame.columns / 2;
    const int y = frame.rows / 2;
    const geo_nee middle = o.area.centre(x, y, 0.0);
    const double east = geo_horz_dist(middle, o.area.centre(x + 1, y, 0.0));
    const double north = geo_horz_dist(middle, o.area.centre(x, y + 1, 0.0));
    double shortest = 0.0;
    for (const double longitude : {frame.west, frame.east()}) {
        for (const double latitude : {frame.south, frame.north()}) {
            shortest = std::max(shortest, o.area.plane().shortening(longitude, latitude));
        }
    }
    constexpr double SECONDS_PER_DEGREE = 3600.0;
    return "Terrain\n" + words("Source", o.options.synthetic ? "generated" : o.options.terrain) +
           words("Longitude, latitude", box(frame.west, frame.south, frame.east(), frame.north())) +
           line("Grid", number_text(frame.cells()),
                fmt::format("cells, {} east x {} north", number_text(std::int64_t{frame.columns}),
                            number_text(std::int64_t{frame.rows}))) +
           line("Cells with elevation", number_text(o.area.cells())) +
           line("Cell side", number_text(frame.cell_size * SECONDS_PER_DEGREE, 3),
                fmt::format("arc-seconds: {} m east, {} m north", number_text(east, 3),
                            number_text(north, 3))) +
           line("Lengths too short by", number_text(shortest * MEGA, 1), "ppm at most, at the corners");
}

std::string view_section(const Outcome& o) {
    const GridFrame& frame = o.area.frame();
    const Survey& s = o.survey;
    const std::optional<DegreeBox>& view = o.options.view;
    std::string text = section("View");
    text +=
        words("Rectangle", view ? box(view->west, view->south, view->east, view->north) : "the whole grid");
    text += line("Cells in view", number_text(s.in_view));
    if (!o.boundary.empty()) {
        text += words("Boundary", *o.options.boundary);
        const std::size_t count = o.boundary.size();
        const double area = std::abs(basalt::polygon_area(o.boundary.data(), count));
        const double perimeter = basalt::polygon_perimeter(o.boundary.data(), count);
        text += line("Boundary vertices", number_text(static_cast<std::int64_t>(count)),
                     fmt::format("({} m2, perimeter {} m)", number_text(area, 0), number_text(perimeter, 1)));
    }
    constexpr double SQUARE_METRES_PER_HECTARE = 1e4;
    text += line("Cells counted", number_text(s.inside));
    text += line("Area", number_text(s.area, 1), "m2");
    text += line("", number_text(s.area / SQUARE_METRES_PER_HECTARE, 4), "ha");
    text += line("Lowest", number_text(s.lowest.elevation, 3), at_cell(frame, s.lowest));
    text += line("Highest", number_text(s.highest.elevation, 3), at_cell(frame, s.highest));
    text += line("Mean elevation", number_text(s.mean_elevation, 3), "m");
    if (s.with_slope > 0) {
        text += line("Mean slope", percent(s.mean_slope), slope_angle(s.mean_slope));
        text += line("Steepest slope", percent(s.steepest), slope_angle(s.steepest));
    }
    if (s.with_slope < s.inside) {
        text += line("Cells without slope", number_text(s.inside - s.with_slope), "(no neighbours)");
    }
    return text;
}

std::string earthwork_section(const Outcome& o) {
    const Survey& s = o.survey;
    return section("Earthwork") +
           line("Grade", number_text(s.grade, 3),
                o.options.grade ? "m" : "m  the mean elevation (no --grade given)") +
           line("Cut", number_text(s.cut, 0), "m3") + line("Fill", number_text(s.fill, 0), "m3") +
           line("Cut less fill", number_text(s.cut - s.fill, 0), "m3");
}

std::string picture_section(const std::string& file, const PictureSize& picture) {
    return section("Picture") + words("File", file) +
           line("Width", number_text(std::int64_t{picture.width}), "pixels") +
           line("Height", number_text(std::int64_t{picture.height}), "pixels") +
           line("Scale", number_text(picture.metres_per_pixel, 3), "m a pixel");
}

std::string time_line(const char* step, double seconds, std::int64_t cells) {
    const double speed = seconds > 0.0 ? static_cast<double>(cells) / seconds / MEGA : 0.0;
    return line(step, number_text(seconds * 1e3, 3),
                fmt::format("ms  {} million cells a second", number_text(speed, 1)));
}

std::string store_section(const Outcome& o) {
    std::string text = section("Store");
    text += line("Cells visited", number_text(o.survey.visited), "in the selected blocks");
    if (o.memory_grown) {
        const auto grown = static_cast<double>(*o.memory_grown);
        text += line("Memory", number_text(grown / static_cast<double>(o.area.cells()), 1),
                     fmt::format("bytes a cell: memory grew by {} MB", number_text(grown / MEGA, 2)));
    }
    return text + time_line("Load", o.load_seconds, o.area.cells()) +
           time_line("Visit", o.visit_seconds, o.survey.visited);
}

}  // namespace

std::string write_report(const Outcome& o) {
    return terrain_section(o) + view_section(o) + earthwork_section(o) +
           (o.picture ? picture_section(*o.options.picture, *o.picture) : "") + store_section(o);
}
