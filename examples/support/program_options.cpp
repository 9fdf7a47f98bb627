#include "program_options.h"

#include <basalt/version.h>
#include <fmt/format.h>

#include <algorithm>
#include <map>

#include "command_line.h"
#include "input_error.h"
#include "program.h"

namespace {

std::string usage_of(const Program& program) {
    Columns columns;
    for (const ProgramOption& option : program.options) {
        columns.add(fmt::format("{}{}{}", option.name, *option.value != '\0' ? " " : "", option.value),
                    option.help);
    }
    columns.add("--help", "print this and exit");
    columns.add("--version", "print the version and exit");
    return fmt::format("{}\n{}\n{}", program.usage, columns.text(), program.ending);
}

/// Passes each option's value to its target.
void take_options(const Program& program, const CommandLine& line) {
    std::map<std::string_view, std::string> given(line.options.begin(), line.options.end());
    for (const std::string& flag : line.flags) {
        given[flag];
    }
    for (const ProgramOption& option : program.options) {
        const auto at = given.find(option.name);
        if (at == given.end()) {
            continue;
        }
        if (!option.target.take(at->second)) {
            throw InputError(std::string(option.name) + " takes " + option.target.expected + ", not " +
                             quoted(at->second));
        }
        if (*option.with != '\0' && given.count(option.with) == 0) {
            throw InputError(std::string(option.name) + " goes with " + option.with);
        }
    }
}

}  // namespace

bool read_numbers(std::string_view text, std::span<double> values) {
    for (double& value : values) {
        const std::size_t comma = text.find(',');
        const std::optional<double> number = parse_number(text.substr(0, comma));
        if (!number || (comma == std::string_view::npos) != (&value == &values.back())) {
            return false;
        }
        value = *number;
        text.remove_prefix(std::min(comma, text.size() - 1) + 1);
    }
    return true;
}

int run_program(const Program& program, int count, char** arguments) {
    return exit_status_of(program.name, [&] {
        const std::vector<std::string> words(arguments + (count > 0 ? 1 : 0), arguments + count);
        Syntax syntax;
        for (const ProgramOption& option : program.options) {
            (*option.value != '\0' ? syntax.names : syntax.flags).emplace_back(option.name);
        }
        const CommandLine line = parse_command_line(words, syntax);
        if (line.help) {
            print(usage_of(program));
        } else if (line.version) {
            print(std::string(program.name) + " " BASALT_VERSION "\n");
        } else {
            take_options(program, line);
            print(program.run(line.operands));
        }
        return 0;
    });
}

std::optional<std::string> only_operand(const std::vector<std::string>& operands, const std::string& what) {
    if (operands.size() > 1) {
        throw InputError("one " + what + " only, but " + quoted(operands[1]) + " is a second one");
    }
    return operands.empty() ? std::nullopt : std::optional(operands[0]);
}
