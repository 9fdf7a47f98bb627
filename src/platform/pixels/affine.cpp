#include "src/platform/pixels/affine.h"

#include <algorithm>
#include <cmath>

namespace basalt::platform {

namespace {

constexpr double ONE = 4294967296.0;            // places a source pixel
constexpr double LARGEST_STEP = 1073741824.0;   // 2^30
constexpr double LARGEST_PLACE = 2147483647.0;  // coordinates have 32 bits
constexpr double LARGEST_START = 0x1p90;        // out of reach of any steps, and 122 bits of places

// Rounded towards minus infinity; the divisor is positive.
Int128 floor_divided(Int128 a, Int128 b) {
    const Int128 quotient = a / b;
    return a % b < 0 ? quotient - 1 : quotient;
}

Int128 ceil_divided(Int128 a, Int128 b) {
    return -floor_divided(-a, b);
}

}  // namespace

Affine Affine::then(const Affine& next) const {
    return {m11 * next.m11 + m12 * next.m21,
            m11 * next.m12 + m12 * next.m22,
            m21 * next.m11 + m22 * next.m21,
            m21 * next.m12 + m22 * next.m22,
            next.x_of(dx, dy),
            next.y_of(dx, dy)};
}

std::optional<Affine> Affine::inverse() const {
    const double determinant = m11 * m22 - m12 * m21;
    Affine result = {m22 / determinant, -m12 / determinant, -m21 / determinant, m11 / determinant, 0, 0};
    result.dx = -result.x_of(dx, dy);
    result.dy = -result.y_of(dx, dy);
    for (const double value : {result.m11, result.m12, result.m21, result.m22, result.dx, result.dy}) {
        if (!std::isfinite(value)) {
            return std::nullopt;
        }
    }
    return result;
}

std::optional<AffineRows::Coordinate> AffineRows::coordinate(double per_column, double per_row, double start,
                                                             double least, double limit) {
    if (!(std::fabs(per_column) < LARGEST_STEP && std::fabs(per_row) < LARGEST_STEP)) {
        return std::nullopt;
    }
    const auto places = [](double value) { return static_cast<std::int64_t>(std::floor(value * ONE + 0.5)); };
    const double middle = start + 0.5 * per_column + 0.5 * per_row;
    return Coordinate{
        places(per_column), places(per_row),
        static_cast<Int128>(std::floor(std::clamp(middle, -LARGEST_START, LARGEST_START) * ONE + 0.5)),
        places(std::clamp(least, -LARGEST_PLACE, LARGEST_PLACE)),
        places(std::clamp(limit, -LARGEST_PLACE, LARGEST_PLACE))};
}

std::optional<AffineRows> AffineRows::create(const Affine& map, double left, double top, double right,
                                             double bottom) {
    const std::optional<Coordinate> x = coordinate(map.m11, map.m21, map.dx, left, right);
    const std::optional<Coordinate> y = coordinate(map.m12, map.m22, map.dy, top, bottom);
    if (!x || !y) {
        return std::nullopt;
    }
    AffineRows rows;
    rows.m_x = *x;
    rows.m_y = *y;
    return rows;
}

// Narrows columns to those with least <= place + per_column * column < limit.
void AffineRows::Coordinate::narrow(Int128 place, std::int64_t& begin, std::int64_t& end) const {
    Int128 first = begin;
    Int128 last = end;
    if (per_column > 0) {
        first = ceil_divided(least - place, per_column);
        last = ceil_divided(limit - place, per_column);
    } else if (per_column < 0) {
        first = floor_divided(place - limit, -Int128{per_column}) + 1;
        last = floor_divided(place - least, -Int128{per_column}) + 1;
    } else if (place < least || place >= limit) {
        last = first;
    }
    begin = static_cast<std::int64_t>(std::clamp<Int128>(first, begin, end));
    end = static_cast<std::int64_t>(std::clamp<Int128>(last, begin, end));
}

AffineRows::Run AffineRows::row(int y, int columns) const {
    std::int64_t first = 0;
    std::int64_t last = columns;
    const Int128 x_place = m_x.at_row(y);
    const Int128 y_place = m_y.at_row(y);
    m_x.narrow(x_place, first, last);
    m_y.narrow(y_place, first, last);
    return {static_cast<int>(first), static_cast<int>(last),
            static_cast<std::uint64_t>(x_place + Int128{m_x.per_column} * first),
            static_cast<std::uint64_t>(y_place + Int128{m_y.per_column} * first)};
}

}  // namespace basalt::platform
