// Guttman's quadratic split of a full node.
#include <bit>
#include <limits>

#include "src/sparse/rtree_volume.h"

namespace vex_util::rtree {

namespace {

constexpr int TOTAL = MAX_ENTRIES + 1;
constexpr int FULL_GROUP = TOTAL - MIN_ENTRIES;
constexpr int PADDED = 12;           // whole vectors of four
constexpr int ROW_END = PADDED + 4;  // a row of pairs is read past the padding
constexpr float INFINITE = std::numeric_limits<float>::infinity();

// The nine entries by coordinate, rounded to float; the elements after them repeat the ninth.
struct Candidates {
    float minX[ROW_END], minY[ROW_END], maxX[ROW_END], maxY[ROW_END];
    float volume[ROW_END];  // infinite after the ninth, so that no pair includes the padding

    Rect4 rects(int first) const {
        return {load4(minX + first), load4(minY + first), load4(maxX + first), load4(maxY + first)};
    }

    Rect4 one(int i) const { return {all4(minX[i]), all4(minY[i]), all4(maxX[i]), all4(maxY[i])}; }
};

Candidates gather(const Node& node, const Entry& extra) {
    Candidates c;
    for (int i = 0; i < MAX_ENTRIES; i += 4) {
        const Rect4 r = load_rects(node, i);
        store4(c.minX + i, r.minX);
        store4(c.minY + i, r.minY);
        store4(c.maxX + i, r.maxX);
        store4(c.maxY + i, r.maxY);
        store4(c.volume + i, spherical_volume(r));
    }
    const Rect4 e = all4(extra.rect);
    for (int i = MAX_ENTRIES; i < ROW_END; i += 4) {
        store4(c.minX + i, e.minX);
        store4(c.minY + i, e.minY);
        store4(c.maxX + i, e.maxX);
        store4(c.maxY + i, e.maxY);
        store4(c.volume + i, all4(INFINITE));
    }
    c.volume[MAX_ENTRIES] = spherical_volume(e)[0];
    return c;
}

float total_cover_volume(const Candidates& c) {
    const Rect4 r = combine(combine(c.rects(0), c.rects(4)), c.rects(8));
    const Rect4 cover{least4(r.minX), least4(r.minY), greatest4(r.maxX), greatest4(r.maxY)};
    return spherical_volume(cover)[0];
}

struct Seeds {
    int first, second;
};

// The first pair with the largest waste. Where no pair's waste is above the start value (nine equal
// rectangles so large that the 1 is rounded away) entry 0 is both seeds.
Seeds pick_seeds(const Candidates& c) {
    Float4 worst = all4(-total_cover_volume(c) - 1.0F);
    Int4 worstPair = all4(0);
    for (int a = 0; a < TOTAL - 1; ++a) {
        const Rect4 rect = c.one(a);
        const Float4 volume = all4(c.volume[a]);
        for (int b = a + 1; b < TOTAL; b += 4) {
            const Float4 waste = spherical_volume(combine(rect, c.rects(b))) - volume - load4(c.volume + b);
            const Int4 pair = all4(a * 16 + b) + Int4{0, 1, 2, 3};
            const Int4 larger = waste > worst;
            worst = larger ? waste : worst;
            worstPair = larger ? pair : worstPair;
        }
    }
    // Each element holds its own first largest; among equal ones the first pair wins.
    const unsigned largest = bits4(worst == greatest4(worst));
    int pair = std::numeric_limits<int>::max();
    for (int lane = 0; lane < 4; ++lane) {
        if (largest >> lane & 1) {
            pair = std::min(pair, worstPair[lane]);
        }
    }
    return {pair / 16, pair % 16};
}

// One of the two groups: its cover, and by how much each candidate would enlarge it.
struct Group {
    int count = 0;
    Rect4 cover;
    Float4 growth[PADDED / 4];

    void add(const Candidates& c, int i) {
        cover = count == 0 ? c.one(i) : combine(c.one(i), cover);
        ++count;
        const Float4 volume = spherical_volume(cover);
        for (int v = 0; v < PADDED / 4; ++v) {
            growth[v] = spherical_volume(combine(c.rects(4 * v), cover)) - volume;
        }
    }
};

// The groups of the nine entries: bit i is set when entry i belongs to the second.
unsigned distribute(const Candidates& c) {
    const Seeds seeds = pick_seeds(c);
    Group groups[2];
    groups[0].add(c, seeds.first);
    groups[1].add(c, seeds.second);
    unsigned unassigned = ((1U << TOTAL) - 1) & ~(1U << seeds.first) & ~(1U << seeds.second);
    unsigned second = 1U << seeds.second;

    while (groups[0].count < FULL_GROUP && groups[1].count < FULL_GROUP) {
        Float4 difference[PADDED / 4];
        Float4 biggest = all4(-1.0F);
        unsigned prefersSecond = 0;
        for (int v = 0; v < PADDED / 4; ++v) {
            const Float4 d = groups[1].growth[v] - groups[0].growth[v];
            const Int4 bit = Int4{1, 2, 4, 8} << (4 * v);
            const Int4 open = (all4(static_cast<int>(unassigned)) & bit) != 0;
            prefersSecond |= bits4(d < 0.0F) << (4 * v);
            difference[v] = open ? max4(d, -d) : all4(-1.0F);
            biggest = max4(biggest, difference[v]);
        }
        biggest = greatest4(biggest);
        unsigned tied = 0;
        for (int v = 0; v < PADDED / 4; ++v) {
            tied |= bits4(difference[v] == biggest) << (4 * v);
        }
        tied &= unassigned;

        // The first of the tied that prefers the smaller group, or the first if none does.
        unsigned choice = tied;
        if (groups[0].count != groups[1].count) {
            const unsigned toSmaller =
                groups[0].count < groups[1].count ? tied & ~prefersSecond : tied & prefersSecond;
            choice = toSmaller ? toSmaller : tied;
        }
        const int i = std::countr_zero(choice);
        const unsigned bit = 1U << i;
        if (prefersSecond & bit) {
            second |= bit;
        }
        groups[prefersSecond & bit ? 1 : 0].add(c, i);
        unassigned &= ~bit;
    }
    return groups[0].count >= FULL_GROUP ? second | unassigned : second;
}

}  // namespace

void split(Node& node, const Entry& extra, Node& sibling) {
    const unsigned second = distribute(gather(node, extra));
    sibling.clear(node.level);
    // In place: an entry moves to a lower index of the node or stays.
    node.count = 0;
    for (int i = 0; i < MAX_ENTRIES; ++i) {
        Node& home = second >> i & 1 ? sibling : node;
        home.append({node.rect(i), node.slot[i]});
    }
    (second >> MAX_ENTRIES & 1 ? sibling : node).append(extra);
}

}  // namespace vex_util::rtree
