// An external-memory job: sorts a laser scan on temporary files and grids it.

#include <fmt/format.h>

#include <algorithm>
#include <cstdint>
#include <optional>
#include <string>

#include "input_error.h"
#include "interrupt.h"
#include "output_file.h"
#include "point_files.h"
#include "program_options.h"
#include "progress.h"
#include "scan.h"
#include "text.h"

namespace {

/// Points between two looks at the clock.
constexpr std::int64_t STRIDE = 1 << 14;

struct Options {
    std::int64_t points = 24'000'000;
    std::optional<std::string> cells;  ///< path
};

/// Heights in millimetres.
struct Ground {
    std::int64_t cells = 0;        ///< with points
    std::int64_t most_points = 0;  ///< in one cell
    std::int32_t lowest = INT32_MAX;
    std::int32_t highest = INT32_MIN;
    double sum_of_medians = 0;
};

/// The scan in sorted runs.
void scan_into(PointRuns& runs, Scan scan) {
    Progress progress("Scanning", scan.points());
    for (std::int64_t done = 0; done < scan.points(); ++done) {
        runs.add(scan.next());
        if (done % STRIDE == 0) {
            progress.update(done);
        }
    }
}

/// The runs merged into one row of points.
void merge_into(PointStore& store, PointRuns& runs, std::int64_t points) {
    Progress progress("Merging", points);
    runs.take_in_order([&](const Point& point) {
        store.add(point);
        if (store.points() % STRIDE == 0) {
            progress.update(store.points());
        }
    });
}

/// Sums the cells up, and lists them if there is a text to append to.
Ground read_cells(const PointStore& store, std::string* text) {
    Progress progress("Reading cells", store.points());
    Ground ground;
    for (std::int64_t first = 0, next = 0; first < store.points(); first = next) {
        const Point& lowest = store.at(first);
        do {
            ++next;
        } while (next < store.points() && store.at(next).row == lowest.row &&
                 store.at(next).column == lowest.column);
        const std::int64_t points = next - first;
        const std::int32_t median = store.at(first + (points - 1) / 2).up;  // the lower of two
        const std::int32_t highest = store.at(next - 1).up;
        ground.lowest = std::min(ground.lowest, lowest.up);
        ground.highest = std::max(ground.highest, highest);
        ground.most_points = std::max(ground.most_points, points);
        ground.sum_of_medians += median;
        if (++ground.cells % STRIDE == 0) {
            stop_if_interrupted();
            progress.update(next);
        }
        if (text != nullptr) {
            *text += fmt::format("{},{},{},{:.3f},{:.3f},{:.3f}\n", lowest.row, lowest.column, points,
                                 lowest.up / 1000.0, median / 1000.0, highest / 1000.0);
        }
    }
    return ground;
}

std::string line(const char* label, const std::string& value) {
    return fmt::format("  {:<24}{}\n", label, value);
}

std::string metres(double millimetres) {
    return number_text(millimetres / 1000, 3) + " m";
}

std::string megabytes(std::int64_t bytes) {
    return number_text(static_cast<double>(bytes) / (1 << 20), 1) + " MiB";
}

std::string files(std::int64_t count, std::int64_t bytes_each) {
    return number_text(count) + ", " + megabytes(count * bytes_each);
}

template <typename Work>
std::string time_line(const char* step, Work work) {
    return line(step, number_text(seconds_for(work), 2) + " s");
}

std::string ground_text(const Scan& scan, const Ground& ground) {
    const std::int64_t cells_of_site = std::int64_t{scan.side()} * scan.side();
    return "Ground\n" + line("Points", number_text(scan.points())) +
           line("Cells with points", number_text(ground.cells) + " of " + number_text(cells_of_site)) +
           line("Most points in a cell", number_text(ground.most_points)) +
           line("Lowest", metres(ground.lowest)) + line("Highest", metres(ground.highest)) +
           line("Mean of medians", metres(ground.sum_of_medians / static_cast<double>(ground.cells)));
}

std::string sort_and_grid(const Options& options) {
    // Opened before the job, which may take an hour.
    std::optional<OutputFile> cells_file;
    if (options.cells) {
        cells_file.emplace(*options.cells);
    }
    catch_interrupts();
    vex_util::CMemoryMap::CleanUp();  // deletes what killed runs left in the folder

    const Scan scan(options.points);
    PointStore store;
    std::string job =
        "\nJob\n" + line("Bytes sorted", megabytes(scan.points() * std::int64_t{sizeof(Point)}));
    std::string times;
    {
        PointRuns runs;
        times += time_line("Scanning, sorting runs", [&] { scan_into(runs, scan); });
        times += time_line("Merging", [&] { merge_into(store, runs, scan.points()); });
        job += line("Files of runs", files(runs.files(), PointRuns::FILE_BYTES));
        job += line("Files of sorted points", files(store.files(), PointStore::FILE_BYTES));
        if (const std::optional<std::int64_t> memory = private_memory()) {
            job += line("Memory beside files", megabytes(*memory));
        }
    }
    std::string cells = "row,column,points,lowest,median,highest\n";
    Ground ground;
    times += time_line("Reading cells", [&] { ground = read_cells(store, cells_file ? &cells : nullptr); });
    if (cells_file) {
        cells_file->write(cells);
    }
    return ground_text(scan, ground) + job + times;
}

}  // namespace

int main(int count, char** arguments) {
    Options options;
    const Program program = {
        "scratch",
        "Usage: scratch [OPTION]...\n\n"
        "Generates a laser scan, sorts it into cells of one metre on temporary files, and reports the "
        "heights\n"
        "of the ground and what the job took. The points never need to fit into memory.\n",
        "Files are made in the folder that TMPDIR names, else in /tmp. Ctrl-C ends the job and leaves none.\n"
        "Exit status: 0 success, 1 a file could not be written or disk or memory ran out, 2 bad\n"
        "arguments.\n",
        {{"--points", "N", "points of the scan, 16 bytes each, at most 400000000 (default: 24000000)",
          number_into(options.points, std::int64_t{1}, Scan::MOST_POINTS,
                      "a whole number from 1 to " + std::to_string(Scan::MOST_POINTS))},
         {"--cells", "FILE",
          "also write row,column,points,lowest,median,highest of every cell, heights in metres",
          file_into(options.cells)}},
        [&options](const std::vector<std::string>& operands) {
            if (!operands.empty()) {
                throw InputError("unexpected argument " + quoted(operands[0]) +
                                 " (--help shows what is taken)");
            }
            return sort_and_grid(options);
        }};
    const int code = run_program(program, count, arguments);
    end_as_interrupted();
    return code;
}
