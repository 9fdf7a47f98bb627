// What a host shows in its about box and writes into its diagnostics log.

#include <basalt/version.h>

#include <string>
#include <vector>

#include "facts.h"
#include "options.h"
#include "program.h"
#include "report.h"

namespace {

std::string run(const std::vector<std::string>& arguments) {
    const Options options = parse_options(arguments);
    if (options.help) {
        return USAGE;
    }
    if (options.version) {
        return "hostinfo " BASALT_VERSION "\n";
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
    return run_program("hostinfo", run, count, arguments);
}
