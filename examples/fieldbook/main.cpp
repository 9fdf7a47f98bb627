// A field book's reduction, traverse and setting-out.

#include <filesystem>
#include <string>
#include <system_error>

#include "input_error.h"
#include "options.h"
#include "program.h"
#include "report.h"
#include "results.h"

namespace {

/// Refuses to overwrite an input file.
void spare_inputs(const Options& options) {
    for (const std::string& input : {options.book, options.alignment.value_or(options.book)}) {
        std::error_code no_such_file;
        if (std::filesystem::equivalent(*options.csv, input, no_such_file)) {
            throw InputError("--csv would overwrite " + input);
        }
    }
}

std::string run(const CommandLine& line) {
    const Options options = parse_options(line);
    const Results results = compute(options);
    if (options.csv) {
        spare_inputs(options);
        write_file(*options.csv, write_csv(results));
    }
    return write_report(results);
}

}  // namespace

int main(int count, char** arguments) {
    return run_program({"fieldbook", SYNTAX, run}, count, arguments);
}
