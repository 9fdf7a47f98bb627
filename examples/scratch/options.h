// The command line.
#ifndef SCRATCH_OPTIONS_H
#define SCRATCH_OPTIONS_H

#include <cstdint>
#include <optional>
#include <string>

#include "command_line.h"

struct Options {
    std::optional<std::int64_t> points;
    std::optional<std::string> cells;  ///< path
};

/// InputError for values and operands that cannot be used.
Options parse_options(const CommandLine& line);

/// What --help prints, and the options taken.
extern const Syntax SYNTAX;

#endif
