#include <initializer_list>

#include "number_text.h"
#include "report.h"

namespace {

constexpr int METRE_DECIMALS = 4;
constexpr int DEGREE_DECIMALS = 9;  // 0.1 mm on the earth
constexpr int SIGMA_DECIMALS = 12;

const char* name_of(PointKind kind) {
    switch (kind) {
        case PointKind::CONTROL:
            return "control";
        case PointKind::STATION:
            return "station";
        case PointKind::SIDE:
            return "side";
        case PointKind::AXIS:
            return "axis";
    }
    return "";
}

std::string metres(double value) {
    return fixed_text(value, METRE_DECIMALS);
}

std::string degrees(double radians) {
    return fixed_text(radians / RADIANS_PER_DEGREE, DEGREE_DECIMALS);
}

/// Of a standard deviation in radians.
std::string small_degrees(double radians) {
    return fixed_text(radians / RADIANS_PER_DEGREE, SIGMA_DECIMALS);
}

/// Each behind a comma.
std::string fields(std::initializer_list<std::string> values) {
    std::string text;
    for (const std::string& value : values) {
        text += "," + value;
    }
    return text;
}

std::string setting_out_fields(const Results& results, const ResultPoint& point) {
    if (!point.setting_out) {
        return ",,,,,,,";  // seven empty fields
    }
    const SettingOut& out = *point.setting_out;
    const Setup& setup = results.book.setups[out.setup];
    return fields({degrees(point.axis->axis.bearing), metres(point.axis->stand_off), setup.name,
                   setup.find(SightKind::BACK)->name, degrees(out.turn), degrees(out.observation.vertical),
                   metres(out.observation.distance)});
}

std::string earth_fields(const EarthPoint& earth) {
    return fields({metres(earth.xyz.x), metres(earth.xyz.y), metres(earth.xyz.z), degrees(earth.llh.latitude),
                   degrees(earth.llh.longitude), metres(earth.llh.height), metres(earth.sigma_neu.north),
                   metres(earth.sigma_neu.east), metres(earth.sigma_neu.elevation),
                   small_degrees(earth.sigma_llh.latitude), small_degrees(earth.sigma_llh.longitude),
                   metres(earth.sigma_llh.height)});
}

}  // namespace

std::string write_csv(const Results& results) {
    std::string text = "kind,name,north,east,elevation";
    if (results.options.alignment) {
        text += ",bearing,stand_off,from,back,turn_right,zenith,slope_distance";
    }
    if (results.options.wgs84) {
        text +=
            ",x,y,z,latitude,longitude,height,sigma_north,sigma_east,sigma_up,sigma_latitude,sigma_longitude,"
            "sigma_height";
    }
    text += "\n";
    for (const ResultPoint& point : results.points) {
        text += name_of(point.kind);
        text +=
            fields({point.name, metres(point.at.north), metres(point.at.east), metres(point.at.elevation)});
        if (results.options.alignment) {
            text += setting_out_fields(results, point);
        }
        if (point.earth) {
            text += earth_fields(*point.earth);
        }
        text += "\n";
    }
    return text;
}
