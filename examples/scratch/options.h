// The command line.
#ifndef SCRATCH_OPTIONS_H
#define SCRATCH_OPTIONS_H

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

struct Options {
    bool help = false;
    bool version = false;
    std::optional<std::int64_t> points;
    std::optional<std::string> cells;  ///< path
};

/// Reads the arguments that follow the program's name. InputError for anything it does not know.
Options parse_options(const std::vector<std::string>& arguments);

/// What --help prints.
extern const char* const USAGE;

#endif
