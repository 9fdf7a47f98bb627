#include "view.h"

#include "input_error.h"

namespace {

/// First index in [0, count) whose value, which rises with the index, does not satisfy `before`; count if all
/// do.
template <typename Predicate>
int first_not(int count, Predicate before) {
    int low = 0;
    int high = count;
    while (low < high) {
        const int middle = low + (high - low) / 2;
        if (before(middle)) {
            low = middle + 1;
        } else {
            high = middle;
        }
    }
    return low;
}

}  // namespace

CellBox whole_grid(const GridFrame& frame) {
    return {0, 0, frame.columns - 1, frame.rows - 1};
}

CellBox cells_in_view(const GridFrame& frame, const DegreeBox& view) {
    if (view.west >= frame.east() || view.east <= frame.west || view.south >= frame.north() ||
        view.north <= frame.south) {
        throw InputError("--view lies outside the grid, which is " + std::to_string(frame.west) + "," +
                         std::to_string(frame.south) + "," + std::to_string(frame.east()) + "," +
                         std::to_string(frame.north()));
    }
    CellBox box{};
    box.west = first_not(frame.columns, [&](int x) { return frame.centre_longitude(x) < view.west; });
    box.east = first_not(frame.columns, [&](int x) { return frame.centre_longitude(x) <= view.east; }) - 1;
    box.south = first_not(frame.rows, [&](int y) { return frame.centre_latitude(y) < view.south; });
    box.north = first_not(frame.rows, [&](int y) { return frame.centre_latitude(y) <= view.north; }) - 1;
    if (box.west > box.east || box.south > box.north) {
        throw InputError("--view is too small: no cell centre lies in it");
    }
    return box;
}
