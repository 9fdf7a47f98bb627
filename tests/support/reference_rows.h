/// Rows of reference values: comma-separated numbers, lines of '#' saying where they come from.
#ifndef BASALT_TESTS_SUPPORT_REFERENCE_ROWS_H
#define BASALT_TESTS_SUPPORT_REFERENCE_ROWS_H

#include <cmath>
#include <fstream>
#include <numbers>
#include <sstream>
#include <string>
#include <vector>

/// Kept in extended precision: the reference is written with more digits than a double holds.
using ReferenceRow = std::vector<long double>;

/// All rows of exactly so many columns; empty when the file is missing or any row is otherwise.
inline std::vector<ReferenceRow> read_reference_rows(const std::string& path, std::size_t columns) {
    std::vector<ReferenceRow> rows;
    std::ifstream file(path);
    for (std::string line; std::getline(file, line);) {
        if (line.empty() || line[0] == '#') {
            continue;
        }
        ReferenceRow row;
        std::istringstream fields(line);
        for (std::string field; std::getline(fields, field, ',');) {
            row.push_back(std::stold(field));
        }
        if (row.size() != columns) {
            return {};
        }
        rows.push_back(row);
    }
    return rows;
}

inline long double radians_of(long double degrees) {
    return degrees * (std::numbers::pi_v<long double> / 180.0L);
}

/// Difference of two angles in radians, folded into half a turn either way.
inline long double angle_difference(long double a, long double b) {
    return std::remainder(a - b, 2.0L * std::numbers::pi_v<long double>);
}

#endif
