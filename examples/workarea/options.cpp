#include "options.h"

#include <cmath>
#include <string_view>

#include "input_error.h"
#include "number_parsing.h"
#include "synthetic_terrain.h"

const Syntax SYNTAX = {
    "Usage: workarea TERRAIN.asc [OPTION]...\n"
    "       workarea --synthetic N [OPTION]...\n"
    "\n"
    "Reads a terrain (an ESRI ASCII grid in geographic degrees), keeps its cells in a sparse array, and "
    "reports\n"
    "area, elevations, slope and earthwork of the cells inside a view and a boundary.\n"
    "\n"
    "  --boundary FILE      count only cells whose centre lies inside this polygon; one longitude,latitude a "
    "line\n"
    "  --view W,S,E,N       count only cells whose centre lies in this rectangle, edges included, in "
    "degrees\n"
    "                       (default: the whole grid)\n"
    "  --grade ELEVATION    cut and fill against this elevation in metres (default: the mean elevation)\n"
    "  --picture FILE       draw the terrain with boundary, view, cut and fill, as a BMP file\n"
    "  --legend             with --picture: what its colours and lines mean, degrees, scale and north\n"
    "  --synthetic N        a generated terrain of N cells, at most 100000000, instead of a file\n"
    "  --help               print this and exit\n"
    "  --version            print the version and exit\n"
    "\n"
    "Exit status: 0 success, 1 report or picture could not be written or memory ran out, 2 bad arguments or "
    "input.\n",
    {"--boundary", "--view", "--grade", "--picture", "--synthetic"},
    {"--legend"},
};

namespace {

DegreeBox parse_view(std::string_view text) {
    const std::string given(text);
    double value[4] = {};
    for (int i = 0; i < 4; ++i) {
        const std::size_t comma = text.find(',');
        const std::optional<double> number = parse_number(text.substr(0, comma));
        if (!number || (comma == std::string_view::npos) != (i == 3)) {
            throw InputError("--view takes four numbers W,S,E,N, not " + quoted(given));
        }
        value[i] = *number;
        text.remove_prefix(i == 3 ? text.size() : comma + 1);
    }
    const DegreeBox box = {value[0], value[1], value[2], value[3]};
    if (!(box.west < box.east)) {
        throw InputError("--view " + quoted(given) + ": W must be less than E");
    }
    if (!(box.south < box.north)) {
        throw InputError("--view " + quoted(given) + ": S must be less than N");
    }
    return box;
}

double parse_grade(std::string_view text) {
    const std::optional<double> value = parse_number(text);
    if (!value || std::abs(*value) > LARGEST_ELEVATION) {
        throw InputError("--grade takes an elevation in metres, not " + quoted(text));
    }
    return *value;
}

std::int64_t parse_cells(std::string_view text) {
    const std::optional<std::int64_t> cells = parse_integer(text);
    if (!cells || *cells < 1 || *cells > SyntheticTerrain::LARGEST) {
        throw InputError("--synthetic takes a whole number from 1 to " +
                         std::to_string(SyntheticTerrain::LARGEST) + ", not " + quoted(text));
    }
    return *cells;
}

void set_option(Options& options, const std::pair<std::string, std::string>& option) {
    const auto& [name, value] = option;
    if (name == "--boundary") {
        options.boundary = file_value(option);
    } else if (name == "--view") {
        options.view = parse_view(value);
    } else if (name == "--grade") {
        options.grade = parse_grade(value);
    } else if (name == "--picture") {
        options.picture = file_value(option);
    } else {
        options.synthetic = parse_cells(value);
    }
}

}  // namespace

Options parse_options(const CommandLine& line) {
    Options options;
    for (const auto& option : line.options) {
        set_option(options, option);
    }
    options.legend = !line.flags.empty();
    options.terrain = file_operand(line, "terrain file");
    if (options.terrain.empty() && !options.synthetic) {
        throw InputError("no terrain file given (--help shows how)");
    }
    if (!options.terrain.empty() && options.synthetic) {
        throw InputError("--synthetic replaces the terrain file; both are given");
    }
    if (options.legend && !options.picture) {
        throw InputError("--legend goes with --picture");
    }
    return options;
}
