#include "precision.h"

#include <cmath>

#include "angles.h"

namespace {

// Standard deviations of a common total station: of a horizontal or zenith angle, of a distance, and of the
// distance again for each metre of it.
constexpr double ANGLE_SIGMA = 3.0 * RADIANS_PER_SECOND;
constexpr double DISTANCE_SIGMA = 0.002;
constexpr double SIGMA_PER_METRE = 2e-6;

/// Adds sigma^2 g g^T, for what moves the point by g per unit of an error sigma.
void add(Covariance& sum, double sigma, const geo_nee& g) {
    const double variance = sigma * sigma;
    sum.nn += variance * g.north * g.north;
    sum.ee += variance * g.east * g.east;
    sum.uu += variance * g.elevation * g.elevation;
    sum.ne += variance * g.north * g.east;
    sum.nu += variance * g.north * g.elevation;
    sum.eu += variance * g.east * g.elevation;
}

/// Contribution of a slope distance and a zenith angle.
void add_sight(Covariance& sum, const geo_hvd& observation) {
    const double sine = std::sin(observation.vertical);
    const double cosine = std::cos(observation.vertical);
    const double north = std::cos(observation.horizontal);
    const double east = std::sin(observation.horizontal);
    add(sum, DISTANCE_SIGMA + SIGMA_PER_METRE * observation.distance, {sine * north, sine * east, cosine});
    add(sum, ANGLE_SIGMA * observation.distance, {cosine * north, cosine * east, -sine});
}

/// Contribution of a horizontal angle, which rotates all later points about its station.
void add_angle(Covariance& sum, const geo_nee& pivot, const geo_nee& point) {
    add(sum, ANGLE_SIGMA, {pivot.east - point.east, point.north - pivot.north, 0.0});
}

}  // namespace

Covariance station_covariance(const Traverse& traverse, std::size_t setup) {
    Covariance sum = {};
    for (std::size_t i = 0; i < setup; ++i) {
        add_angle(sum, traverse.stations[i].at, traverse.stations[setup].at);
        add_sight(sum, traverse.legs[i].fore);
    }
    return sum;
}

Covariance target_covariance(const Traverse& traverse, std::size_t setup, const geo_hvd& observation,
                             const geo_nee& point) {
    // The back sight's bearing carries the errors of all earlier angles.
    Covariance sum = {};
    const bool at_end = traverse.closure && setup + 1 == traverse.stations.size();
    for (std::size_t i = at_end ? setup : 0; i <= setup; ++i) {
        add_angle(sum, traverse.stations[i].at, point);
        if (i < setup) {
            add_sight(sum, traverse.legs[i].fore);
        }
    }
    add_sight(sum, observation);
    return sum;
}
