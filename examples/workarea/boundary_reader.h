// Work area boundaries from CSV files.
#ifndef WORKAREA_BOUNDARY_READER_H
#define WORKAREA_BOUNDARY_READER_H

#include <string>
#include <vector>

/// A place in the terrain's own coordinates, degrees.
struct Place {
    double longitude;
    double latitude;

    bool operator==(const Place&) const = default;
};

/// The vertices of a boundary, in order and without a repeated closing vertex; at least three, not all in one
/// line.
///
/// The file has `longitude,latitude` on each line. `#` begins a comment, empty lines are passed over, and the
/// first line may name the columns, by names that do not begin as numbers do. Everything else is an
/// InputError that names file and line.
std::vector<Place> read_boundary(const std::string& path);

#endif
