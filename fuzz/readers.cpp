// The readers of the host programs: any bytes as a grid, a boundary, a field book and an alignment. Each
// gives what it promises or an InputError that names the file.
#include <sys/mman.h>
#include <unistd.h>

#include <cmath>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "console/input_error.h"
#include "examples/fieldbook/alignment.h"
#include "examples/fieldbook/book_reader.h"
#include "examples/workarea/boundary_reader.h"
#include "examples/workarea/esri_grid_reader.h"
#include "fuzz/input.h"

namespace {

using basalt::fuzz::require;

void read_grid(const std::string& path) {
    EsriGridReader reader(path);
    const GridFrame& frame = reader.frame();
    require(frame.columns > 0 && frame.rows > 0 && frame.cell_size > 0);
    require(std::isfinite(frame.west) && std::isfinite(frame.south) && std::isfinite(frame.east()));
    std::vector<double> row;
    int rows = 0;
    for (; reader.next_row(row); ++rows) {
        require(row.size() == static_cast<std::size_t>(frame.columns));
        for (const double elevation : row) {
            require(!has_elevation(elevation) || std::abs(elevation) <= LARGEST_ELEVATION);
        }
    }
    require(rows == frame.rows);
}

void read_area(const std::string& path) {
    const std::vector<Place> vertices = read_boundary(path);
    require(vertices.size() >= 3);
    for (const Place& vertex : vertices) {
        require(std::abs(vertex.longitude) <= 360 && std::abs(vertex.latitude) <= 90);
    }
}

void read_traverse(const std::string& path) {
    const Book book = read_book(path);
    require(!book.setups.empty() && book.find_control(book.setups.front().name) != nullptr);
    for (const Setup& setup : book.setups) {
        require(std::isfinite(setup.height) && setup.find(SightKind::BACK) != nullptr);
        for (const Sight& sight : setup.sights) {
            require(sight.face1 || sight.face2);
        }
    }
}

// What comes out of it can be set out: every point is one, and their number stays within reason.
void read_axis(const std::string& path) {
    const Alignment alignment = read_alignment(path);
    double length = 0;
    for (const Element& element : alignment.elements) {
        require(element.length > 0 && element.radius > 0 && std::abs(element.hand) == 1);
        length += element.length;
    }
    if (length < 2000) {
        for (const ChainagePoint& point : set_out_axis(alignment, 10.0, 0.05)) {
            require(std::isfinite(point.axis.at.north) && std::isfinite(point.axis.at.east));
        }
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    static const int file = memfd_create("input", MFD_CLOEXEC);
    static const std::string path = "/proc/self/fd/" + std::to_string(file);
    if (size == 0) {
        return 0;
    }
    require(ftruncate(file, 0) == 0 && pwrite(file, data + 1, size - 1, 0) == static_cast<ssize_t>(size - 1));
    constexpr void (*READERS[])(const std::string&) = {read_grid, read_area, read_traverse, read_axis};
    try {
        READERS[data[0] % std::size(READERS)](path);
    } catch (const InputError& error) {
        require(std::string_view(error.what()).substr(0, path.size()) == path);
    }
    return 0;
}
