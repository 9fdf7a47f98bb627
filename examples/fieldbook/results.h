// Everything the program computes, for the report and the CSV file alike.
#ifndef FIELDBOOK_RESULTS_H
#define FIELDBOOK_RESULTS_H

#include <optional>
#include <string>
#include <vector>

#include "alignment.h"
#include "book_reader.h"
#include "earth.h"
#include "options.h"
#include "setting_out.h"
#include "traverse.h"

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
