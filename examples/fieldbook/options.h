// The command line.
#ifndef FIELDBOOK_OPTIONS_H
#define FIELDBOOK_OPTIONS_H

#include <basalt/geo.h>

#include <optional>
#include <string>
#include <vector>

#include "angles.h"
#include "precision.h"

/// A control point and where it lies on the earth.
struct EarthAnchor {
    std::string name;
    geo_llh position;
};

struct Options {
    bool help = false;
    bool version = false;
    std::string book;                      ///< path
    std::optional<std::string> alignment;  ///< path
    std::optional<std::string> csv;        ///< path
    double interval = 20.0;                ///< metres
    double sagitta = 0.01;                 ///< metres
    double target_height = 1.5;            ///< metres
    double scale = 1.0;                    ///< grid over ground
    std::optional<EarthAnchor> wgs84;
    InstrumentPrecision precision = {3.0 * RADIANS_PER_SECOND, 0.002, 2e-6};
};

/// Reads the arguments that follow the program's name. InputError for anything it does not know.
Options parse_options(const std::vector<std::string>& arguments);

/// What --help prints.
extern const char* const USAGE;

#endif
