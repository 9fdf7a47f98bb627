// The job's results and resources, as text.
#ifndef SCRATCH_REPORT_H
#define SCRATCH_REPORT_H

#include <cstdint>
#include <optional>
#include <string>

struct Outcome {
    std::int64_t points = 0;
    std::int64_t cells_of_site = 0;
    std::int64_t cells = 0;        ///< with points
    std::int64_t most_points = 0;  ///< in one cell
    std::int32_t lowest = 0;       ///< millimetres, as the next two
    std::int32_t highest = 0;
    double mean_median = 0;
    std::int64_t run_files = 0;
    std::int64_t run_file_bytes = 0;
    std::int64_t store_files = 0;
    std::int64_t store_file_bytes = 0;
    double scan_seconds = 0;
    double merge_seconds = 0;
    double read_seconds = 0;
    std::optional<std::int64_t> private_memory;  ///< bytes not on a file
    std::optional<std::int64_t> memory_limit;    ///< bytes; nothing when there is none
};

std::string write_report(const Outcome& outcome);

#endif
