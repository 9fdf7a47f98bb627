// The sparse array against its model: calls on three arrays, single cells and rows mixed, and callbacks that
// change the array they visit.
#include <algorithm>
#include <bit>
#include <cstdint>
#include <cstring>
#include <memory>
#include <vector>

#include "basalt/sparse_cells.h"
#include "fuzz/input.h"
#include "tests/sparse/sparse_array_model.h"
#include "tests/support/sparse_inspector.h"

namespace {

using basalt::SparseCells;
using basalt::fuzz::Input;
using basalt::fuzz::require;
using vex_util::Sparse2DArray;
using vex_util::testing::SparseArrayModel;

constexpr std::size_t ARRAYS = 3;
constexpr int ROW = 200;

// An array and its model.
struct Pair {
    Sparse2DArray array;
    SparseArrayModel model;
    std::size_t size;  // of an element

    Pair(std::size_t requested, std::uint32_t side, std::size_t chunk)
        : array(requested, side, chunk), model(side, chunk), size(std::max<std::size_t>(requested, 8)) {}
    Pair(const Pair&) = default;
    Pair& operator=(Pair& source) {
        array = source.array;
        model = source.model;
        size = source.size;
        return *this;
    }

    // The elements of values that count up; every byte follows from the value.
    std::vector<unsigned char> elements(std::uint64_t value, std::size_t count = 1) const {
        std::vector<unsigned char> bytes(count * size);
        for (std::size_t i = 0; i < bytes.size(); ++i) {
            bytes[i] = static_cast<unsigned char>(((value + i / size) * 31 >> (i % size % 3 * 8)) + i % size);
        }
        return bytes;
    }

    void check_cell(int x, int y, const void* element) {
        const auto expected = model.cells.find(model.cell_at(x, y, false));
        require((element != nullptr) == (expected != model.cells.end()));
        if (element != nullptr) {
            require(std::memcmp(element, elements(expected->second.value).data(), size) == 0);
            require(vex_util::testing::slot_of(array, element) == expected->second.slot);
        }
    }
};

class World {
public:
    explicit World(Input& input) : m_input(input) {
        for (std::unique_ptr<Pair>& pair : m_pairs) {
            const std::uint32_t side = 1 + input.byte() % 40;
            pair = std::make_unique<Pair>(input.byte() % 80, side == 40 ? 128 : side, input.byte() % 200);
        }
    }

    void step() {
        Pair& pair = *m_pairs[m_input.byte() % ARRAYS];
        const unsigned choice = m_input.byte() % 12;
        if (choice < 4) {
            visit(pair, choice);
        } else if (choice == 4) {
            auto copy = std::make_unique<Pair>(pair);
            m_pairs[m_input.byte() % ARRAYS] = std::move(copy);
        } else {
            change(pair);
        }
        check(false);
    }

    void check(bool invariants) const {
        for (const std::unique_ptr<Pair>& pair : m_pairs) {
            require(pair->array.IsSelectionDirty() == pair->model.dirty);
            require(SparseCells::size(pair->array) == pair->model.cells.size());
            if (invariants) {
                vex_util::testing::check_invariants(pair->array);
            }
        }
    }

private:
    // Callbacks do the same.
    void change(Pair& pair) {
        auto& [array, model, size] = pair;
        const int x = m_input.coordinate(), y = m_input.coordinate();
        const unsigned choice = m_input.byte() % 16;
        if (choice == 0) {
            array.RemoveAll();
            model.clear();
        } else if (choice == 1) {
            pair = *m_pairs[m_input.byte() % ARRAYS];
        } else if (choice == 2) {
            model.dirty = m_input.byte() % 2 != 0;
            array.SetSelectionDirty(model.dirty);
        } else if (choice == 3) {
            const int min[2] = {x, y}, max[2] = {m_input.coordinate(), m_input.coordinate()};
            model.selection = model.blocks_in({x, y, max[0], max[1]});
            model.dirty = false;
            require(array.Select(min, max) == !model.selection.empty());
        } else if (choice < 6) {
            require(array.Remove(x, y) == model.remove(x, y));
        } else if (choice < 9) {
            change_row(pair, std::clamp(x, INT32_MIN + 10, INT32_MAX - ROW), y, m_input.byte() % ROW);
        } else if (choice == 9) {
            find_cells(pair, y);
        } else {
            auto bytes = pair.elements(++m_value);
            choice == 10 ? SparseCells::update(array, x, y, overwrite, &bytes)
                         : require(array.Insert(x, y, bytes.data()));
            model.insert(x, y, m_value);
        }
        pair.check_cell(x, y, array.Find(x, y));
    }

    static const void* overwrite(void* element, void* context) {
        const auto& bytes = *static_cast<std::vector<unsigned char>*>(context);
        return element == nullptr ? bytes.data()
                                  : (std::memcpy(element, bytes.data(), bytes.size()), nullptr);
    }

    void change_row(Pair& pair, int x, int y, int count) {
        auto& [array, model, size] = pair;
        const auto cells = static_cast<std::size_t>(count);
        if (m_input.byte() % 2 != 0) {
            m_value += ROW;
            SparseCells::insert_row(array, x, y, pair.elements(m_value, cells).data(), size, cells);
            model.insert_row(x, y, m_value, count);
        } else {
            std::size_t removed = 0;
            for (int i = 0; i < count; ++i) {
                removed += model.remove(x + i, y) ? 1 : 0;
            }
            require(SparseCells::remove_row(array, x, y, cells) == removed);
        }
        void* found[ROW];
        bool filled[ROW];
        std::vector<unsigned char> copies(ROW * size);
        const std::size_t number = SparseCells::find_row(array, x - 10, y, found, ROW);
        require(SparseCells::copy_row(array, x - 10, y, copies.data(), size, filled, ROW) == number);
        require(ROW - std::count(found, found + ROW, nullptr) == static_cast<std::ptrdiff_t>(number));
        for (std::size_t i = 0; i < ROW; ++i) {
            pair.check_cell(x - 10 + static_cast<int>(i), y, found[i]);
            require(filled[i] == (found[i] != nullptr));
            require(!filled[i] || std::memcmp(found[i], copies.data() + i * size, size) == 0);
        }
    }

    void find_cells(Pair& pair, int y) {
        basalt::GridCell cells[80];
        void* elements[80];
        std::generate(cells, cells + 80, [&] { return basalt::GridCell{m_input.coordinate(), y}; });
        const std::size_t found = SparseCells::find(pair.array, cells, elements, 80);
        require(80 - std::count(elements, elements + 80, nullptr) == static_cast<std::ptrdiff_t>(found));
        for (int i = 0; i < 80; ++i) {
            pair.check_cell(cells[i].x, y, elements[i]);
        }
    }

    // Steps through the cells as the model holds them, since callbacks change it.
    struct Visit {
        World& world;
        Pair& pair;
        const std::vector<int>* list;  // of blocks; null for all
        basalt::GridWindow window = {INT32_MIN, INT32_MIN, INT32_MAX, INT32_MAX};
        int generation = pair.model.generation;
        std::size_t position = 0;
        int block = -1;
        SparseArrayModel::Cell cell = {};
        bool ended = false;

        bool next() {
            const auto& blocks = pair.model.blocks;
            const auto& cells = pair.model.cells;
            for (;; ++position, block = -1) {
                auto found = cells.upper_bound(cell);
                if (block < 0) {
                    if (position >= (list == nullptr ? blocks.size() : list->size())) {
                        return false;
                    }
                    block = list == nullptr ? static_cast<int>(position) : (*list)[position];
                    found = cells.lower_bound({block, INT32_MIN, INT32_MIN});
                }
                for (; found != cells.end() && found->first.block == block; ++found) {
                    cell = found->first;
                    if (cell.x >= window.min_x && cell.x <= window.max_x && cell.y >= window.min_y &&
                        cell.y <= window.max_y) {
                        return true;
                    }
                }
            }
        }
    };

    void visit(Pair& pair, unsigned kind) {
        if (m_depth == 2) {
            return;
        }
        ++m_depth;
        Visit visit{*this, pair, kind == 1 ? &pair.model.selection : nullptr};
        std::vector<int> blocks;
        if (kind == 0) {
            pair.array.IterateAll(on_visit, &visit);
        } else if (kind == 1) {
            pair.array.IterateSelected(on_visit, &visit);
        } else if (kind == 2) {
            SparseCells::visit(pair.array, nullptr, on_row, &visit);
        } else {
            auto& [min_x, min_y, max_x, max_y] = visit.window;
            for (int* const bound : {&min_x, &min_y, &max_x, &max_y}) {
                *bound = m_input.coordinate();
            }
            blocks = pair.model.blocks_in({min_x, min_y, max_x, max_y});
            visit.list = &blocks;
            SparseCells::visit(pair.array, &visit.window, on_row, &visit);
        }
        --m_depth;
        require(visit.ended || pair.model.generation != visit.generation || !visit.next());
    }

    static bool on_row(const SparseCells::Row& row, void* context) {
        const std::uint64_t generation = *row.generation;
        for (std::uint64_t left = row.wanted; *row.generation == generation && (*row.filled & left) != 0;) {
            const int i = std::countr_zero(*row.filled & left);
            left &= ~std::uint64_t{1} << i;
            const auto x = static_cast<unsigned>(row.x) + static_cast<unsigned>(i);
            if (!on_visit(static_cast<int>(x), row.y, row.elements[i], context)) {
                return false;
            }
        }
        return true;
    }

    static bool on_visit(int x, int y, const void* element, const void* context) {
        Visit& visit = *static_cast<Visit*>(const_cast<void*>(context));
        World& world = visit.world;
        require(!visit.ended && visit.pair.model.generation == visit.generation);
        require(visit.next() && visit.cell.x == x && visit.cell.y == y);
        visit.pair.check_cell(x, y, element);
        const unsigned choice = world.m_input.byte() % 8;
        if (choice == 0) {
            visit.ended = world.m_input.byte() % 4 == 0;
        } else if (choice == 1) {
            world.visit(visit.pair, world.m_input.byte() % 4);
        } else if (choice < 4) {
            world.change(visit.pair);
        }
        return !visit.ended;
    }

    Input& m_input;
    std::unique_ptr<Pair> m_pairs[ARRAYS];
    std::uint64_t m_value = 0;
    int m_depth = 0;
};

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    Input input(data, size);
    World world(input);
    for (int steps = 0; !input.is_over() && steps < 300; ++steps) {
        world.step();
    }
    world.check(true);
    return 0;
}
