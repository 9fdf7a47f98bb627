// A road's or railway's axis: straights, spirals and arcs, one after the other.
#ifndef FIELDBOOK_ALIGNMENT_H
#define FIELDBOOK_ALIGNMENT_H

#include <basalt/geo.h>

#include <optional>
#include <string>
#include <vector>

enum class ElementKind { STRAIGHT, SPIRAL_IN, ARC, SPIRAL_OUT };

struct Element {
    ElementKind kind;
    double length;  ///< metres
    double radius;  ///< of the arc, or at the spiral's bent end, metres; GEO_INFINITY for a straight
    double hand;    ///< 1 bends to the right, -1 to the left
};

/// A point of the axis and the direction of its tangent.
struct AxisPoint {
    geo_nee at;
    double bearing;  ///< radians
};

/// Where the design says the axis ends.
struct DesignEnd {
    double north;
    double east;
    double bearing;
};

struct Alignment {
    double chainage;  ///< of the start, metres
    AxisPoint start;
    double grade;  ///< rise over run along the axis
    std::vector<Element> elements;
    std::optional<DesignEnd> end;
};

/// Reads an alignment of the lines
///
///     start,CHAINAGE,NORTH,EAST,ELEVATION,BEARING,GRADE
///     straight,LENGTH
///     spiral_in|arc|spiral_out,LENGTH,RADIUS,left|right
///     end,NORTH,EAST,BEARING
///
/// metres and degrees, the start first. A spiral leads into an arc or out of it, with its radius and hand.
/// The end may be left out; it is compared with the computed one.
Alignment read_alignment(const std::string& path);

/// The point of an element at a length from its start.
AxisPoint along(const Element& element, const AxisPoint& start, double grade, double length);

/// A point to be set out.
struct ChainagePoint {
    double chainage;
    AxisPoint axis;
    const char* what;  ///< the element that begins here, "end", or empty
    double stand_off;  ///< upper bound of the sagitta of the chord from the point before, metres
};

/// Points at the elements' ends, at whole multiples of the interval, and between these wherever a chord would
/// stand off the axis by more than the sagitta.
std::vector<ChainagePoint> set_out_axis(const Alignment& alignment, double interval, double sagitta);

#endif
