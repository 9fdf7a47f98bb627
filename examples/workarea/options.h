// The command line.
#ifndef WORKAREA_OPTIONS_H
#define WORKAREA_OPTIONS_H

#include <cstdint>
#include <optional>
#include <string>

#include "command_line.h"

/// A rectangle in the terrain's own coordinates, degrees.
struct DegreeBox {
    double west;
    double south;
    double east;
    double north;
};

struct Options {
    std::string terrain;  ///< path; empty with synthetic
    std::optional<std::int64_t> synthetic;
    std::optional<std::string> boundary;
    std::optional<DegreeBox> view;
    std::optional<double> grade;  ///< metres
    std::optional<std::string> picture;
    bool legend = false;
};

/// InputError for values and operands that cannot be used.
Options parse_options(const CommandLine& line);

/// What --help prints, and the options taken.
extern const Syntax SYNTAX;

#endif
