#include "options.h"

#include "input_error.h"
#include "number_parsing.h"
#include "scan.h"

const Syntax SYNTAX = {
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
    "Exit status: 0 success, 1 a file could not be written or room ran out, 2 bad arguments.\n",
    {"--points", "--cells"},
    {},
};

namespace {

std::int64_t parse_points(const std::string& text) {
    const std::optional<std::int64_t> points = parse_integer(text);
    if (!points || *points < 1 || *points > Scan::MOST_POINTS) {
        throw InputError("--points takes a whole number from 1 to " + std::to_string(Scan::MOST_POINTS) +
                         ", not " + quoted(text));
    }
    return *points;
}

}  // namespace

Options parse_options(const CommandLine& line) {
    Options options;
    refuse_operands(line);
    for (const auto& option : line.options) {
        if (option.first == "--points") {
            options.points = parse_points(option.second);
        } else {
            options.cells = file_value(option);
        }
    }
    return options;
}
