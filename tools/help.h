// The help texts, and the man page and the completion made of the same.
#ifndef TOOLS_HELP_H
#define TOOLS_HELP_H

#include <string>

#include "command.h"

/// What `basalt --help` prints.
std::string help_text();
/// What `basalt COMMAND --help` prints.
std::string help_text(const Command& command);
/// The man page, as roff.
std::string man_page();
/// The completion, as a script for bash.
std::string bash_completion();

#endif
