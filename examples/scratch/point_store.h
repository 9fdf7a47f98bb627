// Points one after the other on temporary files.
#ifndef SCRATCH_POINT_STORE_H
#define SCRATCH_POINT_STORE_H

#include <basalt/memory.h>

#include <cstdint>
#include <memory>
#include <vector>

#include "point.h"

/// An array that grows by mapped blocks and never moves what it holds.
class PointStore {
public:
    static constexpr std::uint32_t MAP_BYTES = 64 << 20;
    static constexpr std::int64_t POINTS_IN_MAP = MAP_BYTES / sizeof(Point);

    /// std::runtime_error when neither the disk nor memory has space.
    void add(const Point& point);

    const Point& at(std::int64_t index) const {
        return points_of(*m_maps[static_cast<std::size_t>(index / POINTS_IN_MAP)])[index % POINTS_IN_MAP];
    }
    std::int64_t points() const { return m_points; }
    std::int64_t files() const { return static_cast<std::int64_t>(m_maps.size()); }

private:
    static Point* points_of(const vex_util::CMemoryMap& map) {
        return static_cast<Point*>(static_cast<void*>(map));
    }

    std::vector<std::unique_ptr<vex_util::CMemoryMap>> m_maps;
    std::int64_t m_points = 0;
};

#endif
