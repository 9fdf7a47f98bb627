// Sorted runs of points in blocks of temporary files.
#ifndef SCRATCH_POINT_RUNS_H
#define SCRATCH_POINT_RUNS_H

#include <basalt/memory.h>

#include <cstdint>
#include <functional>
#include <vector>

#include "point.h"

/// External sort: each block of the allocator is filled and sorted
/// alone, then all blocks are merged. What has been given back goes to the allocator block by block.
class PointRuns {
public:
    static constexpr std::uint32_t BLOCK_BYTES = 1 << 20;
    static constexpr std::uint32_t FILE_BYTES = 64 << 20;
    static constexpr std::int64_t POINTS_IN_BLOCK = BLOCK_BYTES / sizeof(Point);

    /// std::runtime_error when no further file can be made.
    void add(const Point& point);

    /// Calls `visit` for every point in order; the runs are empty then.
    void take_in_order(const std::function<void(const Point&)>& visit);

    std::int64_t points() const { return m_points; }
    std::int64_t files() const;

private:
    struct Run {
        Point* block;
        Point* next;
        Point* end;
    };

    void close_run();

    vex_lib::vlVmAllocator m_allocator{FILE_BYTES, BLOCK_BYTES};
    std::vector<Run> m_runs;  // the last one is being filled
    std::int64_t m_points = 0;
    std::size_t m_most_runs = 0;
};

#endif
