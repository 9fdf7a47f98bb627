// Area, elevations, slope and earthwork of a work area, computed over a sparse array of terrain cells.

#include <chrono>
#include <filesystem>
#include <memory>
#include <string>
#include <system_error>
#include <vector>

#include "boundary_reader.h"
#include "esri_grid_reader.h"
#include "input_error.h"
#include "options.h"
#include "picture.h"
#include "process.h"
#include "program.h"
#include "report.h"
#include "survey.h"
#include "synthetic_terrain.h"
#include "terrain_loader.h"
#include "view.h"
#include "work_area.h"

namespace {

std::unique_ptr<TerrainSource> open_terrain(const Options& options) {
    if (options.synthetic) {
        return std::make_unique<SyntheticTerrain>(*options.synthetic);
    }
    return std::make_unique<EsriGridReader>(options.terrain);
}

std::vector<geo_nee> in_plane(const std::vector<Place>& places, const LocalPlane& plane) {
    std::vector<geo_nee> points;
    points.reserve(places.size());
    for (const Place& place : places) {
        points.push_back(plane.to_grid(place.longitude, place.latitude, GEO_NULL));
    }
    return points;
}

template <typename Work>
double seconds_for(Work work) {
    const auto start = std::chrono::steady_clock::now();
    work();
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
}

/// Why no cell counts, for the message.
std::string nothing_found(const Options& options, const Survey& survey) {
    if (survey.in_view > 0) {
        return *options.boundary + ": no cell of the view lies inside the boundary";
    }
    return options.terrain + ": no cell " + (options.view ? "of the view " : "") + "has an elevation";
}

/// A slip of the fingers should not cost a terrain.
void spare_inputs(const Options& options) {
    for (const std::string& input : {options.terrain, options.boundary.value_or("")}) {
        std::error_code no_such_file;
        if (std::filesystem::equivalent(*options.picture, input, no_such_file)) {
            throw InputError("--picture would overwrite " + input);
        }
    }
}

std::string measure(const CommandLine& line) {
    const Options options = parse_options(line);
    // Small inputs first: report a mistake in them before reading a large terrain.
    if (options.picture) {
        spare_inputs(options);
    }
    const std::vector<Place> places =
        options.boundary ? read_boundary(*options.boundary) : std::vector<Place>();
    const std::unique_ptr<TerrainSource> terrain = open_terrain(options);
    const CellBox view =
        options.view ? cells_in_view(terrain->frame(), *options.view) : whole_grid(terrain->frame());

    WorkArea area(terrain->frame());
    const std::vector<geo_nee> boundary = in_plane(places, area.plane());
    Outcome outcome{options, area, boundary, view, {}, {}, 0.0, 0.0, {}, {}, {}};
    const std::optional<std::int64_t> memory_before = resident_memory();
    outcome.load = load_terrain(*terrain, area);
    const std::optional<std::int64_t> memory_after = resident_memory();
    if (memory_before && memory_after) {
        outcome.memory_grown = *memory_after - *memory_before;
    }

    outcome.select_seconds = seconds_for([&] { area.select(view); });
    outcome.visit_seconds =
        seconds_for([&] { outcome.survey = survey_cells(area, view, boundary, options.grade); });
    if (outcome.survey.inside == 0) {
        throw InputError(nothing_found(options, outcome.survey));
    }
    outcome.memory_peak = peak_resident_memory();
    if (options.picture) {
        outcome.picture = write_picture(outcome, area);
    }
    return write_report(outcome);
}

}  // namespace

int main(int count, char** arguments) {
    return run_program({"workarea", SYNTAX, measure}, count, arguments);
}
