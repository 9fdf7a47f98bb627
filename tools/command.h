// A command: its help texts, its options, and its filter for a line.
#ifndef TOOLS_COMMAND_H
#define TOOLS_COMMAND_H

#include <functional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "command_line.h"
#include "fields.h"
#include "format.h"
#include "row.h"

struct Option {
    const char* name;
    const char* value;  ///< what it takes, for the help; empty for a flag
    const char* help;   ///< one line
};

/// @name Options of many commands
/// @{
inline constexpr Option CSV = {"--csv", "", "fields are separated by commas, read and written"};
inline constexpr Option DEGREES = {
    "--degrees", "", "angles are degrees, read and written; the default with BASALT_ANGLES=degrees"};
inline constexpr Option RADIANS = {"--radians", "", "angles are radians, read and written (default)"};
inline constexpr Option INVERSE = {"--inverse", "", "the other way: read what is written otherwise"};
inline constexpr Option KEEP = {"--keep", "", "write the line as it was, then the results"};
inline constexpr Option PRECISION = {"--precision", "N",
                                     "digits of metres and seconds behind the point, 0 to 9 (default: 4)"};
/// @}

/// A shell line and its complete output.
struct Example {
    const char* shell;
    const char* output;
};

/// Which lines are parsed.
enum class Lines {
    WITH_COMMENTS,     ///< all but blank lines and comments (#), which are copied
    WITHOUT_COMMENTS,  ///< all lines
    ONE_FIELD          ///< all lines, each as one field
};

/// Reads a line's fields and writes its results. InputError, which may come after some were written, refuses
/// the line.
using Filter = std::function<void(Fields&, Row&)>;

/// What a command does with lines: `line` filters each. A command with results for groups of lines writes
/// them in `end`, called when a blank line or the end of the input ends a group; false means no result. Such
/// a command writes nothing in `line`.
struct Work {
    template <typename F>
    Work(F filter) : line(std::move(filter)) {}
    Work(Filter filter, std::function<bool(Row&)> end_of_group)
        : line(std::move(filter)), end(std::move(end_of_group)) {}

    Filter line;
    std::function<bool(Row&)> end;
};

struct Command {
    const char* name;
    const char* operands;  ///< a word for each, as the usage shows them
    const char* summary;   ///< one line
    const char* fields;    ///< what is read and written: units, ranges, axes; lines of at most 96 characters
    std::vector<Option> options;
    std::vector<Example> examples;
    /// Takes the operands, as many as there are words, and the options of its own. InputError for those that
    /// cannot be used.
    Work (*make)(const CommandLine& line, const Format& format);
    Lines lines = Lines::WITH_COMMENTS;
    char separator = ' ';  ///< between the fields it writes, unless --csv says otherwise
};

/// Whether an option was given that takes no value.
bool has_flag(const CommandLine& line, const Option& option);

/// The value given with an option, or null.
const std::string* value_of(const CommandLine& line, const Option& option);

/// Removes the operands behind those that the command has words for: files to read. InputError when one of
/// the command's own is missing.
std::vector<std::string> take_files(const Command& command, CommandLine& line);

/// The format chosen by the common options.
Format format_of(const Command& command, const CommandLine& line);

#endif
