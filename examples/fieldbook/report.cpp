#include "report.h"

#include <fmt/format.h>

#include <cmath>

#include "text.h"

namespace {

std::string metres(double value) {
    return fixed_text(value, 4);
}

std::string millimetres(double value) {
    return fixed_text(value * 1e3, 1);
}

std::string seconds(double radians, int decimals = 1) {
    return fixed_text(radians / RADIANS_PER_SECOND, decimals);
}

std::string angle(double radians) {
    return dms_text(radians, 1);
}

std::string section(const std::string& title) {
    return "\n" + title + "\n";
}

std::string line(const std::string& label, const std::string& words) {
    return fmt::format("  {:<22}{}\n", label, words);
}

std::string faces_section(const Book& book) {
    TextTable table({"Station", "Target", "Collimation \"", "Index \"", "Distance mm"});
    FaceDifference sum = {};
    int pairs = 0;
    for (const Setup& setup : book.setups) {
        for (const Sight& sight : setup.sights) {
            if (!sight.face1 || !sight.face2) {
                table.add({setup.name, sight.name, "one face", "", ""});
                continue;
            }
            const FaceDifference difference = face_difference(sight);
            table.add({setup.name, sight.name, seconds(difference.collimation), seconds(difference.index),
                       millimetres(difference.distance)});
            sum.collimation += difference.collimation;
            sum.index += difference.index;
            ++pairs;
        }
    }
    std::string text = "Faces\n" + table.text();
    if (pairs > 0) {
        text += line("Mean collimation", seconds(sum.collimation / pairs) + " \"");
        text += line("Mean index", seconds(sum.index / pairs) + " \"");
    }
    return text;
}

std::string closing_lines(const Traverse& traverse) {
    const auto angles = static_cast<double>(traverse.stations.size());
    std::string text =
        line("Angular misclosure",
             traverse.angular ? fmt::format("{} \"  taken out as {} \" an angle", seconds(*traverse.angular),
                                            seconds(-*traverse.angular / angles))
                              : "none: the last fore sight is not between control points");
    if (!traverse.closure) {
        return text + line("Linear misclosure", "none: the last station is no control point");
    }
    const Closure& c = *traverse.closure;
    text += line("Linear misclosure", fmt::format("{} m  north {}, east {}; taken out by the compass rule",
                                                  metres(c.linear), metres(c.north), metres(c.east)));
    text += line("Ratio", c.linear == 0.0 ? "exact" : "1 : " + number_text(c.length / c.linear, 0));
    text += line("Height misclosure", metres(c.elevation) + " m");
    return text + line("Length", metres(c.length) + " m");
}

std::string traverse_section(const Results& results) {
    const Traverse& traverse = results.traverse;
    TextTable legs({"From", "To", "Bearing", "Distance m", "Rise m", "Fore-back mm", "Rises mm"});
    for (std::size_t i = 0; i < traverse.legs.size(); ++i) {
        const Leg& leg = traverse.legs[i];
        legs.add({traverse.stations[i].name, traverse.stations[i + 1].name, angle(leg.bearing),
                  metres(leg.horizontal), metres(leg.rise), millimetres(leg.difference),
                  millimetres(leg.rise_sum)});
    }
    TextTable stations({"Station", "North m", "East m", "Elevation m", "dN mm", "dE mm", "dH mm"});
    for (std::size_t i = 0; i < traverse.stations.size(); ++i) {
        const geo_nee& balanced = traverse.stations[i].at;
        const geo_nee& measured = traverse.measured[i];
        stations.add({traverse.stations[i].name, metres(balanced.north), metres(balanced.east),
                      metres(balanced.elevation), millimetres(balanced.north - measured.north),
                      millimetres(balanced.east - measured.east),
                      millimetres(balanced.elevation - measured.elevation)});
    }
    return section("Traverse") + (traverse.legs.empty() ? "" : legs.text()) + closing_lines(traverse) +
           section("Stations") + stations.text();
}

std::string side_section(const Results& results) {
    TextTable table({"Point", "North m", "East m", "Elevation m"});
    for (const ResultPoint& point : results.points) {
        if (point.kind == PointKind::SIDE) {
            table.add(
                {point.name, metres(point.at.north), metres(point.at.east), metres(point.at.elevation)});
        }
    }
    return table.empty() ? "" : section("Side sights") + table.text();
}

std::string axis_section(const Results& results) {
    TextTable table({"Chainage", "Element", "North m", "East m", "Elevation m", "Bearing", "Chord off mm",
                     "From", "Back", "Turn right", "Zenith", "Slope m"});
    for (const ResultPoint& point : results.points) {
        if (point.kind != PointKind::AXIS) {
            continue;
        }
        const SettingOut& out = *point.setting_out;
        const Setup& setup = results.book.setups[out.setup];
        table.add({point.name, point.axis->what, metres(point.at.north), metres(point.at.east),
                   metres(point.at.elevation), angle(point.axis->axis.bearing),
                   millimetres(point.axis->stand_off), setup.name, setup.find(SightKind::BACK)->name,
                   angle(out.turn), angle(out.observation.vertical), metres(out.observation.distance)});
    }
    std::string text = section("Alignment") + table.text();
    if (results.axis_misclosure) {
        const AxisPoint& difference = *results.axis_misclosure;
        text += line("End misclosure", fmt::format("{} m  north {}, east {}; bearing {} \"",
                                                   metres(geo_horz_dist({0.0, 0.0, 0.0}, difference.at)),
                                                   metres(difference.at.north), metres(difference.at.east),
                                                   seconds(difference.bearing)));
    }
    return text;
}

std::string earth_section(const Results& results) {
    const auto position = [](double radians, char positive, char negative) {
        return dms_text(std::abs(radians), 5) + " " + (radians < 0.0 ? negative : positive);  // to 0.3 mm
    };
    TextTable places({"Point", "X m", "Y m", "Z m", "Latitude", "Longitude", "Height m"});
    TextTable sigmas({"Point", "North mm", "East mm", "Up mm", "Latitude \"", "Longitude \"", "Height mm"});
    for (const ResultPoint& point : results.points) {
        const EarthPoint& earth = *point.earth;
        places.add({point.name, metres(earth.xyz.x), metres(earth.xyz.y), metres(earth.xyz.z),
                    position(earth.llh.latitude, 'N', 'S'), position(earth.llh.longitude, 'E', 'W'),
                    metres(earth.llh.height)});
        sigmas.add({point.name, millimetres(earth.sigma_neu.north), millimetres(earth.sigma_neu.east),
                    millimetres(earth.sigma_neu.elevation), seconds(earth.sigma_llh.latitude, 6),
                    seconds(earth.sigma_llh.longitude, 6), millimetres(earth.sigma_llh.height)});
    }
    return section("WGS84") + places.text() + section("Standard deviations") + sigmas.text();
}

/// Numbers of a CSV line, each behind a comma and with so many decimals.
std::string fields(int decimals, std::initializer_list<double> values) {
    std::string text;
    for (const double value : values) {
        text.append(1, ',').append(fixed_text(value, decimals));
    }
    return text;
}

/// Angles as degrees: nine decimals are 0.1 mm on the earth.
std::string degrees(std::initializer_list<double> radians, int decimals = 9) {
    std::string text;
    for (const double value : radians) {
        text += fields(decimals, {value / RADIANS_PER_DEGREE});
    }
    return text;
}

}  // namespace

std::string write_report(const Results& results) {
    std::string text = faces_section(results.book) + traverse_section(results) + side_section(results);
    if (results.options.alignment) {
        text += axis_section(results);
    }
    if (results.options.wgs84) {
        text += earth_section(results);
    }
    return text;
}

std::string write_csv(const Results& results) {
    constexpr const char* KINDS[] = {"control", "station", "side", "axis"};  // in the order of PointKind
    std::string text = "kind,name,north,east,elevation";
    text += results.options.alignment ? ",bearing,stand_off,from,back,turn_right,zenith,slope_distance" : "";
    text += results.options.wgs84 ? ",x,y,z,latitude,longitude,height,sigma_north,sigma_east,sigma_up,"
                                    "sigma_latitude,sigma_longitude,sigma_height"
                                  : "";
    text += "\n";
    for (const ResultPoint& point : results.points) {
        text.append(KINDS[static_cast<int>(point.kind)]).append(",").append(point.name);
        text += fields(4, {point.at.north, point.at.east, point.at.elevation});
        if (point.setting_out) {
            const SettingOut& out = *point.setting_out;
            const Setup& setup = results.book.setups[out.setup];
            text += degrees({point.axis->axis.bearing}) + fields(4, {point.axis->stand_off});
            text.append(",").append(setup.name).append(",").append(setup.find(SightKind::BACK)->name);
            text += degrees({out.turn, out.observation.vertical}) + fields(4, {out.observation.distance});
        } else if (results.options.alignment) {
            text += ",,,,,,,";  // seven empty fields
        }
        if (point.earth) {
            const EarthPoint& e = *point.earth;
            text += fields(4, {e.xyz.x, e.xyz.y, e.xyz.z}) + degrees({e.llh.latitude, e.llh.longitude});
            text += fields(4, {e.llh.height, e.sigma_neu.north, e.sigma_neu.east, e.sigma_neu.elevation});
            text += degrees({e.sigma_llh.latitude, e.sigma_llh.longitude}, 12);
            text += fields(4, {e.sigma_llh.height});
        }
        text += "\n";
    }
    return text;
}
