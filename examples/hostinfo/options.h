// The command line.
#ifndef HOSTINFO_OPTIONS_H
#define HOSTINFO_OPTIONS_H

#include <optional>
#include <string>

#include "command_line.h"

struct Options {
    bool json = false;
    std::optional<std::string> log;      ///< path
    std::optional<std::string> root;     ///< folder
    std::optional<std::string> product;  ///< folder
    std::optional<std::string> path;     ///< to be taken apart; the program's own otherwise
};

/// InputError for values and operands that cannot be used.
Options parse_options(const CommandLine& line);

/// What --help prints, and the options taken.
extern const Syntax SYNTAX;

#endif
