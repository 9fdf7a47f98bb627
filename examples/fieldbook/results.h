// Everything the program computes, for the report and the CSV file alike.
#ifndef FIELDBOOK_RESULTS_H
#define FIELDBOOK_RESULTS_H

#include <optional>
#include <string>
#include <vector>

#include "alignment.h"
#include "angles.h"
#include "book_reader.h"
#include "earth.h"
#include "precision.h"
#include "traverse.h"

/// A control point and where it lies on the earth.
struct EarthAnchor {
    std::string name;
    geo_llh position;
};

struct Options {
    std::string book;                      ///< path
    std::optional<std::string> alignment;  ///< path
    std::optional<std::string> csv;        ///< path
    double interval = 20.0;                ///< metres
    double sagitta = 0.01;                 ///< metres
    double target_height = 1.5;            ///< metres
    double scale = 1.0;                    ///< grid over ground
    std::optional<EarthAnchor> wgs84;
};

/// Setting-out values: the angle to turn and the distance to measure.
struct SettingOut {
    std::size_t setup;    ///< index of the station
    geo_hvd observation;  ///< with a grid bearing
    double turn;          ///< clockwise from the back sight, radians in [0, 2 pi)
};

enum class PointKind { CONTROL, STATION, SIDE, AXIS };

struct ResultPoint {
    PointKind kind;
    std::string name;  ///< or chainage
    geo_nee at;
    Covariance covariance;                  ///< zero for a control point
    std::optional<ChainagePoint> axis;      ///< for a point of the axis
    std::optional<SettingOut> setting_out;  ///< likewise
    std::optional<EarthPoint> earth;        ///< with --wgs84
};

struct Results {
    Options options;
    Book book;
    Traverse traverse;
    std::vector<ResultPoint> points;
    std::optional<AxisPoint> axis_misclosure;  ///< computed less designed end; elevation 0
};

Results compute(const Options& options);

#endif
