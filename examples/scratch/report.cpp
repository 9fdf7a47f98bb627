#include "report.h"

#include "number_text.h"
#include "point.h"

namespace {

std::string line(std::string label, const std::string& value) {
    label.resize(24, ' ');
    return "  " + label + value + "\n";
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

std::string seconds(double value) {
    return number_text(value, 2) + " s";
}

}  // namespace

std::string write_report(const Outcome& o) {
    std::string text = "Ground\n";
    text += line("Points", number_text(o.points));
    text += line("Cells with points", number_text(o.cells) + " of " + number_text(o.cells_of_site));
    text += line("Most points in a cell", number_text(o.most_points));
    text += line("Lowest", metres(o.lowest));
    text += line("Highest", metres(o.highest));
    text += line("Mean of medians", metres(o.mean_median));
    text += "\nJob\n";
    text += line("Bytes sorted", megabytes(o.points * static_cast<std::int64_t>(sizeof(Point))));
    text += line("Files of runs", files(o.run_files, o.run_file_bytes));
    text += line("Files of sorted points", files(o.store_files, o.store_file_bytes));
    if (o.private_memory) {
        text += line("Memory beside files", megabytes(*o.private_memory));
    }
    text += line("Memory limit", o.memory_limit ? megabytes(*o.memory_limit) : "none");
    text += line("Scanning, sorting runs", seconds(o.scan_seconds));
    text += line("Merging", seconds(o.merge_seconds));
    text += line("Reading cells", seconds(o.read_seconds));
    return text;
}
