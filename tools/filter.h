// Filters standard input to standard output line by line.
#ifndef TOOLS_FILTER_H
#define TOOLS_FILTER_H

#include "command.h"

/// Runs a command with its arguments. A line that it refuses is reported on standard error with its number
/// and skipped.
/// @return 0, or 1 when a line was refused
int run_filter(const Command& command, const CommandLine& line);

#endif
