#include "point_files.h"

#include <algorithm>
#include <stdexcept>

#include "interrupt.h"

void PointRuns::add(const Point& point) {
    if (m_runs.empty() || m_runs.back().end == m_runs.back().block + BLOCK_BYTES / sizeof(Point)) {
        close_run();
        auto* const block = static_cast<Point*>(m_allocator.Alloc(BLOCK_BYTES));
        if (block == nullptr) {
            throw std::runtime_error("no file of 64 MiB can be made and mapped in the temporary folder");
        }
        m_runs.push_back({block, block, block});
        m_most_runs = std::max(m_most_runs, m_runs.size());
    }
    *m_runs.back().end++ = point;
}

void PointRuns::close_run() {
    stop_if_interrupted();
    if (!m_runs.empty()) {
        std::sort(m_runs.back().block, m_runs.back().end);
    }
}

void PointRuns::take_in_order(const std::function<void(const Point&)>& visit) {
    close_run();
    // A heap of runs with the least next point in front.
    const auto later = [](const Run& a, const Run& b) { return *b.next < *a.next; };
    std::make_heap(m_runs.begin(), m_runs.end(), later);
    while (!m_runs.empty()) {
        std::pop_heap(m_runs.begin(), m_runs.end(), later);
        Run& run = m_runs.back();
        visit(*run.next++);
        if (run.next != run.end) {
            std::push_heap(m_runs.begin(), m_runs.end(), later);
        } else {
            m_allocator.Free(run.block);
            m_runs.pop_back();
            stop_if_interrupted();
        }
    }
}

std::int64_t PointRuns::files() const {
    constexpr std::size_t BLOCKS_IN_FILE = FILE_BYTES / BLOCK_BYTES;
    return static_cast<std::int64_t>((m_most_runs + BLOCKS_IN_FILE - 1) / BLOCKS_IN_FILE);
}

void PointStore::add(const Point& point) {
    if (m_points == files() * POINTS_IN_MAP) {
        stop_if_interrupted();
        auto map = std::make_unique<vex_util::CMemoryMap>();
        if (!map->Create(FILE_BYTES)) {
            throw std::runtime_error("no space for 64 MiB of points, in the temporary folder or in memory");
        }
        m_maps.push_back(std::move(map));
    }
    points_of(*m_maps.back())[m_points++ % POINTS_IN_MAP] = point;
}
