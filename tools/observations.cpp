// Observations of an instrument: reduced to points, and computed from points.
#include <basalt/geo.h>

#include <optional>

#include "commands.h"
#include "input_error.h"
#include "number_parsing.h"
#include "points.h"

namespace {

constexpr Option INSTRUMENT = {"--instrument", "METRES",
                               "height of the instrument above STATION (default: 0)"};
constexpr Option TARGET = {"--target", "METRES", "height of the target above the point (default: 0)"};
constexpr Option SCALE = {"--scale", "FACTOR", "grid distance over ground distance (default: 1)"};

std::optional<double> number_of(const CommandLine& line, const Option& option) {
    const std::string* text = value_of(line, option);
    if (text == nullptr) {
        return {};
    }
    const std::optional<double> value = parse_number(*text);
    if (!value) {
        throw InputError(std::string(option.name) + " takes a number, not " + quoted(*text));
    }
    return value;
}

double scale_of(const CommandLine& line) {
    const double scale = number_of(line, SCALE).value_or(1);
    if (scale <= 0) {
        throw InputError("--scale takes a factor above 0");
    }
    return scale;
}

geo_nee read_point(Fields& fields) {
    geo_nee point = {};
    point.north = fields.number("a northing in metres");
    point.east = fields.number("an easting in metres");
    point.elevation = fields.number("an elevation in metres");
    return point;
}

Work make_reduce(const CommandLine& line, const Format& format) {
    const geo_nee station = read_operand(line.operands[0], "STATION", format, read_point);
    const double rise = number_of(line, INSTRUMENT).value_or(0) - number_of(line, TARGET).value_or(0);
    const double scale = scale_of(line);
    return [=](Fields& fields, Row& row) {
        geo_hvd observation = {};
        observation.horizontal = fields.angle("a bearing");
        observation.vertical = fields.angle("a zenith angle");
        observation.distance = fields.number("a slope distance in metres", 0, 1e9);
        geo_normalise_obs(observation);
        geo_nee point = {};
        geo_reduce_obs(observation, station, rise, point, scale);
        row.metres(point.north);
        row.metres(point.east);
        row.metres(point.elevation);
    };
}

Work make_observe(const CommandLine& line, const Format& format) {
    const geo_nee station = read_operand(line.operands[0], "STATION", format, read_point);
    const double instrument = number_of(line, INSTRUMENT).value_or(0);
    const double target = number_of(line, TARGET).value_or(0);
    const double scale = 1 / scale_of(line);
    return [=](Fields& fields, Row& row) {
        geo_hvd observation = {};
        geo_calc_obs(station, instrument, read_point(fields), target, observation, scale);
        row.bearing(observation.horizontal);
        row.angle(observation.vertical);
        row.metres(observation.distance);
    };
}

}  // namespace

const Command REDUCE = {
    "reduce",
    "STATION",
    "points from bearings, zenith angles and slope distances",
    "Reads BEARING ZENITH DISTANCE; STATION is NORTH,EAST,ELEVATION in metres. Bearings run clockwise from\n"
    "north, zenith angles from 0 at the zenith, beyond half a turn on the second face; the slope\n"
    "distance is in metres. Writes NORTH EAST ELEVATION of the target's foot in the plane, without\n"
    "curvature or refraction.",
    {INSTRUMENT, TARGET, SCALE, DEGREES, RADIANS, CSV, KEEP, PRECISION},
    {{"echo '30 88 100 P1' | basalt reduce 1000,2000,50 --instrument 1.6 --target 1.5 --degrees",
      "1086.5498 2049.9695 53.5899 P1"}},
    make_reduce};

const Command OBSERVE = {
    "observe",
    "STATION",
    "bearings, zenith angles and slope distances to points",
    "Reads NORTH EAST ELEVATION in metres; STATION is NORTH,EAST,ELEVATION. Writes BEARING ZENITH DISTANCE\n"
    "as an instrument there would measure them: what reduce reads.",
    {INSTRUMENT, TARGET, SCALE, DEGREES, RADIANS, CSV, KEEP, PRECISION},
    {{"echo '1100 2000 50 P1' | basalt observe 1000,2000,50 --degrees --precision 1",
      "0.000000 90.000000 100.0 P1"}},
    make_observe};
