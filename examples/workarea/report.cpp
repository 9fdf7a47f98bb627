#include "report.h"

#include <algorithm>
#include <cmath>
#include <utility>

#include "number_text.h"

namespace {

constexpr double MEGA = 1e6;

/// Sections of lines `  label   value unit  note`, values aligned to the right.
class Sheet {
public:
    void section(const std::string& title) {
        m_text += m_text.empty() ? "" : "\n";
        m_text += title + "\n";
    }
    void line(const std::string& label, const std::string& value, const std::string& rest = {}) {
        constexpr std::size_t VALUE = 18;
        text(label, std::string(VALUE - std::min(value.size(), VALUE), ' ') + value +
                        (rest.empty() ? "" : " " + rest));
    }
    void text(const std::string& label, const std::string& words) {
        constexpr std::size_t LABEL = 22;
        m_text += "  " + label + std::string(LABEL - std::min(label.size(), LABEL), ' ') + words + "\n";
    }
    std::string take() { return std::move(m_text); }

private:
    std::string m_text;
};

std::string degrees(double value) {
    return number_text(value, 6);
}

std::string percent(double part) {
    return number_text(100.0 * part, 2);
}

std::string slope_angle(double slope) {
    constexpr double DEGREES_PER_RADIAN = 180.0 / 3.141592653589793;
    return std::string("% (") + number_text(std::atan(slope) * DEGREES_PER_RADIAN, 2) + " deg)";
}

std::string at_cell(const GridFrame& frame, const Extreme& cell) {
    return "m  at " + degrees(frame.centre_longitude(cell.x)) + ", " + degrees(frame.centre_latitude(cell.y));
}

void write_terrain(Sheet& sheet, const Outcome& o) {
    const GridFrame& frame = o.area.frame();
    const int x = frame.columns / 2;
    const int y = frame.rows / 2;
    const geo_nee middle = o.area.centre(x, y, 0.0);
    const double east = geo_horz_dist(middle, o.area.centre(x + 1, y, 0.0));
    const double north = geo_horz_dist(middle, o.area.centre(x, y + 1, 0.0));
    constexpr double SECONDS_PER_DEGREE = 3600.0;
    sheet.section("Terrain");
    sheet.text("Source", o.options.synthetic ? "generated" : o.options.terrain);
    sheet.text("Longitude, latitude", degrees(frame.west) + " to " + degrees(frame.east()) + ", " +
                                          degrees(frame.south) + " to " + degrees(frame.north()) + " deg");
    sheet.line("Grid", number_text(frame.cells()),
               "cells, " + number_text(std::int64_t{frame.columns}) + " east x " +
                   number_text(std::int64_t{frame.rows}) + " north");
    sheet.line("Cells with elevation", number_text(o.area.cells()));
    sheet.line("Cell side", number_text(frame.cell_size * SECONDS_PER_DEGREE, 3),
               "arc-seconds: " + number_text(east, 3) + " m east, " + number_text(north, 3) + " m north");
    double shortest = 0.0;
    for (const double longitude : {frame.west, frame.east()}) {
        for (const double latitude : {frame.south, frame.north()}) {
            shortest = std::max(shortest, o.area.plane().shortening(longitude, latitude));
        }
    }
    sheet.line("Lengths too short by", number_text(shortest * MEGA, 1), "ppm at most, at the corners");
}

/// Area by the cross products of neighbouring vertices, taken from the first vertex.
double polygon_area(const std::vector<geo_nee>& polygon) {
    double twice = 0.0;
    const geo_nee& a = polygon[0];
    for (std::size_t i = 2; i < polygon.size(); ++i) {
        const geo_nee& b = polygon[i - 1];
        const geo_nee& c = polygon[i];
        twice += (b.east - a.east) * (c.north - a.north) - (c.east - a.east) * (b.north - a.north);
    }
    return 0.5 * std::abs(twice);
}

double perimeter(const std::vector<geo_nee>& polygon) {
    double sum = geo_horz_dist(polygon.back(), polygon.front());
    for (std::size_t i = 1; i < polygon.size(); ++i) {
        sum += geo_horz_dist(polygon[i - 1], polygon[i]);
    }
    return sum;
}

void write_view(Sheet& sheet, const Outcome& o) {
    const GridFrame& frame = o.area.frame();
    const Survey& s = o.survey;
    constexpr double SQUARE_METRES_PER_HECTARE = 1e4;
    sheet.section("View");
    sheet.text("Rectangle", !o.options.view
                                ? "the whole grid"
                                : degrees(o.options.view->west) + " to " + degrees(o.options.view->east) +
                                      ", " + degrees(o.options.view->south) + " to " +
                                      degrees(o.options.view->north) + " deg");
    sheet.line("Cells in view", number_text(s.in_view));
    if (!o.boundary.empty()) {
        sheet.text("Boundary", *o.options.boundary);
        sheet.line("Boundary vertices", number_text(static_cast<std::int64_t>(o.boundary.size())),
                   std::string("(") + number_text(polygon_area(o.boundary), 0) + " m2, perimeter " +
                       number_text(perimeter(o.boundary), 1) + " m)");
    }
    sheet.line("Cells counted", number_text(s.inside));
    sheet.line("Area", number_text(s.area, 1), "m2");
    sheet.line("", number_text(s.area / SQUARE_METRES_PER_HECTARE, 4), "ha");
    sheet.line("Lowest", number_text(s.lowest.elevation, 3), at_cell(frame, s.lowest));
    sheet.line("Highest", number_text(s.highest.elevation, 3), at_cell(frame, s.highest));
    sheet.line("Mean elevation", number_text(s.mean_elevation, 3), "m");
    if (s.with_slope > 0) {
        sheet.line("Mean slope", percent(s.mean_slope), slope_angle(s.mean_slope));
        sheet.line("Steepest slope", percent(s.steepest), slope_angle(s.steepest));
    }
    if (s.with_slope < s.inside) {
        sheet.line("Cells without slope", number_text(s.inside - s.with_slope), "(no neighbours)");
    }
}

void write_earthwork(Sheet& sheet, const Survey& s) {
    sheet.section("Earthwork");
    sheet.line("Grade", number_text(s.grade, 3),
               s.grade_given ? "m" : "m  the mean elevation (no --grade given)");
    sheet.line("Cut", number_text(s.cut, 0), "m3");
    sheet.line("Fill", number_text(s.fill, 0), "m3");
    sheet.line("Cut less fill", number_text(s.cut - s.fill, 0), "m3");
}

void write_picture(Sheet& sheet, const std::string& file, const PictureSize& picture) {
    sheet.section("Picture");
    sheet.text("File", file);
    sheet.line("Width", number_text(std::int64_t{picture.width}), "pixels");
    sheet.line("Height", number_text(std::int64_t{picture.height}), "pixels");
    sheet.line("Scale", number_text(picture.metres_per_pixel, 3), "m a pixel");
}

void write_store(Sheet& sheet, const Outcome& o) {
    const auto cells = static_cast<double>(o.area.cells());
    const double arithmetic =
        static_cast<double>(sizeof(CellRecord)) +
        static_cast<double>(o.area.blocks()) * static_cast<double>(WorkArea::BLOCK_BYTES) / cells;
    const std::string side = std::to_string(WorkArea::BLOCK_SIDE);
    sheet.section("Store");
    sheet.line("Blocks selected", number_text(o.survey.blocks),
               "of " + number_text(o.area.blocks()) + " (" + side + " x " + side + " cells each)");
    sheet.line("Cells visited", number_text(o.survey.visited), "in these blocks");
    sheet.line("Record", number_text(std::int64_t{sizeof(CellRecord)}), "bytes: grid point, slope, flags");
    sheet.line("By arithmetic", number_text(arithmetic, 1),
               "bytes a cell: record and its share of the blocks");
    if (o.memory_grown) {
        const auto grown = static_cast<double>(*o.memory_grown);
        sheet.line("By measurement", number_text(grown / cells, 1),
                   "bytes a cell: memory grew by " + number_text(grown / MEGA, 2) + " MB");
    }
    if (o.memory_peak) {
        sheet.line("Peak memory", number_text(static_cast<double>(*o.memory_peak) / MEGA, 2), "MB resident");
    }
}

void write_time_line(Sheet& sheet, const std::string& step, double seconds, std::int64_t cells) {
    constexpr double MILLISECONDS = 1e3;
    std::string rest = "ms";
    if (cells > 0 && seconds > 0.0) {
        rest +=
            "  " + number_text(static_cast<double>(cells) / seconds / MEGA, 1) + " million cells a second";
    }
    sheet.line(step, number_text(seconds * MILLISECONDS, 3), rest);
}

void write_times(Sheet& sheet, const Outcome& o) {
    sheet.section("Time");
    write_time_line(sheet, o.options.synthetic ? "Generate" : "Read", o.load.read, o.area.frame().cells());
    write_time_line(sheet, "Store", o.load.store, o.area.cells());
    write_time_line(sheet, "Select", o.select_seconds, 0);
    write_time_line(sheet, "Visit", o.visit_seconds, o.survey.visited);
    write_time_line(sheet, "Together", o.load.read + o.load.store + o.select_seconds + o.visit_seconds, 0);
}

}  // namespace

std::string write_report(const Outcome& outcome) {
    Sheet sheet;
    write_terrain(sheet, outcome);
    write_view(sheet, outcome);
    write_earthwork(sheet, outcome.survey);
    if (outcome.picture) {
        write_picture(sheet, *outcome.options.picture, *outcome.picture);
    }
    write_store(sheet, outcome);
    write_times(sheet, outcome);
    return sheet.take();
}
