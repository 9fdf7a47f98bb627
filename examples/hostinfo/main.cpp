// What a host shows in its about box and writes into its diagnostics log.

#include <string>
#include <vector>

#include "facts.h"
#include "options.h"
#include "program.h"
#include "report.h"

namespace {

std::string run(const CommandLine& line) {
    const Options options = parse_options(line);
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
