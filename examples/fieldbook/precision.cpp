#include "precision.h"

#include "angles.h"

namespace {

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

}  // namespace

Precision::Precision(const Traverse& traverse, const InstrumentPrecision& instrument)
    : m_traverse(traverse), m_instrument(instrument) {}

/// Contribution of a slope distance and a zenith angle.
void Precision::add_sight(Covariance& sum, const geo_hvd& observation) const {
    const auto [sine, cosine] = sine_cosine(observation.vertical);
    const auto [east, north] = sine_cosine(observation.horizontal);
    add(sum, m_instrument.distance + m_instrument.per_metre * observation.distance,
        {sine * north, sine * east, cosine});
    add(sum, m_instrument.angle * observation.distance, {cosine * north, cosine * east, -sine});
}

/// Contribution of a horizontal angle, which rotates all later points about its station.
void Precision::add_angle(Covariance& sum, const geo_nee& pivot, const geo_nee& point) const {
    add(sum, m_instrument.angle, {pivot.east - point.east, point.north - pivot.north, 0.0});
}

Covariance Precision::station(std::size_t setup) const {
    Covariance sum = {};
    if (m_traverse.closure && setup + 1 == m_traverse.stations.size()) {
        return sum;
    }
    for (std::size_t i = 0; i < setup; ++i) {
        add_angle(sum, m_traverse.stations[i].at, m_traverse.stations[setup].at);
        add_sight(sum, m_traverse.legs[i].fore);
    }
    return sum;
}

Covariance Precision::seen_from(std::size_t setup, const geo_hvd& observation, const geo_nee& point) const {
    // The back sight's bearing carries the errors of all earlier angles.
    Covariance sum = {};
    const bool at_end = m_traverse.closure && setup + 1 == m_traverse.stations.size();
    for (std::size_t i = at_end ? setup : 0; i <= setup; ++i) {
        add_angle(sum, m_traverse.stations[i].at, point);
        if (i < setup) {
            add_sight(sum, m_traverse.legs[i].fore);
        }
    }
    add_sight(sum, observation);
    return sum;
}
