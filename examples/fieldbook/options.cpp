#include "options.h"

#include <algorithm>
#include <string_view>

#include "input_error.h"
#include "number_parsing.h"

const Syntax SYNTAX = {
    "Usage: fieldbook BOOK.csv [OPTION]...\n"
    "\n"
    "Reads a total station's field book, brings the two faces together, computes and balances the traverse,\n"
    "reduces the side sights to grid points, and sets out an alignment.\n"
    "\n"
    "  --alignment FILE     set this axis of straights, spirals and arcs out from the traverse's stations\n"
    "  --interval M         at every multiple of this chainage, 0.1 to 10000 metres (default: 20)\n"
    "  --sagitta M          chords stand off the axis by this at most, 0.0001 to 10 metres (default: 0.01)\n"
    "  --target-height M    height of the target when setting out, -100 to 100 metres (default: 1.5)\n"
    "  --scale FACTOR       grid distance over ground distance, 0.9 to 1.1 (default: 1)\n"
    "  --wgs84 NAME,LAT,LON,HEIGHT\n"
    "                       degrees and metres of a control point: earth-centred and geodetic coordinates "
    "of\n"
    "                       all points, and their standard deviations\n"
    "  --precision SECONDS,MM,PPM\n"
    "                       standard deviations of an angle and of a distance (default: 3,2,2)\n"
    "  --csv FILE           write all points into this file too\n"
    "  --help               print this and exit\n"
    "  --version            print the version and exit\n"
    "\n"
    "--interval, --sagitta and --target-height go with --alignment, --precision with --wgs84.\n"
    "Exit status: 0 success, 1 the results could not be written or memory ran out, 2 bad arguments or "
    "input.\n",
    {"--alignment", "--csv", "--interval", "--sagitta", "--target-height", "--scale", "--wgs84",
     "--precision"},
    {},
};

namespace {

double parse_between(std::string_view name, std::string_view text, double low, double high,
                     const char* what) {
    const std::optional<double> value = parse_number(text);
    if (!value || *value < low || *value > high) {
        throw InputError(std::string(name) + " takes " + what + ", not " + quoted(text));
    }
    return *value;
}

std::vector<std::string_view> split(std::string_view text) {
    std::vector<std::string_view> parts;
    for (std::size_t comma = text.find(','); comma != std::string_view::npos; comma = text.find(',')) {
        parts.push_back(text.substr(0, comma));
        text.remove_prefix(comma + 1);
    }
    parts.push_back(text);
    return parts;
}

/// Numbers between bounds, as many as there are bounds; nothing if the parts are others.
template <std::size_t COUNT>
std::optional<std::vector<double>> numbers(const std::vector<std::string_view>& parts, std::size_t first,
                                           const double (&bounds)[COUNT][2]) {
    std::vector<double> values;
    if (parts.size() != first + COUNT) {
        return std::nullopt;
    }
    for (std::size_t i = 0; i < COUNT; ++i) {
        const std::optional<double> value = parse_number(parts[first + i]);
        if (!value || *value < bounds[i][0] || *value > bounds[i][1]) {
            return std::nullopt;
        }
        values.push_back(*value);
    }
    return values;
}

EarthAnchor parse_wgs84(std::string_view text) {
    constexpr double BOUNDS[3][2] = {{-90.0, 90.0}, {-180.0, 360.0}, {-12000.0, 1e5}};
    const std::vector<std::string_view> parts = split(text);
    const std::optional<std::vector<double>> values = numbers(parts, 1, BOUNDS);
    if (!values) {
        throw InputError("--wgs84 takes NAME,LATITUDE,LONGITUDE,HEIGHT in degrees and metres, not " +
                         quoted(text));
    }
    return {std::string(parts[0]), {_degtorad((*values)[0]), _degtorad((*values)[1]), (*values)[2]}};
}

InstrumentPrecision parse_precision(std::string_view text) {
    constexpr double BOUNDS[3][2] = {{0.0, 3600.0}, {0.0, 1e4}, {0.0, 1e4}};
    const std::optional<std::vector<double>> values = numbers(split(text), 0, BOUNDS);
    if (!values) {
        throw InputError("--precision takes SECONDS,MM,PPM, not " + quoted(text));
    }
    return {(*values)[0] * RADIANS_PER_SECOND, (*values)[1] * 1e-3, (*values)[2] * 1e-6};
}

void set_option(Options& options, const std::pair<std::string, std::string>& option) {
    const auto& [name, value] = option;
    if (name == "--alignment") {
        options.alignment = file_value(option);
    } else if (name == "--csv") {
        options.csv = file_value(option);
    } else if (name == "--interval") {
        options.interval = parse_between(name, value, 0.1, 1e4, "metres from 0.1 to 10000");
    } else if (name == "--sagitta") {
        options.sagitta = parse_between(name, value, 1e-4, 10.0, "metres from 0.0001 to 10");
    } else if (name == "--target-height") {
        options.target_height = parse_between(name, value, -100.0, 100.0, "metres from -100 to 100");
    } else if (name == "--scale") {
        options.scale = parse_between(name, value, 0.9, 1.1, "a factor from 0.9 to 1.1");
    } else if (name == "--wgs84") {
        options.wgs84 = parse_wgs84(value);
    } else {
        options.precision = parse_precision(value);
    }
}

/// An option without the one that it is about would change nothing.
void require_companions(const CommandLine& line) {
    const auto is_given = [&line](std::string_view name) {
        return std::any_of(line.options.begin(), line.options.end(),
                           [name](const auto& given) { return given.first == name; });
    };
    constexpr std::string_view PAIRS[][2] = {{"--interval", "--alignment"},
                                             {"--sagitta", "--alignment"},
                                             {"--target-height", "--alignment"},
                                             {"--precision", "--wgs84"}};
    for (const auto& [name, companion] : PAIRS) {
        if (is_given(name) && !is_given(companion)) {
            throw InputError(std::string(name) + " goes with " + std::string(companion));
        }
    }
}

}  // namespace

Options parse_options(const CommandLine& line) {
    Options options;
    for (const auto& option : line.options) {
        set_option(options, option);
    }
    require_companions(line);
    options.book = file_operand(line, "field book");
    if (options.book.empty()) {
        throw InputError("no field book given (--help shows how)");
    }
    return options;
}
