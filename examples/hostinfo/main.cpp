// Facts for a host's about box and diagnostics log.

#include <filesystem>
#include <string>
#include <system_error>
#include <vector>

#include "facts.h"
#include "input_error.h"
#include "program_options.h"
#include "report.h"

namespace {

/// A folder's path; the library truncates longer ones.
Target folder_into(std::optional<std::string>& variable) {
    constexpr int LONGEST = 259;
    return {"a path of 1 to " + std::to_string(LONGEST) + " characters",
            [&variable](const std::string& text) {
                variable = text;
                return !text.empty() && CString(text.c_str()).GetLength() <= LONGEST;
            }};
}

std::string show(const Options& options, bool json, const std::optional<std::string>& log) {
    std::error_code no_such_file;
    if (log && options.path &&
        std::filesystem::equivalent(system_path(*log), system_path(*options.path), no_such_file)) {
        throw InputError("--log would overwrite " + *options.path);
    }
    const std::vector<Section> facts = gather_facts(options);
    const CString text = text_report(facts);
    if (log) {
        write_log(*log, text);
    }
    return json ? json_report(facts) : narrow(text);
}

}  // namespace

int main(int count, char** arguments) {
    Options options;
    bool json = false;
    std::optional<std::string> log;
    return run_program(
        {"hostinfo",
         "Usage: hostinfo [OPTION]... [PATH]\n\n"
         "Shows what a host program knows about itself and its machine: version, system, folders, language,\n"
         "hardware addresses; and takes PATH apart (default: the program's own).\n",
         "Exit status: 0 success, 1 the output could not be written or memory ran out, 2 bad arguments.\n",
         {{"--json", "", "as JSON instead of text", flag_into(json)},
          {"--log", "FILE", "write the text into this log file too", file_into(log)},
          {"--root", "FOLDER", "set the root folder of the product family (default: none)",
           folder_into(options.root)},
          {"--product", "FOLDER", "set the product's folder and with it the inbox (default: none)",
           folder_into(options.product)}},
         [&](const std::vector<std::string>& operands) {
             options.path = only_operand(operands, "path");
             return show(options, json, log);
         }},
        count, arguments);
}
