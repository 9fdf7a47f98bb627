#include "options.h"

#include <basalt/platform.h>

#include <string_view>

#include "input_error.h"
#include "number_parsing.h"

const Syntax SYNTAX = {
    "Usage: hostinfo [OPTION]... [PATH]\n"
    "\n"
    "Shows what a host program knows about itself and its machine: version, system, folders, language,\n"
    "hardware addresses; and takes PATH apart (default: the program's own).\n"
    "\n"
    "  --json               as JSON instead of text\n"
    "  --log FILE           write the text into this log file too\n"
    "  --root FOLDER        set the root folder of the product family (default: none)\n"
    "  --product FOLDER     set the product's folder and with it the inbox (default: none)\n"
    "  --help               print this and exit\n"
    "  --version            print the version and exit\n"
    "\n"
    "Exit status: 0 success, 1 the output could not be written or memory ran out, 2 bad arguments.\n",
    {"--log", "--root", "--product"},
    {"--json"},
};

namespace {

/// The library truncates longer paths.
std::string parse_folder(std::string_view name, const std::string& value) {
    constexpr int LONGEST = 259;
    if (CString(value.c_str()).GetLength() > LONGEST) {
        throw InputError("option " + std::string(name) + " takes a path of at most " +
                         std::to_string(LONGEST) + " characters, not " + quoted(value));
    }
    return value;
}

void set_option(Options& options, std::string_view name, const std::string& value) {
    if (value.empty()) {
        throw InputError("option " + std::string(name) + " takes a path, not ''");
    }
    if (name == "--log") {
        options.log = value;
    } else if (name == "--root") {
        options.root = parse_folder(name, value);
    } else {
        options.product = parse_folder(name, value);
    }
}

}  // namespace

Options parse_options(const CommandLine& line) {
    Options options;
    for (const auto& [name, value] : line.options) {
        set_option(options, name, value);
    }
    options.json = !line.flags.empty();
    if (line.operands.size() > 1) {
        throw InputError("one path only, but " + quoted(line.operands[1]) + " is a second one");
    }
    if (!line.operands.empty()) {
        options.path = line.operands[0];
    }
    return options;
}
