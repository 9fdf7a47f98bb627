#include "report.h"

#include <cmath>

#include "faces.h"
#include "number_text.h"
#include "text_table.h"

namespace {

constexpr double MILLI = 1e3;
constexpr int ANGLE_DECIMALS = 1;

std::string metres(double value) {
    return fixed_text(value, 4);
}

std::string millimetres(double value) {
    return fixed_text(value * MILLI, 1);
}

std::string angle(double radians) {
    return dms_text(radians, ANGLE_DECIMALS);
}

std::string section(const std::string& title) {
    return "\n" + title + "\n";
}

std::string line(const std::string& label, const std::string& words) {
    constexpr std::size_t LABEL = 22;
    return "  " + label + std::string(LABEL - label.size(), ' ') + words + "\n";
}

std::string faces_section(const Book& book) {
    TextTable table({"Station", "Target", "Collimation \"", "Index \"", "Distance mm"});
    double collimation = 0.0;
    double index = 0.0;
    int pairs = 0;
    for (const Setup& setup : book.setups) {
        for (const Sight& sight : setup.sights) {
            if (!sight.face1 || !sight.face2) {
                table.add({setup.name, sight.name, "one face", "", ""});
                continue;
            }
            const FaceDifference difference = face_difference(sight);
            table.add({setup.name, sight.name, seconds_text(difference.collimation),
                       seconds_text(difference.index), millimetres(difference.distance)});
            collimation += difference.collimation;
            index += difference.index;
            ++pairs;
        }
    }
    std::string text = "Faces\n" + table.text();
    if (pairs > 0) {
        text += line("Mean collimation", seconds_text(collimation / pairs) + " \"");
        text += line("Mean index", seconds_text(index / pairs) + " \"");
    }
    return text;
}

std::string closing_lines(const Traverse& traverse) {
    std::string text;
    if (traverse.angular) {
        const auto angles = static_cast<double>(traverse.stations.size());
        text += line("Angular misclosure", seconds_text(*traverse.angular) + " \"  taken out as " +
                                               seconds_text(-*traverse.angular / angles) + " \" an angle");
    } else {
        text += line("Angular misclosure", "none: the last fore sight is not between control points");
    }
    if (!traverse.closure) {
        return text + line("Linear misclosure", "none: the last station is no control point");
    }
    const Closure& closure = *traverse.closure;
    const bool exact = closure.linear == 0.0;
    text +=
        line("Linear misclosure", metres(closure.linear) + " m  north " + metres(closure.north) + ", east " +
                                      metres(closure.east) + "; taken out by the compass rule");
    text += line("Ratio", exact ? "exact" : "1 : " + number_text(closure.length / closure.linear, 0));
    text += line("Height misclosure", metres(closure.elevation) + " m");
    return text + line("Length", metres(closure.length) + " m");
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
    bool any = false;
    for (const ResultPoint& point : results.points) {
        if (point.kind == PointKind::SIDE) {
            table.add(
                {point.name, metres(point.at.north), metres(point.at.east), metres(point.at.elevation)});
            any = true;
        }
    }
    return any ? section("Side sights") + table.text() : "";
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
        text +=
            line("End misclosure", metres(geo_horz_dist({0.0, 0.0, 0.0}, difference.at)) + " m  north " +
                                       metres(difference.at.north) + ", east " + metres(difference.at.east) +
                                       "; bearing " + seconds_text(difference.bearing) + " \"");
    }
    return text;
}

std::string earth_section(const Results& results) {
    constexpr int LATITUDE_DECIMALS = 5;  // 0.3 mm
    const auto position = [](double radians, char positive, char negative) {
        return dms_text(std::abs(radians), LATITUDE_DECIMALS) + " " + (radians < 0.0 ? negative : positive);
    };
    const auto seconds = [](double radians) { return fixed_text(radians / RADIANS_PER_SECOND, 6); };
    TextTable places({"Point", "X m", "Y m", "Z m", "Latitude", "Longitude", "Height m"});
    TextTable sigmas({"Point", "North mm", "East mm", "Up mm", "Latitude \"", "Longitude \"", "Height mm"});
    for (const ResultPoint& point : results.points) {
        const EarthPoint& earth = *point.earth;
        places.add({point.name, metres(earth.xyz.x), metres(earth.xyz.y), metres(earth.xyz.z),
                    position(earth.llh.latitude, 'N', 'S'), position(earth.llh.longitude, 'E', 'W'),
                    metres(earth.llh.height)});
        sigmas.add({point.name, millimetres(earth.sigma_neu.north), millimetres(earth.sigma_neu.east),
                    millimetres(earth.sigma_neu.elevation), seconds(earth.sigma_llh.latitude),
                    seconds(earth.sigma_llh.longitude), millimetres(earth.sigma_llh.height)});
    }
    return section("WGS84") + places.text() + section("Standard deviations") + sigmas.text();
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
