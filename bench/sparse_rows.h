// SparseGrid in bench_sparse: rows, windows and many cells in one call, beside the single calls.
#ifndef BASALT_BENCH_SPARSE_ROWS_H
#define BASALT_BENCH_SPARSE_ROWS_H

#include <cstddef>
#include <cstdio>
#include <cstdlib>
#include <utility>
#include <vector>

#include "basalt/sparse_grid.h"
#include "bench/sparse_stores.h"

namespace bench {

// The square of cells from (-side / 2, -side / 2) on.
class GridRows {
public:
    static constexpr const char* NAME = "basalt_rows";

    explicit GridRows(int side) : m_side(side), m_row(static_cast<std::size_t>(side)) {}

    void insert_all() {
        for (int y = first(); y < first() + m_side; ++y) {
            for (int x = first(); x < first() + m_side; ++x) {
                m_row[static_cast<std::size_t>(x - first())] = record_of(x, y);
            }
            m_grid.insert_row(first(), y, m_row.data(), m_row.size());
        }
    }
    double copy_all() {
        double sum = 0;
        for (int y = first(); y < first() + m_side; ++y) {
            m_grid.copy_row(first(), y, m_row.size(), m_row.data(), nullptr);
            for (const Record& r : m_row) {
                sum += r[2];
            }
        }
        return sum;
    }
    void remove_all() {
        for (int y = first(); y < first() + m_side; ++y) {
            m_grid.remove_row(first(), y, m_row.size());
        }
    }
    double visit_all() {
        double sum = 0;
        m_grid.for_each([&](int, int, const Record& r) { sum += r[2]; });
        return sum;
    }
    double visit_spans() {
        double sum = 0;
        m_grid.for_each_span([&](int, int, const Record* values, std::size_t count) {
            for (std::size_t i = 0; i < count; ++i) {
                sum += values[i][2];
            }
        });
        return sum;
    }
    double visit_window(int x0, int y0, int side) {
        double sum = 0;
        m_grid.for_each({x0, y0, x0 + side - 1, y0 + side - 1},
                        [&](int, int, const Record& r) { sum += r[2]; });
        return sum;
    }
    double find_cells(const std::vector<std::pair<int, int>>& cells) {
        constexpr std::size_t BATCH = 1000;
        std::vector<basalt::GridCell> batch;
        std::vector<Record*> found(BATCH);
        double sum = 0;
        for (const auto& [x, y] : cells) {
            batch.push_back({x, y});
            if (batch.size() == BATCH) {
                m_grid.find_cells(batch.data(), BATCH, found.data());
                for (const Record* const r : found) {
                    sum += (*r)[2];
                }
                batch.clear();
            }
        }
        return sum;
    }
    std::size_t size() const { return m_grid.size(); }

private:
    int first() const { return -m_side / 2; }

    int m_side;
    std::vector<Record> m_row;
    basalt::SparseGrid<Record> m_grid{BLOCK_SIDE, 64};
};

inline void require_same_rows(Basalt& calls, int side) {
    GridRows rows(side);
    rows.insert_all();
    const double sum = calls.visit_all();
    if (rows.copy_all() != sum || rows.visit_all() != sum || rows.visit_spans() != sum) {
        std::fprintf(stderr, "%s differs from single calls\n", GridRows::NAME);
        std::exit(1);
    }
    rows.remove_all();
    if (rows.size() != 0) {
        std::fprintf(stderr, "%s leaves cells behind\n", GridRows::NAME);
        std::exit(1);
    }
}

}  // namespace bench

#endif
