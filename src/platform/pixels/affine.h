// Affine maps of the plane, and the rows of pixels that one maps into a rectangle.
#ifndef BASALT_SRC_PLATFORM_PIXELS_AFFINE_H
#define BASALT_SRC_PLATFORM_PIXELS_AFFINE_H

#include <cstdint>
#include <optional>

namespace basalt::platform {

__extension__ using Int128 = __int128;

// x' = x m11 + y m21 + dx, y' = x m12 + y m22 + dy.
struct Affine {
    double m11 = 1;
    double m12 = 0;
    double m21 = 0;
    double m22 = 1;
    double dx = 0;
    double dy = 0;

    friend bool operator==(const Affine&, const Affine&) = default;

    double x_of(double x, double y) const { return x * m11 + y * m21 + dx; }
    double y_of(double x, double y) const { return x * m12 + y * m22 + dy; }

    // This map, then the next one.
    Affine then(const Affine& next) const;
    // The inverse map; nothing when it is not finite.
    std::optional<Affine> inverse() const;

    static Affine shift(double x, double y) { return {1, 0, 0, 1, x, y}; }
};

// The pixels whose middles a map takes into a rectangle of the source, row by row, with the places they map
// to. Places are counted in units of 2^-32 source pixels, so that sums of steps are exact.
class AffineRows {
public:
    static constexpr int PLACE_BITS = 32;

    // map: from pixels to the source. The rectangle excludes its right and bottom and is clamped to 32 bits.
    // Nothing when a step of one pixel would cross 2^30 source pixels.
    static std::optional<AffineRows> create(const Affine& map, double left, double top, double right,
                                            double bottom);

    struct Run {
        int begin;        // first column; no run when not below end
        int end;          // first column outside
        std::uint64_t x;  // place of the first column's middle; later ones wrap harmlessly past the last
        std::uint64_t y;
    };
    // The run of a row within columns 0 to `columns`, excluded.
    Run row(int y, int columns) const;

    // Steps of a place from one column to the next.
    std::uint64_t step_x() const { return static_cast<std::uint64_t>(m_x.per_column); }
    std::uint64_t step_y() const { return static_cast<std::uint64_t>(m_y.per_column); }
    // Steps from one row to the next.
    std::int64_t row_step_x() const { return m_x.per_row; }
    std::int64_t row_step_y() const { return m_y.per_row; }

    // Moves the begin of a run.
    void advance(Run& run, int columns) const {
        run.begin += columns;
        run.x += step_x() * static_cast<std::uint64_t>(columns);
        run.y += step_y() * static_cast<std::uint64_t>(columns);
    }

private:
    // One coordinate of the source as a function of column and row.
    struct Coordinate {
        std::int64_t per_column;
        std::int64_t per_row;
        Int128 start;        // at the middle of the first pixel
        std::int64_t least;  // inside from here
        std::int64_t limit;  // to before here

        Int128 at_row(int y) const { return start + Int128{per_row} * y; }
        void narrow(Int128 place, std::int64_t& begin, std::int64_t& end) const;
    };

    static std::optional<Coordinate> coordinate(double per_column, double per_row, double start, double least,
                                                double limit);

    Coordinate m_x;
    Coordinate m_y;
};

}  // namespace basalt::platform

#endif
