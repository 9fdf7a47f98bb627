// The stores that bench_sparse compares, behind the same few calls.
#ifndef BASALT_BENCH_SPARSE_STORES_H
#define BASALT_BENCH_SPARSE_STORES_H

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <mutex>
#include <random>
#include <type_traits>
#include <utility>
#include <vector>

#if __has_include(<absl/container/flat_hash_map.h>)
#define HAVE_ABSEIL 1
#include <absl/container/flat_hash_map.h>
#endif
#if __has_include(<openvdb/openvdb.h>)
#define HAVE_OPENVDB 1
#include <openvdb/openvdb.h>
#endif

#include "basalt/sparse.h"

namespace bench {

using Record = std::array<double, 4>;

inline Record record_of(int x, int y) {
    return {static_cast<double>(x), static_cast<double>(y), x + 0.5 * y, 1.0};
}

constexpr int BLOCK_SIDE = 16;

using Cell = std::pair<int, int>;

inline std::vector<Cell> square(int side) {
    std::vector<Cell> cells;
    cells.reserve(static_cast<std::size_t>(side) * static_cast<std::size_t>(side));
    for (int y = 0; y < side; ++y) {
        for (int x = 0; x < side; ++x) {
            cells.emplace_back(x - side / 2, y - side / 2);
        }
    }
    return cells;
}

inline std::vector<Cell> shuffled(std::vector<Cell> cells) {
    std::shuffle(cells.begin(), cells.end(), std::mt19937_64(7));
    return cells;
}

struct Basalt {
    static constexpr const char* NAME = "basalt";
    void insert(int x, int y, const Record& r) { array.Insert(x, y, r.data()); }
    double find(int x, int y) {
        const void* const element = array.Find(x, y);
        return element == nullptr ? 0 : static_cast<const double*>(element)[2];
    }
    bool remove(int x, int y) { return array.Remove(x, y); }
    template <class Sum>
    static bool add(int, int, const void* element, const void* context) {
        *static_cast<Sum*>(const_cast<void*>(context)) += static_cast<const double*>(element)[2];
        return true;
    }
    double visit_all() {
        double sum = 0;
        array.IterateAll(add<double>, &sum);
        return sum;
    }
    double visit_window(int x0, int y0, int side) {
        const int min[2] = {x0, y0};
        const int max[2] = {x0 + side - 1, y0 + side - 1};
        array.Select(min, max);
        double sum = 0;
        array.IterateSelected(add<double>, &sum);
        return sum;
    }
    vex_util::Sparse2DArray array{sizeof(Record), BLOCK_SIDE, 64};
};

// The peers, without a lock and with the one that makes them thread-safe as ours.
struct NoMutex {
    void lock() {}
    void unlock() {}
};
template <class Mutex>
inline constexpr bool LOCKED = std::is_same_v<Mutex, std::recursive_mutex>;

#ifdef HAVE_ABSEIL
template <class Mutex>
struct FlatMap {
    static constexpr const char* NAME = LOCKED<Mutex> ? "absl_locked" : "absl";
    static std::uint64_t key(int x, int y) {
        return std::uint64_t{static_cast<std::uint32_t>(x)} << 32 | static_cast<std::uint32_t>(y);
    }
    void insert(int x, int y, const Record& r) {
        const std::lock_guard<Mutex> lock(mutex);
        map[key(x, y)] = r;
    }
    double find(int x, int y) {
        const std::lock_guard<Mutex> lock(mutex);
        const auto found = map.find(key(x, y));
        return found == map.end() ? 0 : found->second[2];
    }
    bool remove(int x, int y) {
        const std::lock_guard<Mutex> lock(mutex);
        return map.erase(key(x, y)) != 0;
    }
    double visit_all() {
        const std::lock_guard<Mutex> lock(mutex);
        double sum = 0;
        for (const auto& [k, r] : map) {
            sum += r[2];
        }
        return sum;
    }
    Mutex mutex;
    absl::flat_hash_map<std::uint64_t, Record> map;
};
#endif

#ifdef HAVE_OPENVDB
// The plane folded into the volume's 8 x 8 x 8 leaves, 32 x 16 cells per leaf, so that leaves are full.
template <class Mutex>
struct Volume {
    static constexpr const char* NAME = LOCKED<Mutex> ? "openvdb_locked" : "openvdb";
    using Tree = openvdb::tree::Tree4<openvdb::Vec4d, 5, 4, 3>::Type;
    static openvdb::Coord fold(int x, int y) {
        return {(x >> 5) * 8 + (x & 7), (y >> 4) * 8 + (y & 7), ((x >> 3) & 3) + 4 * ((y >> 3) & 1)};
    }
    void insert(int x, int y, const Record& r) {
        const std::lock_guard<Mutex> lock(mutex);
        accessor.setValue(fold(x, y), openvdb::Vec4d(r.data()));
    }
    double find(int x, int y) {
        const std::lock_guard<Mutex> lock(mutex);
        openvdb::Vec4d value;
        return accessor.probeValue(fold(x, y), value) ? value[2] : 0;
    }
    bool remove(int x, int y) {
        const std::lock_guard<Mutex> lock(mutex);
        accessor.setValueOff(fold(x, y));
        return true;
    }
    double visit_all() {
        const std::lock_guard<Mutex> lock(mutex);
        double sum = 0;
        for (auto value = tree.cbeginValueOn(); value; ++value) {
            sum += (*value)[2];
        }
        return sum;
    }
    double visit_window(int x0, int y0, int side) {
        const std::lock_guard<Mutex> lock(mutex);
        double sum = 0;
        for (int by = y0 >> 4; by <= (y0 + side - 1) >> 4; ++by) {
            for (int bx = x0 >> 5; bx <= (x0 + side - 1) >> 5; ++bx) {
                if (const auto* leaf = accessor.probeConstLeaf(openvdb::Coord(bx * 8, by * 8, 0))) {
                    for (auto value = leaf->cbeginValueOn(); value; ++value) {
                        sum += (*value)[2];
                    }
                }
            }
        }
        return sum;
    }
    Mutex mutex;
    Tree tree{openvdb::Vec4d(0, 0, 0, 0)};
    openvdb::tree::ValueAccessor<Tree> accessor{tree};
};
#endif

// The lower bound of visits: the same records in one array, read in the same order by a loop.
class PlainSquare {
public:
    static constexpr const char* NAME = "limit_reading_the_records";
    explicit PlainSquare(int side) : m_side(side) {
        for (int y = -side / 2; y < side - side / 2; ++y) {
            for (int x = -side / 2; x < side - side / 2; ++x) {
                m_records.push_back(record_of(x, y));
            }
        }
    }
    double visit_all() const { return visit_window(-m_side / 2, -m_side / 2, m_side); }
    // Whole blocks, within the square.
    double visit_window(int x0, int y0, int side) const {
        const int middle = m_side / 2;
        double sum = 0;
        for (int by = block_of(y0); by <= block_of(y0 + side - 1); ++by) {
            for (int bx = block_of(x0); bx <= block_of(x0 + side - 1); ++bx) {
                const int left = std::max(bx * BLOCK_SIDE + middle, 0);
                const int right = std::min((bx + 1) * BLOCK_SIDE + middle, m_side);
                const int bottom = std::min((by + 1) * BLOCK_SIDE + middle, m_side);
                for (int row = std::max(by * BLOCK_SIDE + middle, 0); row < bottom; ++row) {
                    for (int column = left; column < right; ++column) {
                        sum += m_records[static_cast<std::size_t>(row * m_side + column)][2];
                    }
                }
            }
        }
        return sum;
    }

private:
    static int block_of(int cell) {
        return cell >= 0 ? cell / BLOCK_SIDE : -((BLOCK_SIDE - 1 - cell) / BLOCK_SIDE);
    }

    int m_side;
    std::vector<Record> m_records;
};

}  // namespace bench

#endif
