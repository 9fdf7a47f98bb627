#include "options.h"

#include "input_error.h"
#include "number_parsing.h"
#include "scan.h"

const char* const USAGE =
    "Usage: scratch [OPTION]...\n"
    "\n"
    "Generates a laser scan, sorts it into cells of one metre on temporary files, and reports the ground's\n"
    "heights and what the job took. The points never need to fit into memory.\n"
    "\n"
    "  --points N    points of the scan, 16 bytes each, at most 400000000 (default: 24000000)\n"
    "  --cells FILE  also write row,column,points,lowest,median,highest of every cell, heights in metres\n"
    "  --help        print this and exit\n"
    "  --version     print the version and exit\n"
    "\n"
    "Files are made in the folder that TMPDIR names, else in /tmp. Ctrl-C ends the job and leaves none.\n"
    "Exit status: 0 success, 1 a file could not be written or room ran out, 2 bad arguments.\n";

namespace {

std::int64_t parse_points(const std::string& text) {
    const std::optional<std::int64_t> points = parse_integer(text);
    if (!points || *points < 1 || *points > Scan::MOST_POINTS) {
        throw InputError("--points takes a whole number from 1 to " + std::to_string(Scan::MOST_POINTS) +
                         ", not " + quoted(text));
    }
    return *points;
}

void set_option(Options& options, const std::string& name, const std::string& value) {
    const bool is_points = name == "--points";
    if (is_points ? options.points.has_value() : options.cells.has_value()) {
        throw InputError("option " + name + " is given twice");
    }
    if (is_points) {
        options.points = parse_points(value);
    } else {
        options.cells = value;
    }
}

}  // namespace

Options parse_options(const std::vector<std::string>& arguments) {
    Options options;
    for (std::size_t i = 0; i < arguments.size(); ++i) {
        const std::string& argument = arguments[i];
        const std::size_t equals = argument.find('=');
        const std::string name = argument.substr(0, equals);
        if (argument == "--help") {
            options.help = true;
            return options;
        }
        if (argument == "--version") {
            options.version = true;
            return options;
        }
        if (name != "--points" && name != "--cells") {
            throw InputError("unknown argument " + quoted(argument) + " (--help lists the options)");
        }
        if (equals == std::string::npos && i + 1 == arguments.size()) {
            throw InputError("option " + name + " needs a value");
        }
        set_option(options, name, equals != std::string::npos ? argument.substr(equals + 1) : arguments[++i]);
    }
    return options;
}
