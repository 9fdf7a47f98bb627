// Coordinates: Cartesian, geodetic, local.
#include <basalt/geo.h>

#include "commands.h"
#include "input_error.h"
#include "points.h"

namespace {

/// Convergence limit of the latitude, radians: the remaining difference is rounding.
constexpr double TOLERANCE = 1e-12;

constexpr Option GEODETIC = {"--geodetic", "", "ORIGIN and the lines are LATITUDE LONGITUDE HEIGHT"};

geo_vector read_xyz(Fields& fields) {
    geo_vector xyz = {};
    xyz.x = fields.number("x in metres");
    xyz.y = fields.number("y in metres");
    xyz.z = fields.number("z in metres");
    return xyz;
}

geo_vector read_llh(Fields& fields) {
    geo_llh llh = read_place(fields);
    llh.height = fields.number("a height in metres");
    if (llh.latitude == 0 && llh.longitude == 0 && llh.height == 0) {
        // The library refuses the all-zero record. This height vanishes in the rounding of x.
        llh.height = 1e-10;
    }
    geo_vector xyz = {};
    _llh2xyz(&llh, &xyz);
    return xyz;
}

geo_llh geodetic(const geo_vector& xyz) {
    geo_llh llh = {};
    if (_xyz2llh(&xyz, &llh, TOLERANCE) == 0) {
        throw InputError("the point is too near the earth's centre to have a latitude");
    }
    return llh;
}

Work make_xyz2llh(const CommandLine&, const Format&) {
    return [](Fields& fields, Row& row) {
        const geo_llh llh = geodetic(read_xyz(fields));
        row.angle(llh.latitude);
        row.longitude(llh.longitude);
        row.metres(llh.height);
    };
}

Work make_llh2xyz(const CommandLine&, const Format&) {
    return [](Fields& fields, Row& row) {
        const geo_vector xyz = read_llh(fields);
        row.metres(xyz.x);
        row.metres(xyz.y);
        row.metres(xyz.z);
    };
}

Work make_neu(const CommandLine& line, const Format& format) {
    const auto read = has_flag(line, GEODETIC) ? read_llh : read_xyz;
    const auto read_origin = [read](Fields& fields) {
        const geo_vector origin = read(fields);
        geodetic(origin);
        return origin;
    };
    const geo_vector origin = read_operand(line.operands[0], "ORIGIN", format, read_origin);
    return [read, origin](Fields& fields, Row& row) {
        const geo_vector point = read(fields);
        geo_nee local = {};
        _xyz2nez(&origin, &point, &local);
        row.metres(local.north);
        row.metres(local.east);
        row.metres(local.elevation);
    };
}

}  // namespace

const Command XYZ2LLH = {
    "xyz2llh",
    "",
    "earth-centred Cartesian to geodetic coordinates",
    "Reads X Y Z: metres, earth-centred and earth-fixed (WGS84); x towards latitude 0, longitude 0, z\n"
    "towards the north pole. Writes LATITUDE LONGITUDE HEIGHT: north and east positive, longitude from\n"
    "minus to plus half a turn, ellipsoidal height in metres.",
    {DEGREES, RADIANS, CSV, KEEP, PRECISION},
    {{"echo '3785061.66 901728.88 5036891.56 P1' | basalt xyz2llh --degrees --precision 2",
      "52.5000000 13.4000000 34.00 P1"}},
    make_xyz2llh};

const Command LLH2XYZ = {
    "llh2xyz",
    "",
    "geodetic to earth-centred Cartesian coordinates",
    "Reads LATITUDE LONGITUDE HEIGHT: north and east positive, ellipsoidal height in metres (WGS84).\n"
    "Writes X Y Z: metres, earth-centred and earth-fixed; x towards latitude 0, longitude 0, z towards\n"
    "the north pole.",
    {DEGREES, RADIANS, CSV, KEEP, PRECISION},
    {{"echo '52.5 13.4 34' | basalt llh2xyz --degrees", "3785061.6606 901728.8813 5036891.5588"}},
    make_llh2xyz};

const Command NEU = {
    "neu",
    "ORIGIN",
    "Cartesian to local coordinates: north, east and up of an origin",
    "Reads X Y Z; ORIGIN is X,Y,Z: metres, earth-centred and earth-fixed (WGS84). Writes NORTH EAST UP:\n"
    "metres from the origin, in the plane that touches the ellipsoid below it and along its normal. Up\n"
    "is no height: it falls away with the earth's curvature, 0.08 m at 1 km.",
    {GEODETIC, DEGREES, RADIANS, CSV, KEEP, PRECISION},
    {{"echo '52.51,13.41,50,P2' | basalt neu 52.5,13.4,34 --geodetic --degrees --csv",
      "1112.8250,678.9536,15.8668,P2"}},
    make_neu};
