// Facts for a host's about box and diagnostics log.

#include <filesystem>
#include <string>
#include <system_error>
#include <vector>

#include "facts.h"
#include "input_error.h"
#include "options.h"
#include "program.h"
#include "report.h"

namespace {

/// Refuses to overwrite the file in question.
void spare_path(const std::string& log, const std::string& path) {
    std::error_code no_such_file;
    if (std::filesystem::equivalent(system_path(log), system_path(path), no_such_file)) {
        throw InputError("--log would overwrite " + path);
    }
}

std::string run(const CommandLine& line) {
    const Options options = parse_options(line);
    if (options.log && options.path) {
        spare_path(*options.log, *options.path);
    }
    const std::vector<Section> facts = gather_facts(options);
    const CString text = text_report(facts);
    if (options.log) {
        write_log(*options.log, text);
    }
    return narrow(options.json ? json_report(facts) : text);
}

}  // namespace

int main(int count, char** arguments) {
    return run_program({"hostinfo", SYNTAX, run}, count, arguments);
}
