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
    std::vector<std::string_view> names;  ///< options with a value
    std::vector<std::string_view> flags;  ///< options without one, besides --help and --version
};

/// Reads `--name VALUE`, `--name=VALUE`, `--flag`, `--help`, `-h`, `--version` and operands. A minus before a
/// digit or a point begins a number, which is an operand; after `--` everything is. Arguments after --help or
/// --version are ignored. InputError for all else.
CommandLine parse_command_line(const std::vector<std::string>& arguments, const Syntax& syntax);

/// Lines of two columns, for a help text: names, and their texts aligned.
class Columns {
public:
    void add(std::string name, std::string text) { m_lines.emplace_back(std::move(name), std::move(text)); }
    std::string text() const;

private:
    std::vector<std::pair<std::string, std::string>> m_lines;
};

#endif
