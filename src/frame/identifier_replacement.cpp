#include <algorithm>
#include <array>
#include <cstddef>
#include <span>

#include "basalt/frame.h"

namespace {

struct Replacement {
    unsigned int from;
    unsigned int to;
};

constexpr std::size_t CAPACITY = 1000;
using Table = std::array<Replacement, CAPACITY>;

// A plain pointer: unloading does not release the table, only _REPLACE_CLEANUP() does.
constinit Table* table = nullptr;
constinit std::size_t count = 0;
constinit bool enabled = false;

}  // namespace

void _REPLACE_LOAD(unsigned int from, unsigned int to) {
    if (table == nullptr) {
        table = new Table;
    }
    if (count < CAPACITY) {
        (*table)[count++] = {from, to};
    }
}

unsigned int _REPLACE(unsigned int id) {
    if (!enabled || count == 0) {
        return id;
    }
    const std::span<const Replacement> pairs(table->data(), count);
    const auto found =
        std::find_if(pairs.begin(), pairs.end(), [id](const Replacement& pair) { return pair.from == id; });
    return found != pairs.end() ? found->to : id;
}

void _REPLACE_FLAG(bool on) {
    enabled = on;
}

void _REPLACE_CLEANUP() {
    delete table;
    table = nullptr;
    count = 0;
}
