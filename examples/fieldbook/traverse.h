// The traverse: from angles and distances to closed coordinates.
#ifndef FIELDBOOK_TRAVERSE_H
#define FIELDBOOK_TRAVERSE_H

#include <basalt/geo.h>

#include <optional>
#include <string>
#include <vector>

#include "book_reader.h"

/// A sight as if read on face 1 of an instrument without error, when both faces were read; else as the one
/// face has it.
geo_hvd mean_of_faces(const Sight& sight);

/// Instrument errors and reading spread from the two faces of one sight.
struct FaceDifference {
    double collimation;  ///< half the difference of the horizontal readings, face 1 less face 2, radians
    double index;        ///< half the excess of the two zenith readings over 360 degrees, radians
    double distance;     ///< face 1 less face 2, metres
};

/// Only for a sight with both faces.
FaceDifference face_difference(const Sight& sight);

/// From one station to the next, the mean of fore sight and back sight: errors that both ends share, such as
/// curvature and refraction, cancel in the rise.
struct Leg {
    double bearing;     ///< with the angular misclosure taken out, radians
    double horizontal;  ///< on the grid, metres
    double rise;        ///< metres
    geo_hvd fore;       ///< as reduced, with the bearing above
    double difference;  ///< fore sight less back sight, horizontal, metres
    double rise_sum;    ///< rise of the fore sight and of the back sight together, metres
};

/// Misclosures: measured minus known.
struct Closure {
    double north;
    double east;
    double elevation;
    double linear;  ///< horizontal length of the misclosure, metres
    double length;  ///< of all legs, metres
};

struct Traverse {
    std::vector<Leg> legs;
    std::vector<NamedPoint> stations;  ///< balanced, one a setup
    std::vector<geo_nee> measured;     ///< the same before the linear misclosure is taken out
    std::vector<double> back_bearing;  ///< between balanced coordinates, one a setup, radians
    std::optional<double> angular;     ///< misclosure, radians: measured less known
    std::optional<Closure> closure;    ///< nothing for a traverse that ends on an unknown point
};

/// Computes the traverse. The angular misclosure is shared out equally among the angles, then the linear one
/// among the legs in proportion to their lengths, north, east and height alike: the compass rule.
///
/// Source: N. Bowditch, The Analyst, 1808; C. D. Ghilani, Elementary Surveying, 2018, section 10.7.
Traverse compute_traverse(const Book& book, double scale);

/// A target that is no station, reduced from the balanced station it was seen from.
struct SidePoint {
    NamedPoint point;
    std::size_t setup;    ///< index of the station
    geo_hvd observation;  ///< with a grid bearing
};

/// All side sights, and a last fore sight to an unknown point.
std::vector<SidePoint> reduce_side_sights(const Book& book, const Traverse& traverse, double scale);

#endif
