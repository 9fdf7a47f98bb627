// The sparse array against its model: sequences of calls on three arrays, callbacks that change the array
// they visit among them.
#include <algorithm>
#include <cstdint>
#include <cstring>
#include <memory>
#include <optional>
#include <vector>

#include "basalt/sparse.h"
#include "fuzz/input.h"
#include "tests/sparse/array_inspection.h"
#include "tests/sparse/sparse_array_model.h"

namespace {

using basalt::fuzz::Input;
using basalt::fuzz::require;
using vex_util::Sparse2DArray;
using vex_util::testing::SparseArrayModel;
using Value = SparseArrayModel::Value;

constexpr std::size_t ARRAYS = 3;

// An array, its model, and a visit under way.
struct Pair {
    Sparse2DArray array;
    SparseArrayModel model;
    std::size_t element_size;

    Pair(std::size_t size, std::uint32_t side, std::size_t chunk)
        : array(size, side, chunk), model(side), element_size(std::max<std::size_t>(size, 8)) {}
    Pair(const Pair&) = default;
    Pair& operator=(const Pair&) = delete;
};

// Every byte of an element follows from its value, so that one moved or cut shows.
std::vector<unsigned char> bytes_of(Value value, std::size_t size) {
    std::vector<unsigned char> bytes(size);
    std::memcpy(bytes.data(), &value, sizeof value);
    for (std::size_t i = sizeof value; i < size; ++i) {
        bytes[i] = static_cast<unsigned char>(value * 31 + i);
    }
    return bytes;
}

class World {
public:
    explicit World(Input& input) : m_input(input) {
        for (std::unique_ptr<Pair>& pair : m_pairs) {
            pair = std::make_unique<Pair>(input.byte() % 80, 1 + input.byte() % 33, input.byte() % 6);
        }
    }

    void step() {
        Pair& pair = *m_pairs[m_input.byte() % ARRAYS];
        switch (m_input.byte() % 12) {
            case 0:
                visit(pair, true);
                break;
            case 1:
                visit(pair, false);
                break;
            case 2:
                copy(pair);
                break;
            case 3: {
                const bool dirty = m_input.byte() % 2 != 0;
                pair.array.SetSelectionDirty(dirty);
                pair.model.dirty = dirty;
                break;
            }
            default:
                change(pair);
                break;
        }
        check_flags();
    }

    void check_flags() const {
        for (const std::unique_ptr<Pair>& pair : m_pairs) {
            require(pair->array.IsSelectionDirty() == pair->model.dirty);
        }
    }

    void check() const {
        for (const std::unique_ptr<Pair>& pair : m_pairs) {
            vex_util::testing::check_invariants(pair->array);
        }
    }

private:
    // What a callback may do as well.
    void change(Pair& pair) {
        const int x = m_input.coordinate();
        const int y = m_input.coordinate();
        switch (m_input.byte() % 16) {
            case 0:
                pair.array.RemoveAll();
                pair.model.clear();
                break;
            case 1:
                assign(pair, *m_pairs[m_input.byte() % ARRAYS]);
                break;
            case 2:
            case 3:
            case 4: {
                const int min[2] = {x, y};
                const int max[2] = {m_input.coordinate(), m_input.coordinate()};
                require(pair.array.Select(min, max) == pair.model.select(min, max));
                break;
            }
            case 5:
            case 6:
            case 7:
                require(pair.array.Remove(x, y) == pair.model.remove(x, y));
                break;
            case 8:
            case 9:
                check_element(pair, pair.array.Find(x, y), pair.model.find(x, y));
                break;
            default: {
                ++m_value;
                require(pair.array.Insert(x, y, bytes_of(m_value, pair.element_size).data()));
                pair.model.insert(x, y, m_value);
                check_element(pair, pair.array.Find(x, y), m_value);
                break;
            }
        }
    }

    void assign(Pair& to, Pair& from) {
        to.array = from.array;
        to.model.assign(from.model);
        to.element_size = from.element_size;
    }

    void copy(const Pair& source) {
        std::unique_ptr<Pair>& place = m_pairs[m_input.byte() % ARRAYS];
        auto made = std::make_unique<Pair>(source);
        place = std::move(made);
    }

    static void check_element(const Pair& pair, const void* element, std::optional<Value> expected) {
        require((element != nullptr) == expected.has_value());
        if (expected) {
            const std::vector<unsigned char> bytes = bytes_of(*expected, pair.element_size);
            require(std::memcmp(element, bytes.data(), bytes.size()) == 0);
        }
    }

    struct Visit {
        World& world;
        Pair& pair;
        bool selected;
        int generation;
        std::size_t position = 0;  // in the selection or the list of blocks
        std::optional<SparseArrayModel::Cell> cell = {};
        bool ended = false;
        std::size_t open_block = 0;  // stays when the callback selects anew

        // The cell that the model comes to next.
        std::optional<std::pair<SparseArrayModel::Cell, Value>> next() {
            const SparseArrayModel& model = pair.model;
            for (;; ++position, cell.reset()) {
                if (!cell) {
                    if (position >= (selected ? model.selection.size() : model.blocks())) {
                        return {};
                    }
                    open_block = selected ? static_cast<std::size_t>(model.selection[position]) : position;
                }
                if (const auto found = model.next_in_block(open_block, cell)) {
                    cell = found->first;
                    return found;
                }
            }
        }
    };

    void visit(Pair& pair, bool selected) {
        Visit visit{*this, pair, selected, pair.model.generation};
        if (m_depth == 2) {
            return;
        }
        ++m_depth;
        selected ? pair.array.IterateSelected(on_visit, &visit) : pair.array.IterateAll(on_visit, &visit);
        --m_depth;
        require(visit.ended || pair.model.generation != visit.generation || !visit.next());
    }

    static bool on_visit(int x, int y, const void* element, const void* context) {
        Visit& visit = *static_cast<Visit*>(const_cast<void*>(context));
        World& world = visit.world;
        require(!visit.ended && visit.pair.model.generation == visit.generation);
        const auto expected = visit.next();
        require(expected && expected->first.x == x && expected->first.y == y);
        check_element(visit.pair, element, expected->second);
        switch (world.m_input.byte() % 8) {
            case 0:
                visit.ended = world.m_input.byte() % 4 == 0;
                break;
            case 1:
                world.visit(visit.pair, world.m_input.byte() % 2 != 0);
                break;
            case 2:
            case 3:
                world.change(visit.pair);
                break;
            default:
                break;
        }
        return !visit.ended;
    }

    Input& m_input;
    std::unique_ptr<Pair> m_pairs[ARRAYS];
    Value m_value = 0;
    int m_depth = 0;
};

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    Input input(data, size);
    World world(input);
    for (int steps = 0; !input.is_over() && steps < 300; ++steps) {
        world.step();
    }
    world.check();
    return 0;
}
