// The command-line tool: finds the command and runs it.
#include <basalt/version.h>

#include <string>
#include <vector>

#include "command_line.h"
#include "commands.h"
#include "filter.h"
#include "help.h"
#include "input_error.h"
#include "number_parsing.h"
#include "program.h"

namespace {

[[noreturn]] void fail_at(const std::string& argument) {
    throw InputError("unexpected argument " + quoted(argument) + " (--help shows what is taken)");
}

/// The tool without a command.
int run_itself(const std::vector<std::string>& arguments) {
    const CommandLine line = parse_command_line(arguments, {{}, {"--man", "--completion"}});
    if (!line.operands.empty() && !line.flags.empty()) {
        fail_at(line.operands[0]);
    }
    if (line.help) {
        print(help_text());
    } else if (line.version) {
        print("basalt " BASALT_VERSION "\n");
    } else if (!line.flags.empty()) {
        print(line.flags[0] == "--man" ? man_page() : bash_completion());
    } else {
        throw InputError("no command given (--help lists them)");
    }
    return 0;
}

int run_command(const Command& command, const std::vector<std::string>& arguments) {
    Syntax syntax = {};
    for (const Option& option : command.options) {
        (*option.value != '\0' ? syntax.names : syntax.flags).emplace_back(option.name);
    }
    CommandLine line = parse_command_line(arguments, syntax);
    if (line.help) {
        print(help_text(command));
        return 0;
    }
    if (line.version) {
        return run_itself({"--version"});
    }
    const std::vector<std::string> files = take_files(command, line);
    return run_filter(command, line, files);
}

}  // namespace

int main(int count, char** arguments) {
    std::vector<std::string> words(arguments + (count > 0 ? 1 : 0), arguments + count);
    std::string name = "basalt";
    return exit_status_of(name, [&] {
        if (words.empty() || words[0].empty() || words[0][0] == '-') {
            return run_itself(words);
        }
        if (words[0] == "help") {
            if (words.size() > 2) {
                fail_at(words[2]);
            }
            print(words.size() == 1 || words[1] == "help" ? help_text() : help_text(command_named(words[1])));
            return 0;
        }
        const Command& command = command_named(words[0]);
        words.erase(words.begin());
        name.append(" ").append(command.name);
        return run_command(command, words);
    });
}
