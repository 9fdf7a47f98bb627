// An external-memory job: sorts a laser scan on temporary files and grids it.

#include <basalt/memory.h>

#include <algorithm>
#include <chrono>
#include <cstdint>
#include <memory>
#include <optional>
#include <stdexcept>
#include <string>

#include "cell_reader.h"
#include "interrupt.h"
#include "number_text.h"
#include "options.h"
#include "point_runs.h"
#include "point_store.h"
#include "process.h"
#include "program.h"
#include "progress.h"
#include "report.h"
#include "scan.h"

namespace {

constexpr std::int64_t DEFAULT_POINTS = 24'000'000;

/// Points between two looks at the clock.
constexpr std::int64_t STRIDE = 1 << 14;

template <typename Work>
double seconds_for(Work work) {
    const auto start = std::chrono::steady_clock::now();
    work();
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
}

/// The scan in sorted runs; gives the points' fingerprint.
std::uint64_t scan_into(PointRuns& runs, Scan scan) {
    Progress progress("Scanning", scan.points());
    std::uint64_t sum = 0;
    for (std::int64_t done = 0; done < scan.points(); ++done) {
        const Point point = scan.next();
        sum += fingerprint(point);
        runs.add(point);
        if (done % STRIDE == 0) {
            progress.update(done);
        }
    }
    return sum;
}

/// The runs merged into one row of points, which is checked on the way.
void merge_into(PointStore& store, PointRuns& runs, std::uint64_t expected) {
    Progress progress("Merging", runs.points());
    std::uint64_t sum = 0;
    Point last = {};
    runs.take_in_order([&](const Point& point) {
        if (store.points() != 0 && point < last) {
            throw std::logic_error("the points are not in order");
        }
        sum += fingerprint(last = point);
        store.add(point);
        if (store.points() % STRIDE == 0) {
            progress.update(store.points());
        }
    });
    if (sum != expected) {
        throw std::logic_error("the points are not those of the scan");
    }
}

std::string line_of(const Cell& cell) {
    const auto metres = [](std::int32_t millimetres) {
        return std::string(1, ',').append(fixed_text(millimetres / 1000.0, 3));
    };
    return std::to_string(cell.row) + "," + std::to_string(cell.column) + "," + std::to_string(cell.points) +
           metres(cell.lowest) + metres(cell.median) + metres(cell.highest) + "\n";
}

/// Sums up the cells, and formats them if requested.
std::string read_cells(const PointStore& store, bool wants_text, Outcome& outcome) {
    Progress progress("Reading cells", store.points());
    std::string text = wants_text ? "row,column,points,lowest,median,highest\n" : "";
    CellReader reader(store);
    double sum = 0;
    std::int64_t done = 0;
    for (Cell cell; reader.next(cell);) {
        outcome.lowest = outcome.cells == 0 ? cell.lowest : std::min(outcome.lowest, cell.lowest);
        outcome.highest = outcome.cells == 0 ? cell.highest : std::max(outcome.highest, cell.highest);
        outcome.most_points = std::max(outcome.most_points, cell.points);
        sum += cell.median;
        done += cell.points;
        if (++outcome.cells % STRIDE == 0) {
            stop_if_interrupted();
            progress.update(done);
        }
        if (wants_text) {
            text += line_of(cell);
        }
    }
    outcome.mean_median = sum / static_cast<double>(outcome.cells);
    return text;
}

std::string sort_and_grid(const CommandLine& line) {
    const Options options = parse_options(line);
    // Ahead of the job, which may take an hour.
    std::optional<OutputFile> cells_file;
    if (options.cells) {
        cells_file.emplace(*options.cells);
    }
    catch_interrupts();
    // Files left in the folder by a killed run.
    vex_util::CMemoryMap::CleanUp();

    const Scan scan(options.points.value_or(DEFAULT_POINTS));
    Outcome outcome;
    outcome.points = scan.points();
    outcome.cells_of_site = std::int64_t{scan.side()} * scan.side();
    outcome.memory_limit = private_memory_limit();

    PointStore store;
    {
        PointRuns runs;
        std::uint64_t expected = 0;
        outcome.scan_seconds = seconds_for([&] { expected = scan_into(runs, scan); });
        outcome.merge_seconds = seconds_for([&] { merge_into(store, runs, expected); });
        outcome.run_files = runs.files();
        outcome.run_file_bytes = PointRuns::FILE_BYTES;
        outcome.private_memory = private_memory();
    }
    outcome.store_files = store.files();
    outcome.store_file_bytes = PointStore::MAP_BYTES;
    std::string cells;
    outcome.read_seconds = seconds_for([&] { cells = read_cells(store, cells_file.has_value(), outcome); });
    if (cells_file) {
        cells_file->write(cells);
    }
    return write_report(outcome);
}

}  // namespace

int main(int count, char** arguments) {
    const int code = run_program({"scratch", SYNTAX, sort_and_grid}, count, arguments);
    end_as_interrupted();
    return code;
}
