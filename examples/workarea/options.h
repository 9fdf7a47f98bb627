// The command line.
#ifndef WORKAREA_OPTIONS_H
#define WORKAREA_OPTIONS_H

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

/// A rectangle in the terrain's own coordinates, degrees.
struct DegreeBox {
    double west;
    double south;
    double east;
    double north;
};

struct Options {
    bool help = false;
    bool version = false;
    std::string terrain;  ///< path; empty with synthetic
    std::optional<std::int64_t> synthetic;
    std::optional<std::string> boundary;
    std::optional<DegreeBox> view;
    std::optional<double> grade;  ///< metres
    std::optional<std::string> picture;
    bool legend = false;
};

/// Reads the arguments that follow the program's name. InputError for anything it does not know.
Options parse_options(const std::vector<std::string>& arguments);

/// What --help prints.
extern const char* const USAGE;

#endif
