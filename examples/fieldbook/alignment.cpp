#include "alignment.h"

#include <algorithm>
#include <cmath>

#include "angles.h"

namespace {

constexpr double SERIES_TOLERANCE = 1e-9;
/// Points closer than this are one; metres.
constexpr double SAME_CHAINAGE = 0.001;

double spiral_constant(const Element& spiral) {
    return 2.0 * spiral.radius * spiral.length;
}

/// From `start`, x along a bearing and y to the side the element bends to.
geo_nee offset(const geo_nee& start, const Element& element, double bearing, double x, double y,
               double rise) {
    geo_nee point = {};
    geo_grid_follow3(start, bearing, x, rise, point);
    geo_grid_follow3(point, bearing + element.hand * 0.5 * PI, y, 0.0, point);
    return point;
}

AxisPoint along_spiral_in(const Element& spiral, const AxisPoint& start, double length, double rise) {
    double x = 0.0;
    double y = 0.0;
    geo_spiral_deltas(length, spiral_constant(spiral), SERIES_TOLERANCE, x, y);
    const double turn = geo_spiral_deflection(length, spiral_constant(spiral));
    return {offset(start.at, spiral, start.bearing, x, y, rise), start.bearing + spiral.hand * turn};
}

/// The spiral is laid from its straight end backwards, where its tangent is the one it leads to.
AxisPoint along_spiral_out(const Element& spiral, const AxisPoint& start, double length, double rise) {
    const double constant = spiral_constant(spiral);
    const double straight = start.bearing + spiral.hand * geo_spiral_deflection(spiral.length, constant);
    double whole_x = 0.0;
    double whole_y = 0.0;
    double x = 0.0;
    double y = 0.0;
    const double left = spiral.length - length;
    geo_spiral_deltas(spiral.length, constant, SERIES_TOLERANCE, whole_x, whole_y);
    geo_spiral_deltas(left, constant, SERIES_TOLERANCE, x, y);
    return {offset(start.at, spiral, straight, whole_x - x, y - whole_y, rise),
            straight - spiral.hand * geo_spiral_deflection(left, constant)};
}

AxisPoint along_arc(const Element& arc, const AxisPoint& start, double length, double rise) {
    const double angle = geo_arc_length_to_angle(length, arc.radius);
    AxisPoint point = {{}, start.bearing + arc.hand * angle};
    const double chord = 2.0 * arc.radius * std::sin(0.5 * angle);
    geo_grid_follow3(start.at, start.bearing + arc.hand * 0.5 * angle, chord, rise, point.at);
    return point;
}

/// Smallest radius between two lengths along an element.
double smallest_radius(const Element& element, double from, double to) {
    if (element.kind == ElementKind::SPIRAL_IN) {
        return element.radius * element.length / to;
    }
    if (element.kind == ElementKind::SPIRAL_OUT) {
        return element.radius * element.length / (element.length - from);
    }
    return element.radius;  // infinite for a straight
}

/// Number of chords that keep the sagitta.
double pieces_within(double sagitta, double radius, double length) {
    if (radius == GEO_INFINITY) {
        return 1.0;
    }
    // At a sagitta of the radius or more, half the chord is the radius.
    const double half_chord = sagitta < radius ? geo_arc_to_chord(radius, sagitta) : radius;
    const double piece = geo_arc_angle_to_length(2.0 * std::asin(half_chord / radius), radius);
    constexpr double ROUNDING = 1e-9;
    return std::max(1.0, std::ceil(length / piece - ROUNDING));
}

/// Sagitta of the chord over a length of arc.
double stand_off(double radius, double arc) {
    return radius == GEO_INFINITY ? 0.0 : radius * (1.0 - std::cos(0.5 * std::min(arc / radius, PI)));
}

/// Lengths along an element at which the chainage is a whole multiple of the interval, and its two ends.
std::vector<double> stops(double chainage, double length, double interval) {
    std::vector<double> at = {0.0};
    const double first = std::floor(chainage / interval) + 1.0;
    for (double k = first; k * interval - chainage < length - SAME_CHAINAGE; k += 1.0) {
        const double stop = k * interval - chainage;
        if (stop > SAME_CHAINAGE) {
            at.push_back(stop);
        }
    }
    at.push_back(length);
    return at;
}

}  // namespace

AxisPoint along(const Element& element, const AxisPoint& start, double grade, double length) {
    AxisPoint point = start;
    const double rise = grade * length;
    if (element.kind == ElementKind::STRAIGHT) {
        geo_grid_follow2(start.at, start.bearing, length, grade, point.at);
    } else if (element.kind == ElementKind::SPIRAL_IN) {
        point = along_spiral_in(element, start, length, rise);
    } else if (element.kind == ElementKind::ARC) {
        point = along_arc(element, start, length, rise);
    } else {
        point = along_spiral_out(element, start, length, rise);
    }
    point.bearing = geo_normalised_bearing(point.bearing);
    return point;
}

std::vector<ChainagePoint> set_out_axis(const Alignment& alignment, double interval, double sagitta) {
    constexpr const char* NAMES[] = {"straight", "spiral in", "arc", "spiral out"};  // as ElementKind
    std::vector<ChainagePoint> points;
    AxisPoint start = alignment.start;
    double chainage = alignment.chainage;
    double last_stand_off = 0.0;
    for (const Element& element : alignment.elements) {
        points.push_back({chainage, start, NAMES[static_cast<int>(element.kind)], last_stand_off});
        const std::vector<double> at = stops(chainage, element.length, interval);
        for (std::size_t i = 1; i < at.size(); ++i) {
            const double gap = at[i] - at[i - 1];
            const double pieces = pieces_within(sagitta, smallest_radius(element, at[i - 1], at[i]), gap);
            for (double piece = 1.0; piece <= pieces; piece += 1.0) {
                const double length = at[i - 1] + gap * (piece / pieces);
                last_stand_off =
                    stand_off(smallest_radius(element, length - gap / pieces, length), gap / pieces);
                if (i + 1 == at.size() && piece == pieces) {
                    break;  // the element's end, which is the next one's start
                }
                points.push_back(
                    {chainage + length, along(element, start, alignment.grade, length), "", last_stand_off});
            }
        }
        start = along(element, start, alignment.grade, element.length);
        chainage += element.length;
    }
    points.push_back({chainage, start, "end", last_stand_off});
    return points;
}
