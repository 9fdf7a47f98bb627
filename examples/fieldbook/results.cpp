#include "results.h"

#include <algorithm>
#include <cmath>

#include "input_error.h"
#include "number_parsing.h"
#include "text.h"

namespace {

void add_surveyed_points(Results& results) {
    const auto add = [&results](PointKind kind, const NamedPoint& point, const Covariance& covariance) {
        results.points.push_back({kind, point.name, point.at, covariance, {}, {}, {}});
    };
    for (const NamedPoint& point : results.book.control) {
        add(PointKind::CONTROL, point, {});
    }
    const Traverse& traverse = results.traverse;
    for (std::size_t i = 0; i < traverse.stations.size(); ++i) {
        const NamedPoint& station = traverse.stations[i];
        if (results.book.find_control(station.name) == nullptr) {
            add(PointKind::STATION, station, station_covariance(traverse, i));
        }
    }
    for (const SidePoint& side : reduce_side_sights(results.book, traverse, results.options.scale)) {
        add(PointKind::SIDE, side.point,
            target_covariance(traverse, side.setup, side.observation, side.point.at));
    }
}

/// The observation of a point from the nearest station, with the instrument as high as it stood there.
SettingOut set_out(const Results& results, const geo_nee& point) {
    const std::vector<NamedPoint>& stations = results.traverse.stations;
    const auto nearest =
        std::min_element(stations.begin(), stations.end(), [&](const auto& a, const auto& b) {
            return geo_horz_distSq(a.at, point) < geo_horz_distSq(b.at, point);
        });
    SettingOut result = {};
    result.setup = static_cast<std::size_t>(nearest - stations.begin());
    // The field is larger than the grid by the reciprocal of the scale.
    geo_calc_obs(nearest->at, results.book.setups[result.setup].height, point, results.options.target_height,
                 result.observation, 1.0 / results.options.scale);
    result.turn =
        geo_normalised_bearing(result.observation.horizontal - results.traverse.back_bearing[result.setup]);
    return result;
}

void add_axis_points(Results& results, const Alignment& alignment) {
    const Options& options = results.options;
    const std::vector<ChainagePoint> axis = set_out_axis(alignment, options.interval, options.sagitta);
    for (const ChainagePoint& point : axis) {
        const geo_nee& at = point.axis.at;
        const SettingOut out = set_out(results, at);
        results.points.push_back({PointKind::AXIS, fixed_text(point.chainage, 3), at,
                                  target_covariance(results.traverse, out.setup, out.observation, at), point,
                                  out, std::nullopt});
    }
    if (alignment.end) {
        const AxisPoint& end = axis.back().axis;
        results.axis_misclosure = {
            {end.at.north - alignment.end->north, end.at.east - alignment.end->east, 0.0},
            std::remainder(end.bearing - alignment.end->bearing, 2.0 * PI)};
    }
}

void place_on_earth(Results& results, const EarthAnchor& anchor) {
    const NamedPoint* control = results.book.find_control(anchor.name);
    if (control == nullptr) {
        throw InputError("--wgs84: " + quoted(anchor.name) + " is no control point of the field book");
    }
    const Earth earth(control->at, anchor.position, results.options.scale);
    for (ResultPoint& point : results.points) {
        point.earth = earth.locate(point.at, point.covariance);
    }
}

}  // namespace

Results compute(const Options& options) {
    Results results = {options, read_book(options.book), {}, {}, std::nullopt};
    const std::optional<Alignment> alignment =
        options.alignment ? std::optional(read_alignment(*options.alignment)) : std::nullopt;
    results.traverse = compute_traverse(results.book, options.scale);
    add_surveyed_points(results);
    if (alignment) {
        add_axis_points(results, *alignment);
    }
    if (options.wgs84) {
        place_on_earth(results, *options.wgs84);
    }
    return results;
}
