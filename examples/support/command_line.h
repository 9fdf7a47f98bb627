// The arguments of a program that reads one file.
#ifndef EXAMPLES_COMMAND_LINE_H
#define EXAMPLES_COMMAND_LINE_H

#include <string>
#include <string_view>
#include <utility>
#include <vector>

struct CommandLine {
    bool help = false;
    bool version = false;
    std::string file;                                          ///< empty when none is given
    std::vector<std::pair<std::string, std::string>> options;  ///< names and values as given, each once
};

/// Reads `--name VALUE`, `--name=VALUE`, `--help`, `--version` and a file; behind `--` everything is a file.
/// Nothing behind --help or --version is looked at. InputError for all else; `what` names the file in it.
CommandLine parse_command_line(const std::vector<std::string>& arguments,
                               const std::vector<std::string_view>& names, const std::string& what);

#endif
