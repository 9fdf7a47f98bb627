// Sparse arrays: threads on several of them, visits whose callbacks change them, arrays assigned to each
// other crosswise, and one thread that looks whether everything still hangs together.
#include <cstdint>
#include <cstring>
#include <memory>
#include <vector>

#include "basalt/sparse.h"
#include "tests/sparse/array_inspection.h"
#include "tests/stress/stress.h"

namespace basalt::stress {

namespace {

using vex_util::Sparse2DArray;

constexpr int WRITERS = 6;
constexpr int SIDE = 80;  // cells

// Whichever thread wrote it, a cell holds what follows from its place; half an element is one that does not.
struct Element {
    std::int32_t x, y;
    std::uint64_t check;
};

Element element_at(int x, int y) {
    return {x, y,
            (static_cast<std::uint64_t>(static_cast<std::uint32_t>(x)) << 32) ^
                static_cast<std::uint64_t>(static_cast<std::uint32_t>(y)) * 0x9E3779B97F4A7C15U};
}

void require_whole(int x, int y, const void* bytes) {
    Element element;
    std::memcpy(&element, bytes, sizeof element);
    const Element expected = element_at(x, y);
    require(element.x == expected.x && element.y == expected.y && element.check == expected.check,
            "a cell holds its own element");
}

void insert(Sparse2DArray& array, int x, int y) {
    const Element element = element_at(x, y);
    array.Insert(x, y, &element);
}

struct Visit {
    Sparse2DArray& array;
    Random& random;
    int left;  // changes that the callback may still make
};

bool check_and_change(int x, int y, const void* element, const void* context) {
    const Visit& visit = *static_cast<const Visit*>(context);
    require_whole(x, y, element);
    int& left = const_cast<Visit&>(visit).left;
    if (left > 0 && draw(visit.random, 4) == 0) {
        --left;
        insert(visit.array, draw(visit.random, SIDE), draw(visit.random, SIDE));
        visit.array.Remove(draw(visit.random, SIDE), draw(visit.random, SIDE));
    }
    return draw(visit.random, 500) != 0;
}

// The lock is held while a callback runs, so nobody changes what is being looked at.
bool check_whole(int, int, const void*, const void* context) {
    vex_util::testing::check_invariants(*static_cast<Sparse2DArray*>(const_cast<void*>(context)));
    return false;
}

void change(Sparse2DArray& array, Sparse2DArray& other, Random& random) {
    const int x = draw(random, SIDE);
    const int y = draw(random, SIDE);
    const int choice = draw(random, 100);
    const Visit visit{array, random, 10};
    if (choice < 50) {
        insert(array, x, y);
    } else if (choice < 75) {
        array.Remove(x, y);
    } else if (choice < 80) {
        static_cast<void>(array.Find(x, y));  // what it points to may be gone by now
    } else if (choice < 88) {
        const int min[2] = {x - 8, y - 8};
        const int max[2] = {x + 8, y + 8};
        array.Select(min, max);
    } else if (choice < 94) {
        array.IterateSelected(check_and_change, &visit);
    } else if (choice < 96) {
        array.IterateAll(check_and_change, &visit);
    } else if (choice < 98) {
        array.SetSelectionDirty(!array.IsSelectionDirty());
    } else if (choice < 99) {
        array = other;
    } else if (draw(random, 8) == 0) {
        array.RemoveAll();
    }
}

}  // namespace

long stress_sparse(double seconds) {
    std::vector<std::unique_ptr<Sparse2DArray>> arrays;
    for (const int side : {1, 4, 16}) {
        arrays.push_back(std::make_unique<Sparse2DArray>(sizeof(Element), side, 7));
    }
    Sparse2DArray still(sizeof(Element), 8, 16);  // read and copied by all
    for (int i = 0; i < 200; ++i) {
        insert(still, i % SIDE, i / 3);
    }
    const long rounds = run_threads(WRITERS + 1, seconds, [&](int thread, Random& random) {
        Sparse2DArray& array = *arrays[static_cast<std::size_t>(draw(random, 3))];
        if (thread == WRITERS) {
            array.IterateAll(check_whole, &array);
            Sparse2DArray copy(still);
            require(copy.Find(7, 2) != nullptr, "a copy holds what the source does");
            return;
        }
        for (int i = 0; i < 50; ++i) {
            change(array, *arrays[static_cast<std::size_t>(draw(random, 3))], random);
        }
    });
    for (const auto& array : arrays) {
        vex_util::testing::check_invariants(*array);
    }
    return rounds;
}

}  // namespace basalt::stress
