// Points on temporary files: sorted runs in the blocks of an allocator, and one array of mapped blocks.
#ifndef SCRATCH_POINT_FILES_H
#define SCRATCH_POINT_FILES_H

#include <basalt/memory.h>

#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <vector>

#include "scan.h"

/// External sort: each block of the allocator is filled and sorted alone, then all blocks are merged. What
/// has been visited goes back to the allocator block by block.
class PointRuns {
public:
    static constexpr std::uint32_t BLOCK_BYTES = 1 << 20;
    static constexpr std::uint32_t FILE_BYTES = 64 << 20;

    /// std::runtime_error when no further file can be made.
    void add(const Point& point);
    /// Calls `visit` for every point in order; the runs are empty then.
    void take_in_order(const std::function<void(const Point&)>& visit);
    /// Files used so far.
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
    std::size_t m_most_runs = 0;
};

/// An array that grows by mapped blocks and never moves what it holds.
class PointStore {
public:
    static constexpr std::uint32_t FILE_BYTES = 64 << 20;

    /// std::runtime_error when neither the disk nor memory has space.
    void add(const Point& point);
    const Point& at(std::int64_t index) const {
        return points_of(*m_maps[static_cast<std::size_t>(index / POINTS_IN_MAP)])[index % POINTS_IN_MAP];
    }
    std::int64_t points() const { return m_points; }
    std::int64_t files() const { return static_cast<std::int64_t>(m_maps.size()); }

private:
    static constexpr std::int64_t POINTS_IN_MAP = FILE_BYTES / sizeof(Point);

    static Point* points_of(const vex_util::CMemoryMap& map) {
        return static_cast<Point*>(static_cast<void*>(map));
    }

    std::vector<std::unique_ptr<vex_util::CMemoryMap>> m_maps;
    std::int64_t m_points = 0;
};

#endif
