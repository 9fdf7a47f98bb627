// The command line.
#ifndef PALETTE_OPTIONS_H
#define PALETTE_OPTIONS_H

#include <basalt/platform.h>

#include <optional>
#include <string>
#include <vector>

#include "command_line.h"

struct Options {
    std::vector<COLORREF> colours;
    std::optional<std::string> picture;
};

/// InputError for values and operands that cannot be used.
Options parse_options(const CommandLine& line);

/// What --help prints, and the options taken.
extern const Syntax SYNTAX;

#endif
