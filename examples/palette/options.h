// The command line.
#ifndef PALETTE_OPTIONS_H
#define PALETTE_OPTIONS_H

#include <basalt/platform.h>

#include <optional>
#include <string>
#include <vector>

struct Options {
    bool help = false;
    bool version = false;
    std::vector<COLORREF> colours;
    std::optional<std::string> picture;
};

/// Reads the arguments that follow the program's name. InputError for anything it does not know.
Options parse_options(const std::vector<std::string>& arguments);

/// What --help prints.
extern const char* const USAGE;

#endif
