// A field book's reduction, traverse and setting-out.

#include <string>

#include "input_error.h"
#include "output_file.h"
#include "program_options.h"
#include "report.h"
#include "results.h"

namespace {

Target wgs84_into(std::optional<EarthAnchor>& anchor) {
    return {"NAME,LATITUDE,LONGITUDE,HEIGHT in degrees and metres", [&anchor](const std::string& text) {
                const std::size_t comma = text.find(',');
                double value[3] = {};
                if (comma == std::string::npos || !read_numbers(text.substr(comma + 1), value)) {
                    return false;
                }
                anchor = {text.substr(0, comma), {_degtorad(value[0]), _degtorad(value[1]), value[2]}};
                return value[0] >= -90.0 && value[0] <= 90.0 && value[1] >= -180.0 && value[1] <= 360.0 &&
                       value[2] >= -12000.0 && value[2] <= 1e5;
            }};
}

std::string reduce(const Options& options) {
    if (options.csv) {
        spare_inputs("--csv", *options.csv, {options.book, options.alignment.value_or(options.book)});
    }
    const Results results = compute(options);
    if (options.csv) {
        OutputFile(*options.csv).write(write_csv(results));
    }
    return write_report(results);
}

}  // namespace

int main(int count, char** arguments) {
    Options o;
    const Program program = {
        "fieldbook",
        "Usage: fieldbook BOOK.csv [OPTION]...\n\n"
        "Reads a total station's field book, means the two faces, computes and balances the traverse, "
        "reduces\n"
        "the side sights to grid points, and sets out an alignment.\n",
        "Exit status: 0 success, 1 the results could not be written or memory ran out, 2 bad arguments\n"
        "or input.\n",
        {{"--alignment", "FILE", "axis to set out from the traverse's stations: straights, spirals, arcs",
          file_into(o.alignment)},
         {"--interval", "M", "at every multiple of this chainage, 0.1 to 10000 metres (default: 20)",
          number_into(o.interval, 0.1, 1e4, "metres from 0.1 to 10000"), "--alignment"},
         {"--sagitta", "M", "largest distance of a chord from the axis, 0.0001 to 10 m (default: 0.01)",
          number_into(o.sagitta, 1e-4, 10.0, "metres from 0.0001 to 10"), "--alignment"},
         {"--target-height", "M", "height of the target when setting out, -100 to 100 metres (default: 1.5)",
          number_into(o.target_height, -100.0, 100.0, "metres from -100 to 100"), "--alignment"},
         {"--scale", "FACTOR", "grid distance over ground distance, 0.9 to 1.1 (default: 1)",
          number_into(o.scale, 0.9, 1.1, "a factor from 0.9 to 1.1")},
         {"--wgs84", "NAME,LAT,LON,HEIGHT",
          "degrees and metres of a control point: earth-centred and geodetic\n"
          "coordinates of all points, and their standard deviations",
          wgs84_into(o.wgs84)},
         {"--csv", "FILE", "write all points into this file too", file_into(o.csv)}},
        [&o](const std::vector<std::string>& operands) {
            o.book = only_operand(operands, "field book").value_or("");
            if (o.book.empty()) {
                throw InputError("no field book given (--help shows how)");
            }
            return reduce(o);
        }};
    return run_program(program, count, arguments);
}
