#include "options.h"

#include "input_error.h"
#include "number_parsing.h"

const char* const USAGE =
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
    "Exit status: 0 success, 1 the output could not be written or memory ran out, 2 bad arguments.\n";

namespace {

void set_once(std::optional<std::string>& option, const std::string& name, const std::string& value) {
    if (option) {
        throw InputError("option " + name + " is given twice");
    }
    if (value.empty()) {
        throw InputError("option " + name + " takes a path, not ''");
    }
    option = value;
}

std::optional<std::string>* option_of(Options& options, const std::string& name) {
    return name == "--log"       ? &options.log
           : name == "--root"    ? &options.root
           : name == "--product" ? &options.product
                                 : nullptr;
}

}  // namespace

Options parse_options(const std::vector<std::string>& arguments) {
    Options options;
    bool only_paths = false;
    for (std::size_t i = 0; i < arguments.size(); ++i) {
        const std::string& argument = arguments[i];
        if (!only_paths && argument == "--") {
            only_paths = true;
        } else if (only_paths || argument.size() < 2 || argument[0] != '-') {
            if (options.path) {
                throw InputError("one path only, but " + quoted(argument) + " is a second one");
            }
            options.path = argument;
        } else if (argument == "--help") {
            options.help = true;
            return options;
        } else if (argument == "--version") {
            options.version = true;
            return options;
        } else if (argument == "--json") {
            options.json = true;
        } else {
            const std::size_t equals = argument.find('=');
            const std::string name = argument.substr(0, equals);
            std::optional<std::string>* const option = option_of(options, name);
            if (option == nullptr) {
                throw InputError("unknown option " + quoted(argument) + " (--help lists them)");
            }
            if (equals == std::string::npos && i + 1 == arguments.size()) {
                throw InputError("option " + name + " needs a value");
            }
            set_once(*option, name,
                     equals != std::string::npos ? argument.substr(equals + 1) : arguments[++i]);
        }
    }
    return options;
}
