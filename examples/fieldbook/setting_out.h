// Setting-out values: the angle to turn and the distance to measure.
#ifndef FIELDBOOK_SETTING_OUT_H
#define FIELDBOOK_SETTING_OUT_H

#include <basalt/geo.h>

#include <cstddef>

#include "book_reader.h"
#include "traverse.h"

struct SettingOut {
    std::size_t setup;    ///< index of the station
    geo_hvd observation;  ///< with a grid bearing
    double turn;          ///< clockwise from the back sight, radians in [0, 2 pi)
};

/// The observation of a point from the nearest station, with the instrument as high as it stood there.
SettingOut set_out(const Book& book, const Traverse& traverse, const geo_nee& point, double target_height,
                   double scale);

#endif
