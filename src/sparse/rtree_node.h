// Rectangles and nodes of the R-tree.
#ifndef BASALT_SRC_SPARSE_RTREE_NODE_H
#define BASALT_SRC_SPARSE_RTREE_NODE_H

#include <algorithm>
#include <cstdint>

namespace vex_util::rtree {

inline constexpr int MAX_ENTRIES = 8;
inline constexpr int MIN_ENTRIES = 4;

// Nodes below the root hold MIN_ENTRIES or more: 32-bit references are used up below this level.
inline constexpr int MAX_LEVEL = 17;

// Both corners are inclusive; a min above a max is kept as given.
struct Rect {
    int minX, minY, maxX, maxY;
};

inline Rect combine(const Rect& a, const Rect& b) {
    return {std::min(a.minX, b.minX), std::min(a.minY, b.minY), std::max(a.maxX, b.maxX),
            std::max(a.maxY, b.maxY)};
}

// Index of a node in its pool, valid in copies of the pool too.
using NodeRef = std::uint32_t;

// A rectangle with an identifier (in a leaf) or with the child it covers (above).
struct Entry {
    Rect rect;
    std::uint32_t slot;
};

// By coordinate, so that one SIMD comparison tests four entries; three cache lines.
struct alignas(64) Node {
    int minX[MAX_ENTRIES], minY[MAX_ENTRIES], maxX[MAX_ENTRIES], maxY[MAX_ENTRIES];
    std::uint32_t slot[MAX_ENTRIES];
    int count;
    int level;

    void clear(int newLevel) {
        count = 0;
        level = newLevel;
    }

    Rect rect(int i) const { return {minX[i], minY[i], maxX[i], maxY[i]}; }

    void set_rect(int i, const Rect& r) {
        minX[i] = r.minX;
        minY[i] = r.minY;
        maxX[i] = r.maxX;
        maxY[i] = r.maxY;
    }

    // Requires count < MAX_ENTRIES.
    void append(const Entry& entry) {
        set_rect(count, entry.rect);
        slot[count] = entry.slot;
        ++count;
    }

    // Requires count > 0.
    Rect cover() const {
        Rect r = rect(0);
        for (int i = 1; i < count; ++i) {
            r = combine(r, rect(i));
        }
        return r;
    }

    // All three cache lines, whose misses then overlap.
    void prefetch() const {
        __builtin_prefetch(minX);
        __builtin_prefetch(maxX);
        __builtin_prefetch(slot);
    }
};

static_assert(sizeof(Node) == 192);

// Distributes the entries of the full `node` and `extra` over `node` and `sibling`, four or five each; the
// sibling gets the node's level. Source: Guttman, 1984, "R-trees", section 3.5.2.
void split(Node& node, const Entry& extra, Node& sibling);

}  // namespace vex_util::rtree

#endif
