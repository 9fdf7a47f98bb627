// A program's options as a table: parsed, checked and listed by --help.
#ifndef EXAMPLES_PROGRAM_OPTIONS_H
#define EXAMPLES_PROGRAM_OPTIONS_H

#include <functional>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "number_parsing.h"

/// Where an option's value goes.
struct Target {
    std::string expected;                          ///< what a value is, for the error
    std::function<bool(const std::string&)> take;  ///< false for a value that it is not
};

/// A finite number between two bounds, both included.
template <typename Number, typename Variable>
Target number_into(Variable& variable, Number low, Number high, std::string expected) {
    return {std::move(expected), [&variable, low, high](const std::string& text) {
                const std::optional<Number> value = parse_any_number<Number>(text);
                const bool fits = value && *value >= low && *value <= high;
                if (fits) {
                    variable = *value;
                }
                return fits;
            }};
}

/// A file name, which is not empty.
template <typename Variable>
Target file_into(Variable& variable) {
    return {"a file name", [&variable](const std::string& text) {
                variable = text;
                return !text.empty();
            }};
}

inline Target flag_into(bool& variable) {
    return {"", [&variable](const std::string&) { return variable = true; }};
}

/// Fills `values` from as many finite numbers between commas; false if the text is anything else.
bool read_numbers(std::string_view text, std::span<double> values);

struct ProgramOption {
    const char* name;   ///< with its dashes
    const char* value;  ///< what it takes, for the help; empty for a flag
    const char* help;   ///< a line, or several
    Target target;
    const char* with = "";  ///< another option, without which this one would change nothing
};

struct Program {
    const char* name;
    const char* usage;   ///< printed by --help ahead of the options
    const char* ending;  ///< and behind them
    std::vector<ProgramOption> options;
    /// Makes the text for standard output.
    std::function<std::string(const std::vector<std::string>& operands)> run;
};

/// Runs a program and prints its text, its usage or its version. Errors and exit status as exit_status_of().
int run_program(const Program& program, int count, char** arguments);

/// The one operand of a program that takes one at most; nothing without it. InputError for a second one;
/// `what` names it there.
std::optional<std::string> only_operand(const std::vector<std::string>& operands, const std::string& what);

#endif
