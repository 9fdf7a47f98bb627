// Area, elevations, slope and earthwork of a work area, computed over a sparse array of terrain cells.

#include <algorithm>
#include <cmath>
#include <memory>
#include <string>
#include <vector>

#include "boundary_reader.h"
#include "esri_grid_reader.h"
#include "input_error.h"
#include "output_file.h"
#include "picture.h"
#include "program_options.h"
#include "progress.h"
#include "report.h"
#include "survey.h"

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

/// Why no cell counts, for the message.
std::string nothing_found(const Options& options, const Survey& survey) {
    if (survey.in_view > 0) {
        return *options.boundary + ": no cell of the view lies inside the boundary";
    }
    return options.terrain + ": no cell " + (options.view ? "of the view " : "") + "has an elevation";
}

std::string measure(const Options& options) {
    // Small inputs first: report a mistake in them before reading a large terrain.
    if (options.picture) {
        spare_inputs("--picture", *options.picture, {options.terrain, options.boundary.value_or("")});
    }
    const std::vector<Place> places =
        options.boundary ? read_boundary(*options.boundary) : std::vector<Place>();
    const std::unique_ptr<TerrainSource> terrain = open_terrain(options);
    const CellBox view =
        options.view ? cells_in_view(terrain->frame(), *options.view) : whole_grid(terrain->frame());

    WorkArea area(terrain->frame());
    const std::vector<geo_nee> boundary = in_plane(places, area.plane());
    Outcome outcome{options, area, boundary, view, {}, 0.0, 0.0, {}, {}};
    const std::optional<std::int64_t> memory_before = resident_memory();
    outcome.load_seconds = seconds_for([&] { load_terrain(*terrain, area); });
    const std::optional<std::int64_t> memory_after = resident_memory();
    if (memory_before && memory_after) {
        outcome.memory_grown = *memory_after - *memory_before;
    }

    area.select(view);
    outcome.visit_seconds =
        seconds_for([&] { outcome.survey = survey_cells(area, view, boundary, options.grade); });
    if (outcome.survey.inside == 0) {
        throw InputError(nothing_found(options, outcome.survey));
    }
    if (options.picture) {
        outcome.picture = write_picture(outcome, area);
    }
    return write_report(outcome);
}

/// W,S,E,N
Target view_into(std::optional<DegreeBox>& view) {
    return {"four numbers W,S,E,N", [&view](const std::string& text) {
                double edges[4] = {};
                if (!read_numbers(text, edges)) {
                    return false;
                }
                if (std::any_of(edges, edges + 4, [](double edge) { return std::abs(edge) > 360.0; })) {
                    throw InputError("--view " + quoted(text) + " is not in degrees");
                }
                view = {edges[0], edges[1], edges[2], edges[3]};
                if (view->west >= view->east) {
                    throw InputError("--view " + quoted(text) + ": W must be less than E");
                }
                if (view->south >= view->north) {
                    throw InputError("--view " + quoted(text) + ": S must be less than N");
                }
                return true;
            }};
}

}  // namespace

int main(int count, char** arguments) {
    Options o;
    const Program program = {
        "workarea",
        "Usage: workarea TERRAIN.asc [OPTION]...\n"
        "       workarea --synthetic N [OPTION]...\n\n"
        "Reads a terrain (an ESRI ASCII grid in geographic degrees), keeps its cells in a sparse array, and\n"
        "reports area, elevations, slope and earthwork of the cells inside a view and a boundary.\n",
        "Exit status: 0 success, 1 report or picture could not be written or memory ran out, 2 bad\n"
        "arguments or input.\n",
        {{"--boundary", "FILE",
          "count only cells whose centre lies in this polygon; longitude,latitude on each line",
          file_into(o.boundary)},
         {"--view", "W,S,E,N",
          "count only cells whose centre lies in this rectangle, edges included, in degrees\n"
          "(default: the whole grid)",
          view_into(o.view)},
         {"--grade", "ELEVATION",
          "cut and fill against this elevation in metres (default: the mean elevation)",
          number_into(o.grade, -LARGEST_ELEVATION, LARGEST_ELEVATION, "an elevation in metres")},
         {"--picture", "FILE", "draw the terrain with boundary, view, cut and fill, as a BMP file",
          file_into(o.picture)},
         {"--legend", "", "with --picture: what its colours and lines mean, degrees and scale",
          flag_into(o.legend), "--picture"},
         {"--synthetic", "N", "a generated terrain of N cells, at most 100000000, instead of a file",
          number_into(o.synthetic, std::int64_t{1}, SyntheticTerrain::LARGEST,
                      "a whole number from 1 to " + std::to_string(SyntheticTerrain::LARGEST))}},
        [&o](const std::vector<std::string>& operands) {
            o.terrain = only_operand(operands, "terrain file").value_or("");
            if (o.terrain.empty() && !o.synthetic) {
                throw InputError("no terrain file given (--help shows how)");
            }
            if (!o.terrain.empty() && o.synthetic) {
                throw InputError("--synthetic replaces the terrain file; both are given");
            }
            return measure(o);
        }};
    return run_program(program, count, arguments);
}
