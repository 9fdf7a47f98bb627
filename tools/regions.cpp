// Points and polygons in the plane.
#include <basalt/geo.h>

#include <cstdint>
#include <memory>
#include <optional>
#include <utility>
#include <vector>

#include "commands.h"
#include "csv_reader.h"
#include "input_error.h"
#include "number_parsing.h"

namespace {

constexpr Option TOLERANCE = {"--tolerance", "METRES",
                              "a point within this distance of the outline is inside too"};

constexpr double FARTHEST = 1e12;

std::vector<geo_nee> read_polygon(const std::string& path) {
    CsvReader reader(path);
    std::vector<geo_nee> vertices;
    while (reader.next()) {
        const double north = reader.number(0, "a northing in metres", -FARTHEST, FARTHEST);
        vertices.push_back({north, reader.number(1, "an easting in metres", -FARTHEST, FARTHEST), 0});
    }
    if (vertices.size() > 1 && vertices.front().north == vertices.back().north &&
        vertices.front().east == vertices.back().east) {
        vertices.pop_back();
    }
    if (vertices.size() < 3) {
        throw InputError(path, "a polygon has three vertices at least");
    }
    return vertices;
}

Work make_contains(const CommandLine& line, const Format&) {
    const basalt::PreparedPolygon polygon(read_polygon(line.operands[0]));
    std::optional<double> tolerance;
    if (const std::string* text = value_of(line, TOLERANCE)) {
        tolerance = parse_number(*text);
        if (!tolerance || *tolerance < 0) {
            throw InputError("--tolerance takes metres from 0 on, not " + quoted(*text));
        }
    }
    return [polygon, tolerance](Fields& fields, Row& row) {
        const double north = fields.number("a northing in metres");
        const geo_nee point = {north, fields.number("an easting in metres"), 0};
        row.whole(tolerance ? polygon.contains(point, *tolerance) : polygon.contains(point));
    };
}

Work make_area(const CommandLine&, const Format&) {
    const auto polygon = std::make_shared<std::vector<geo_nee>>();
    return {[polygon](Fields& fields, Row&) {
                const double north = fields.number("a northing in metres");
                polygon->push_back({north, fields.number("an easting in metres"), 0});
            },
            [polygon](Row& row) {
                const std::vector<geo_nee> vertices = std::move(*polygon);
                polygon->clear();
                if (!vertices.empty()) {
                    row.metres(basalt::polygon_area(vertices.data(), vertices.size()));
                    row.metres(basalt::polygon_perimeter(vertices.data(), vertices.size()));
                    row.whole(static_cast<std::int64_t>(vertices.size()));
                }
                return !vertices.empty();
            }};
}

}  // namespace

const Command AREA = {
    "area",
    "",
    "area and perimeter of polygons in the plane",
    "Reads a vertex NORTH EAST in metres on each line; a blank line or the input's end completes a polygon.\n"
    "Writes AREA PERIMETER COUNT for each: square metres, positive where the vertices run clockwise;\n"
    "metres; and the number of vertices. The first vertex need not be repeated.",
    {CSV, PRECISION},
    {{R"(printf '0 0\n10 0\n10 20\n\n0 0\n0 5\n5 5\n5 0\n' | basalt area --precision 2)",
      "100.00 52.36 3\n-25.00 20.00 4"}},
    make_area};

const Command CONTAINS = {
    "contains",
    "POLYGON.csv",
    "whether a point lies in a polygon",
    "Reads NORTH EAST in metres. Writes 1 for a point inside or on a vertex, else 0. POLYGON.csv has a\n"
    "vertex NORTH,EAST on each line, in either order; more fields, blank lines and what follows a # are\n"
    "passed over, and the first vertex may be repeated at the end. A point on an edge may be either;\n"
    "with --tolerance it is inside.",
    {TOLERANCE, CSV, KEEP},
    {{"printf '0,0\\n0,10\\n10,10\\n10,0\\n' >site.csv; printf '5 5\\n5 15\\n' | basalt contains site.csv "
      "--keep",
      "5 5 1\n5 15 0"}},
    make_contains};
