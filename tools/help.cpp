#include "help.h"

#include <basalt/version.h>

#include "command_line.h"
#include "commands.h"

namespace {

constexpr const char* LINES =
    "Each command is a filter: it reads lines from files or standard input (-) and writes a line for each\n"
    "to standard output. Fields are separated by blanks, with --csv by commas; what follows the fields\n"
    "that a command needs is copied behind its results. Blank lines and lines that begin with # are\n"
    "copied, except where every line is a text (hex, unhex, path, palette). Lines end with LF or CRLF, the\n"
    "last one with or without, and are written with LF. Numbers have a point in every locale.";

constexpr const char* NUMBERS =
    "Angles are radians, with --degrees degrees; 12-30-00.5, 12:30 and 12d30'S are read with either.\n"
    "BASALT_ANGLES=degrees in the environment makes degrees the default. Metres and seconds have\n"
    "--precision decimals, degrees five more, radians seven more, seconds of arc two more, days five more.";

constexpr const char* STATUS =
    "A line that cannot be used, or of more than 1048576 bytes, is reported on standard error with its\n"
    "number and the reason, and skipped; after 20 of them only their count is reported. Exit status:\n"
    "0 success, 1 a line was skipped, or input or output failed, 2 bad arguments.";

constexpr Option PROGRAM_OPTIONS[] = {
    {"--help", "", "or -h: print this and exit; after a command, what it takes"},
    {"--version", "", "print the version and exit"},
    {"--man", "", "print the manual page, as roff, and exit"},
    {"--completion", "", "print the completion for bash, and exit"},
};

constexpr Option HELP = {"--help", "", "print this and exit"};

std::string with_value(const Option& option) {
    std::string text = option.name;
    if (*option.value != '\0') {
        text.append(" ").append(option.value);
    }
    return text;
}

std::string invocation(const Command& command) {
    std::string text = command.name;
    if (*command.operands != '\0') {
        text.append(" ").append(command.operands);
    }
    return text;
}

/// Escapes a text for roff.
std::string roff(std::string_view text) {
    std::string all;
    bool line_begins = true;
    for (const char c : text) {
        if (line_begins && (c == '.' || c == '\'')) {
            all += "\\&";
        }
        if (c == '\\') {
            all += "\\e";
        } else if (c == '-') {
            all += "\\-";
        } else if (c == '\'') {
            all += "\\(aq";
        } else {
            all += c;
        }
        line_begins = c == '\n';
    }
    return all;
}

std::string roff_entry(const std::string& name, std::string_view text) {
    return ".TP\n.B " + roff(name) + "\n" + roff(text) + "\n";
}

std::string words_of(const Command& command) {
    std::string words;
    for (const Option& option : command.options) {
        words.append(option.name).append(" ");
    }
    return words + HELP.name;
}

}  // namespace

std::string help_text() {
    Columns names;
    for (const Command* command : commands()) {
        names.add(invocation(*command), command->summary);
    }
    Columns options;
    for (const Option& option : PROGRAM_OPTIONS) {
        options.add(option.name, option.help);
    }
    std::string text = "Usage: basalt COMMAND [OPTION]... [FILE]...\n       basalt help COMMAND\n\n";
    return text.append(LINES)
        .append("\n\n")
        .append(NUMBERS)
        .append("\n\n")
        .append(names.text())
        .append("\n")
        .append(options.text())
        .append("\n")
        .append(STATUS)
        .append("\n");
}

std::string help_text(const Command& command) {
    std::string text = "Usage: basalt " + invocation(command) + " [OPTION]... [FILE]...\n\n";
    text.append("Gives ").append(command.summary).append(".\n\n").append(command.fields).append("\n\n");
    Columns options;
    for (const Option& option : command.options) {
        options.add(with_value(option), option.help);
    }
    options.add(HELP.name, HELP.help);
    text.append(options.text()).append("\nFor example:\n");
    for (const Example& example : command.examples) {
        text.append("  $ ").append(example.shell).append("\n");
        text.append(example.output).append("\n");
    }
    return text.append("\nWhat all commands have in common: basalt --help.\n");
}

std::string man_page() {
    std::string page = ".TH basalt 1 \"\" \"basalt " BASALT_VERSION "\" \"User Commands\"\n";
    page += ".SH NAME\nbasalt \\- conversions of surveying, line by line\n";
    page += ".SH SYNOPSIS\n.B basalt\n.I COMMAND\n[\\fIOPTION\\fR]... [\\fIFILE\\fR]...\n";
    page += ".SH DESCRIPTION\n" + roff(LINES) + "\n.PP\n" + roff(NUMBERS) + "\n.SH OPTIONS\n";
    for (const Option& option : PROGRAM_OPTIONS) {
        page += roff_entry(option.name, option.help);
    }
    page += ".SH COMMANDS\n";
    for (const Command* command : commands()) {
        page += ".SS " + roff(invocation(*command)) + "\nGives " + roff(command->summary) + ".\n.PP\n";
        page += roff(command->fields) + "\n";
        for (const Option& option : command->options) {
            page += roff_entry(with_value(option), option.help);
        }
        page += ".PP\n.EX\n";
        for (const Example& example : command->examples) {
            page += "$ " + roff(example.shell) + "\n" + roff(example.output) + "\n";
        }
        page += ".EE\n";
    }
    return page + ".SH EXIT STATUS\n" + roff(STATUS) + "\n";
}

std::string bash_completion() {
    std::string names;
    std::string cases;
    for (const Command* command : commands()) {
        names.append(command->name).append(" ");
        cases.append("        ").append(command->name).append(") words='").append(words_of(*command));
        cases.append("' ;;\n");
    }
    for (const Option& option : PROGRAM_OPTIONS) {
        names.append(option.name).append(" ");
    }
    names.pop_back();
    return "# bash completion of basalt\n"
           "_basalt() {\n"
           "    local words\n"
           "    COMPREPLY=()\n"
           "    if [ \"$COMP_CWORD\" -eq 1 ]; then\n"
           "        words='" +
           names +
           "'\n"
           "    else\n"
           "        case ${COMP_WORDS[1]} in\n" +
           cases +
           "        esac\n"
           "        [ \"${COMP_WORDS[1]}\" != palette ] || words=\"nearest colour $words\"\n"
           "    fi\n"
           "    mapfile -t COMPREPLY < <(compgen -W \"$words\" -- \"${COMP_WORDS[COMP_CWORD]}\")\n"
           "}\n"
           "complete -o default -F _basalt basalt\n";
}
