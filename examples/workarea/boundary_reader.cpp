#include "boundary_reader.h"

#include <algorithm>
#include <optional>
#include <string_view>

#include "csv_reader.h"
#include "input_error.h"
#include "number_parsing.h"

std::vector<Place> read_boundary(const std::string& path) {
    CsvReader csv(path);
    const auto require = [&](bool is_so, const std::string& message) {
        if (!is_so) {
            throw InputError(path, csv.line(), message);
        }
    };
    const auto coordinate = [&](std::string_view field, const char* name, double limit) {
        const std::optional<double> value = parse_number(field);
        require(value.has_value(), name + quoted(field) + " is not a number");
        require(*value >= -limit && *value <= limit, name + quoted(field) + " is not in degrees");
        return *value;
    };
    std::vector<Place> vertices;
    for (bool is_first = true; csv.next(); is_first = false) {
        require(csv.fields() == 2, "expected longitude,latitude but found " + quoted(csv.record()));
        const std::string_view first = csv.field(0);
        const std::string_view second = csv.field(1);
        const bool names =
            !first.empty() && !second.empty() && !begins_number(first) && !begins_number(second);
        if (!is_first || !names) {
            vertices.push_back(
                {coordinate(first, "longitude ", 360.0), coordinate(second, "latitude ", 90.0)});
        }
    }
    if (vertices.size() > 1 && vertices.front() == vertices.back()) {
        vertices.pop_back();
    }
    require(vertices.size() >= 3,
            "a boundary needs three points or more, not " + std::to_string(vertices.size()));
    const Place& a = vertices[0];
    const bool in_line =
        std::adjacent_find(vertices.begin(), vertices.end(), [&a](const Place& b, const Place& c) {
            return (b.longitude - a.longitude) * (c.latitude - a.latitude) !=
                   (c.longitude - a.longitude) * (b.latitude - a.latitude);
        }) == vertices.end();
    require(!in_line, "the boundary's points lie in one line and enclose nothing");
    return vertices;
}
