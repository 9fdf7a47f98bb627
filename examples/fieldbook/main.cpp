// A field book's reduction, traverse and setting-out.

#include <basalt/version.h>

#include <filesystem>
#include <string>
#include <system_error>
#include <vector>

#include "input_error.h"
#include "options.h"
#include "program.h"
#include "report.h"
#include "results.h"

namespace {

/// A slip of the fingers should not cost a field book.
void spare_inputs(const Options& options) {
    for (const std::string& input : {options.book, options.alignment.value_or(options.book)}) {
        std::error_code no_such_file;
        if (std::filesystem::equivalent(*options.csv, input, no_such_file)) {
            throw InputError("--csv would overwrite " + input);
        }
    }
}

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
        spare_inputs(options);
        write_file(*options.csv, write_csv(results));
    }
    return write_report(results);
}

}  // namespace

int main(int count, char** arguments) {
    return run_program("fieldbook", run, count, arguments);
}
