// The command line.
#ifndef FIELDBOOK_OPTIONS_H
#define FIELDBOOK_OPTIONS_H

#include <basalt/geo.h>

#include <optional>
#include <string>

#include "angles.h"
#include "precision.h"

/// A control point and where it lies on the earth.
#include "command_line.h"

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
    InstrumentPrecision precision = {3.0 * RADIANS_PER_SECOND, 0.002, 2e-6};
};

/// InputError for values and operands that cannot be used.
Options parse_options(const CommandLine& line);

/// What --help prints, and the options taken.
extern const Syntax SYNTAX;

#endif
