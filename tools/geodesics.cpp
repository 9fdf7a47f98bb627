// Geodesics and great circles.
#include <basalt/geo.h>

#include "commands.h"
#include "input_error.h"
#include "points.h"

namespace {

Work make_direct(const CommandLine&, const Format&) {
    return [](Fields& fields, Row& row) {
        const geo_llh start = read_place(fields);
        const double azimuth = fields.angle("an azimuth");
        const double distance = fields.number("a distance in metres");
        double azimuth_at_end = 0;
        geo_llh end = {};
        geo_vincenty_direct(start, azimuth, distance, azimuth_at_end, end);
        row.angle(end.latitude);
        row.longitude(end.longitude);
        row.bearing(azimuth_at_end);
    };
}

Work make_inverse(const CommandLine&, const Format&) {
    return [](Fields& fields, Row& row) {
        const geo_llh from = read_place(fields);
        const basalt::GeodesicInverse line = basalt::geodesic_inverse(from, read_place(fields));
        row.bearing(line.azimuth_from);
        row.bearing(line.azimuth_to);
        row.metres(line.distance);
    };
}

Work make_distance(const CommandLine&, const Format&) {
    return [](Fields& fields, Row& row) {
        const geo_llh from = read_place(fields);
        row.metres(geo_vincenty_distance(from, read_place(fields)));
    };
}

Work make_bearing(const CommandLine&, const Format&) {
    return [](Fields& fields, Row& row) {
        const geo_llh from = read_place(fields);
        row.bearing(geo_vincenty_bearing(from, read_place(fields)));
    };
}

Work make_crosstrack(const CommandLine& line, const Format& format) {
    const geo_llh a = read_operand(line.operands[0], "A", format, read_place);
    const geo_llh b = read_operand(line.operands[1], "B", format, read_place);
    if (a.latitude == b.latitude && a.longitude == b.longitude) {
        throw InputError("A and B are the same place, which has no line");
    }
    return
        [a, b](Fields& fields, Row& row) { row.metres(geo_vincenty_crosstrack(a, b, read_place(fields))); };
}

}  // namespace

const Command DIRECT = {
    "direct",
    "",
    "where a geodesic of a given azimuth and length ends",
    "Reads LATITUDE LONGITUDE AZIMUTH DISTANCE: azimuth clockwise from north, metres along the WGS84\n"
    "ellipsoid, negative backwards. Writes LATITUDE LONGITUDE AZIMUTH of the end: longitude from minus to\n"
    "plus half a turn, azimuth of going on, from 0 to a turn.",
    {DEGREES, RADIANS, CSV, KEEP, PRECISION},
    {{"echo '-37.951033417 144.424867889 306.868158278 54972.271' | basalt direct --degrees",
      "-37.652821146 143.926495523 307.173629707"}},
    make_direct};

const Command INVERSE_GEODESIC = {
    "inverse",
    "",
    "azimuths and length of the shortest line between two places",
    "Reads LATITUDE LONGITUDE LATITUDE LONGITUDE. Writes AZIMUTH AZIMUTH DISTANCE of the geodesic on the\n"
    "WGS84 ellipsoid: of leaving the first place and of going on at the second, clockwise from north,\n"
    "from 0 to a turn; metres.",
    {DEGREES, RADIANS, CSV, KEEP, PRECISION},
    {{"echo '36.12 -86.67 33.94 -118.40' | basalt inverse --degrees --precision 1",
      "274.615580 256.080667 2892777.0"}},
    make_inverse};

const Command DISTANCE = {
    "distance",
    "",
    "great-circle distance between two places, on a sphere",
    "Reads LATITUDE LONGITUDE LATITUDE LONGITUDE. Writes the distance in metres on a sphere of radius\n"
    "6371000 m, which is up to 0.6 % off the ellipsoid's; for that see inverse.",
    {DEGREES, RADIANS, CSV, KEEP, PRECISION},
    {{"echo '36.12 -86.67 33.94 -118.40' | basalt distance --degrees --precision 1", "2886444.4"}},
    make_distance};

const Command BEARING = {
    "bearing",
    "",
    "initial bearing of the great circle between two places, on a sphere",
    "Reads LATITUDE LONGITUDE LATITUDE LONGITUDE. Writes the bearing from the first place to the second,\n"
    "clockwise from north, from 0 to a turn, on a sphere; 0 for equal places.",
    {DEGREES, RADIANS, CSV, KEEP, PRECISION},
    {{"echo '36.12 -86.67 33.94 -118.40' | basalt bearing --degrees --precision 0", "274.59357"}},
    make_bearing};

const Command CROSSTRACK = {
    "crosstrack",
    "A B",
    "distance from the line that leaves A towards B",
    "Reads LATITUDE LONGITUDE; A and B are LATITUDE,LONGITUDE. Writes metres, positive left of the\n"
    "direction from A to B, negative right. The line is the ellipsoid's geodesic that leaves A with the\n"
    "sphere's bearing of B, and misses B, on oblique lines by 0.3 m at 100 m.",
    {DEGREES, RADIANS, CSV, KEEP, PRECISION},
    {{"echo '0.001 0.5' | basalt crosstrack 0,0 0,1 --degrees --precision 2", "111.19"}},
    make_crosstrack};
