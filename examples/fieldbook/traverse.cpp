#include "traverse.h"

#include <cmath>

#include "angles.h"

namespace {

constexpr geo_nee ORIGIN = {0.0, 0.0, 0.0};

/// A sight with a bearing in place of its circle reading, and the way it goes from the station.
struct Reduced {
    geo_hvd obs;
    geo_nee way;
};

Reduced reduce(const Setup& setup, const Sight& sight, double bearing, double scale) {
    Reduced result = {mean_of_faces(sight), {}};
    result.obs.horizontal = bearing;
    geo_reduce_obs(result.obs, ORIGIN, setup.height - sight.height, result.way, scale);
    return result;
}

/// Angle from the back sight clockwise to another sight.
double angle_right(const Setup& setup, const Sight& sight) {
    return mean_of_faces(sight).horizontal - mean_of_faces(*setup.find(SightKind::BACK)).horizontal;
}

Leg measure_leg(const Setup& from, const Setup& to, double bearing, double scale) {
    const Reduced fore = reduce(from, *from.find(SightKind::FORE), bearing, scale);
    const Reduced back = reduce(to, *to.find(SightKind::BACK), geo_normalised_bearing(bearing + PI), scale);
    const double there = geo_horz_dist(ORIGIN, fore.way);
    const double here = geo_horz_dist(ORIGIN, back.way);
    return {bearing,  0.5 * (there + here), 0.5 * (fore.way.elevation - back.way.elevation),
            fore.obs, there - here,         fore.way.elevation + back.way.elevation};
}

/// Bearings of the fore sights, each angle lessened by `share`; one a setup that has a fore sight.
std::vector<double> fore_bearings(const Book& book, double share) {
    const Setup& first = book.setups.front();
    double back = geo_grid_bearing(book.find_control(first.name)->at,
                                   book.find_control(first.find(SightKind::BACK)->name)->at);
    std::vector<double> bearings;
    for (const Setup& setup : book.setups) {
        const Sight* fore = setup.find(SightKind::FORE);
        if (fore == nullptr) {
            break;
        }
        bearings.push_back(geo_normalised_bearing(back + angle_right(setup, *fore) - share));
        back = geo_normalised_bearing(bearings.back() + PI);
    }
    return bearings;
}

/// Known bearing of the last fore sight, where both its ends are control points.
std::optional<double> closing_bearing(const Book& book) {
    const Setup& last = book.setups.back();
    const Sight* fore = last.find(SightKind::FORE);
    const NamedPoint* from = book.find_control(last.name);
    const NamedPoint* to = fore == nullptr ? nullptr : book.find_control(fore->name);
    if (from == nullptr || to == nullptr) {
        return std::nullopt;
    }
    return geo_grid_bearing(from->at, to->at);
}

geo_nee less(const geo_nee& point, const Closure& misclosure, double part) {
    return {point.north - misclosure.north * part, point.east - misclosure.east * part,
            point.elevation - misclosure.elevation * part};
}

}  // namespace

geo_hvd mean_of_faces(const Sight& sight) {
    geo_hvd a = sight.face1 ? *sight.face1 : *sight.face2;
    if (!sight.face1 || !sight.face2) {
        return geo_normalise_obs(a);
    }
    geo_hvd b = *sight.face2;
    geo_normalise_obs(b);
    return {geo_bisected_bearing(a.horizontal, b.horizontal), 0.5 * (a.vertical + b.vertical),
            0.5 * (a.distance + b.distance)};
}

FaceDifference face_difference(const Sight& sight) {
    const geo_hvd a = *sight.face1;
    geo_hvd b = *sight.face2;
    geo_normalise_obs(b);
    return {0.5 * std::remainder(a.horizontal - b.horizontal, 2.0 * PI), 0.5 * (a.vertical - b.vertical),
            a.distance - b.distance};
}

Traverse compute_traverse(const Book& book, double scale) {
    Traverse traverse;
    const auto count = static_cast<double>(book.setups.size());
    std::vector<double> bearings = fore_bearings(book, 0.0);
    if (const std::optional<double> known = closing_bearing(book)) {
        traverse.angular = std::remainder(bearings.back() - *known, 2.0 * PI);
        bearings = fore_bearings(book, *traverse.angular / count);
    }

    traverse.measured.push_back(book.find_control(book.setups.front().name)->at);
    std::vector<double> reached = {0.0};  // length of the legs up to each station
    for (std::size_t i = 1; i < book.setups.size(); ++i) {
        const Leg leg = measure_leg(book.setups[i - 1], book.setups[i], bearings[i - 1], scale);
        geo_nee next = {};
        geo_grid_follow3(traverse.measured.back(), leg.bearing, leg.horizontal, leg.rise, next);
        traverse.measured.push_back(next);
        reached.push_back(reached.back() + leg.horizontal);
        traverse.legs.push_back(leg);
    }

    const NamedPoint* end = book.find_control(book.setups.back().name);
    if (end != nullptr && !traverse.legs.empty()) {
        const geo_nee& last = traverse.measured.back();
        traverse.closure =
            Closure{last.north - end->at.north, last.east - end->at.east, geo_vert_dist(end->at, last),
                    geo_horz_dist(end->at, last), reached.back()};
    }
    for (std::size_t i = 0; i < book.setups.size(); ++i) {
        const geo_nee& measured = traverse.measured[i];
        traverse.stations.push_back(
            {book.setups[i].name,
             traverse.closure ? less(measured, *traverse.closure, reached[i] / reached.back()) : measured});
        const geo_nee& back = i == 0 ? book.find_control(book.setups[0].find(SightKind::BACK)->name)->at
                                     : traverse.stations[i - 1].at;
        traverse.back_bearing.push_back(geo_grid_bearing(traverse.stations[i].at, back));
    }
    return traverse;
}

std::vector<SidePoint> reduce_side_sights(const Book& book, const Traverse& traverse, double scale) {
    std::vector<SidePoint> points;
    for (std::size_t i = 0; i < book.setups.size(); ++i) {
        const Setup& setup = book.setups[i];
        for (const Sight& sight : setup.sights) {
            const bool open_end = sight.kind == SightKind::FORE && i + 1 == book.setups.size() &&
                                  book.find_control(sight.name) == nullptr;
            if (sight.kind != SightKind::SIDE && !open_end) {
                continue;
            }
            SidePoint side = {};
            side.point.name = sight.name;
            side.setup = i;
            side.observation = mean_of_faces(sight);
            side.observation.horizontal =
                geo_normalised_bearing(traverse.back_bearing[i] + angle_right(setup, sight));
            geo_reduce_obs(side.observation, traverse.stations[i].at, setup.height - sight.height,
                           side.point.at, scale);
            points.push_back(side);
        }
    }
    return points;
}
