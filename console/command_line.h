// The arguments of a program.
#ifndef CONSOLE_COMMAND_LINE_H
#define CONSOLE_COMMAND_LINE_H

#include <string>
#include <string_view>
#include <utility>
#include <vector>

struct CommandLine {
    bool help = false;
    bool version = false;
    std::vector<std::string> operands;                         ///< what is no option, in order
    std::vector<std::pair<std::string, std::string>> options;  ///< names and values as given, each once
    std::vector<std::string> flags;                            ///< names as given
};

/// What a program takes.
struct Syntax {
    const char* usage;                    ///< what --help prints
    std::vector<std::string_view> names;  ///< options with a value
    std::vector<std::string_view> flags;  ///< options without one, besides --help and --version
};

/// Reads `--name VALUE`, `--name=VALUE`, `--flag`, `--help`, `-h`, `--version` and operands. A minus before a
/// digit or a point begins a number, which is an operand; after `--` everything is. Arguments after --help or
/// --version are ignored. InputError for all else.
CommandLine parse_command_line(const std::vector<std::string>& arguments, const Syntax& syntax);

/// The one operand of a program that takes a file at most, empty when there is none. InputError for a second
/// one and for an empty name; `what` names the file in it.
std::string file_operand(const CommandLine& line, const std::string& what);

/// The value of an option that takes a file. InputError for an empty one.
const std::string& file_value(const std::pair<std::string, std::string>& option);

/// For a program that takes none: InputError if there is an operand.
void refuse_operands(const CommandLine& line);

#endif
