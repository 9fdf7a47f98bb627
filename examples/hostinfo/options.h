// The command line.
#ifndef HOSTINFO_OPTIONS_H
#define HOSTINFO_OPTIONS_H

#include <optional>
#include <string>
#include <vector>

struct Options {
    bool help = false;
    bool version = false;
    bool json = false;
    std::optional<std::string> log;      ///< path
    std::optional<std::string> root;     ///< folder
    std::optional<std::string> product;  ///< folder
    std::optional<std::string> path;     ///< to be taken apart; the program's own otherwise
};

/// Reads the arguments that follow the program's name. InputError for anything it does not know.
Options parse_options(const std::vector<std::string>& arguments);

/// What --help prints.
extern const char* const USAGE;

#endif
