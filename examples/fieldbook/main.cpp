// A field book's reduction, traverse and setting-out.

#include <basalt/version.h>

#include <string>
#include <vector>

#include "options.h"
#include "program.h"
#include "report.h"
#include "results.h"

namespace {

std::string run(const std::vector<std::string>& arguments) {
    const Options options = parse_options(arguments);
    if (options.help) {
        return USAGE;
    }
    if (options.version) {
        return "fieldbook " BASALT_VERSION "\n";
    }
    const Results results = compute(options);
    if (options.csv) {
        write_file(*options.csv, write_csv(results));
    }
    return write_report(results);
}

}  // namespace

int main(int count, char** arguments) {
    return run_program("fieldbook", run, count, arguments);
}
