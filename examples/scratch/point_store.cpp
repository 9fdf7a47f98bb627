#include "point_store.h"

#include <stdexcept>

#include "interrupt.h"

void PointStore::add(const Point& point) {
    if (m_points == files() * POINTS_IN_MAP) {
        stop_if_interrupted();
        auto map = std::make_unique<vex_util::CMemoryMap>();
        if (!map->Create(MAP_BYTES)) {
            throw std::runtime_error("no room for 64 MiB of points, in the temporary folder or in memory");
        }
        m_maps.push_back(std::move(map));
    }
    points_of(*m_maps.back())[m_points++ % POINTS_IN_MAP] = point;
}
