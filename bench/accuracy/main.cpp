// Input for the reference programs, and differences of our results from theirs; see scripts/accuracy.sh.
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <string>

#include "bench/accuracy/accuracy.h"

namespace {

std::vector<ReferenceRow> rows_of(const char* path, std::size_t columns) {
    std::vector<ReferenceRow> rows = read_reference_rows(path, columns);
    if (rows.empty()) {
        std::fprintf(stderr, "accuracy: %s: expected rows of %zu numbers\n", path, columns);
        std::exit(2);
    }
    return rows;
}

int run(int argc, char** argv) {
    const std::string what = argc > 1 ? argv[1] : "";
    if (what == "points" && argc == 3) {
        accuracy::print_points(std::stoi(argv[2]));
    } else if (what == "lines" && argc == 3) {
        accuracy::print_lines(std::stoi(argv[2]));
    } else if (what == "pairs" && argc == 3) {
        accuracy::print_pairs(std::stoi(argv[2]));
    } else if (what == "inverse" && argc == 3) {
        accuracy::measure_inverse(rows_of(argv[2], 7));
    } else if (what == "ellipsoid" && argc == 3) {
        accuracy::measure_ellipsoid(rows_of(argv[2], 6));
    } else if (what == "variance" && argc == 3) {
        accuracy::measure_variance(rows_of(argv[2], 6));
    } else if (what == "geodesic" && argc == 3) {
        accuracy::measure_geodesic(rows_of(argv[2], 9));
    } else if (what == "spiral" && argc == 2) {
        accuracy::measure_spiral();
    } else {
        std::fprintf(stderr,
                     "usage: accuracy points|lines|pairs COUNT\n"
                     "       accuracy ellipsoid|variance|geodesic|inverse ROWS.csv\n"
                     "       accuracy spiral\n");
        return 2;
    }
    return 0;
}

}  // namespace

int main(int argc, char** argv) {
    try {
        return run(argc, argv);
    } catch (const std::exception& error) {
        std::fprintf(stderr, "accuracy: not a number: %s\n", error.what());
        return 2;
    }
}
