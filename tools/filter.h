// Filters input to standard output line by line.
#ifndef TOOLS_FILTER_H
#define TOOLS_FILTER_H

#include <string>
#include <vector>

#include "command.h"

/// Runs a command over files, `-` among them for standard input, or over standard input if there are none. A
/// line that it refuses is reported on standard error with its file and number, and skipped; of many such
/// lines the first are reported and all counted.
/// @return 0, or 1 when a line was refused
int run_filter(const Command& command, const CommandLine& line, const std::vector<std::string>& files);

#endif
