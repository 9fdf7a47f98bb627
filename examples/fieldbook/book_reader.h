// The field book: control points, and what was read at each station.
#ifndef FIELDBOOK_BOOK_READER_H
#define FIELDBOOK_BOOK_READER_H

#include <basalt/geo.h>

#include <optional>
#include <string>
#include <string_view>
#include <vector>

struct NamedPoint {
    std::string name;
    geo_nee at;
};

enum class SightKind { BACK, FORE, SIDE };

/// A target as read at one station, on one face or on both; circle readings as booked.
struct Sight {
    SightKind kind;
    std::string name;
    double height;  ///< of the target above its point, metres
    std::optional<geo_hvd> face1;
    std::optional<geo_hvd> face2;
};

struct Setup {
    std::string name;
    double height;  ///< of the instrument above the station, metres
    std::vector<Sight> sights;

    /// The sight of a kind of which a setup has one; null without it.
    const Sight* find(SightKind kind) const;
};

/// Setups in the order of the traverse: the first stands on a control point and looks back to another, each
/// further one stands on the fore sight of the one before and looks back to that. Only the last may stand on
/// a control point again. A back or fore sight between control points has a bearing: they differ in north or
/// east.
struct Book {
    std::vector<NamedPoint> control;
    std::vector<Setup> setups;

    /// Null when no control point has the name.
    const NamedPoint* find_control(std::string_view name) const;
};

/// Reads a book of the lines
///
///     point,NAME,NORTH,EAST,ELEVATION
///     station,NAME,INSTRUMENT_HEIGHT
///     back|fore|side,NAME,TARGET_HEIGHT,HORIZONTAL,ZENITH,SLOPE_DISTANCE,FACE
///
/// metres and degrees; see read_angle() for the latter and CsvReader for the rest.
Book read_book(const std::string& path);

#endif
