#include "src/sparse/rtree.h"

#include <bit>
#include <limits>
#include <utility>

#include "src/sparse/rtree_volume.h"

namespace vex_util {

using namespace rtree;

namespace {

constexpr float INFINITE = std::numeric_limits<float>::infinity();

unsigned valid_bits(const Node& node) {
    return (1U << node.count) - 1;
}

// The entry whose volume grows least to include the rectangle; among equals the smallest, then the first.
int choose_subtree(const Node& node, const Rect4& rect) {
    Float4 volume[2], increase[2];
    for (int half = 0; half < 2; ++half) {
        const Rect4 entry = load_rects(node, 4 * half);
        volume[half] = spherical_volume(entry);
        increase[half] = spherical_volume(combine(rect, entry)) - volume[half];
        const Int4 index = Int4{0, 1, 2, 3} + 4 * half;
        increase[half] = index < node.count ? increase[half] : all4(INFINITE);
    }
    const Float4 least = least4(min4(increase[0], increase[1]));
    const Int4 tied[2] = {increase[0] == least, increase[1] == least};
    for (int half = 0; half < 2; ++half) {
        volume[half] = tied[half] ? volume[half] : all4(INFINITE);
    }
    const Float4 smallest = least4(min4(volume[0], volume[1]));
    return std::countr_zero(bits4(volume[0] == smallest) | bits4(volume[1] == smallest) << 4);
}

// The query, compared with four entries of a node at a time.
struct Query {
    Int4 minX, minY, maxX, maxY;

    unsigned meets(const Node& node) const { return bits4(meeting(node, 0)) | bits4(meeting(node, 4)) << 4; }

    // Complement of the entries whose corners both lie within the query's.
    unsigned sticks_out(const Node& node) const {
        return bits4(outside(node, 0)) | bits4(outside(node, 4)) << 4;
    }

private:
    Int4 meeting(const Node& node, int i) const {
        return ~((load4(node.minX + i) > maxX) | (minX > load4(node.maxX + i)) |
                 (load4(node.minY + i) > maxY) | (minY > load4(node.maxY + i)));
    }

    Int4 outside(const Node& node, int i) const {
        return (load4(node.minX + i) < minX) | (load4(node.maxX + i) > maxX) | (load4(node.minY + i) < minY) |
               (load4(node.maxY + i) > maxY);
    }
};

// Appends identifiers to a vector by way of a buffer, so that the vector grows once per buffer.
class ResultWriter {
public:
    explicit ResultWriter(std::vector<int>& results) : m_results(results) {}

    void add(const Node& leaf, unsigned entries) {
        ensure_space();
        // Branchless: every slot is written, only the matching ones are counted.
        for (int i = 0; i < MAX_ENTRIES; ++i) {
            m_buffer[m_count] = static_cast<int>(leaf.slot[i]);
            m_count += static_cast<int>(entries >> i & 1);
        }
    }

    void add_all(const Node& leaf) {
        ensure_space();
        std::memcpy(m_buffer + m_count, leaf.slot, sizeof leaf.slot);
        m_count += leaf.count;
    }

    void flush() {
        m_results.insert(m_results.end(), m_buffer, m_buffer + m_count);
        m_count = 0;
    }

private:
    static constexpr int SIZE = 512;

    void ensure_space() {
        if (m_count > SIZE - MAX_ENTRIES) {
            flush();
        }
    }

    std::vector<int>& m_results;
    int m_count = 0;
    int m_buffer[SIZE];
};

// A search level by level, in batches: the children of many nodes are prefetched before the first is visited,
// so that their cache misses overlap. All leaves have one level and batches keep their order, so leaves are
// visited depth first.
class BatchSearch {
public:
    // Nodes within the query are not tested again, unless the tree holds an inverted rectangle, about which
    // the cover says nothing.
    BatchSearch(const NodePool& nodes, bool inverted, const Query& query, std::vector<int>& results)
        : m_nodes(nodes), m_alwaysPartly(inverted ? ~0U : 0), m_query(query), m_writer(results) {}

    void run(NodeRef root) {
        const Visit start{&m_nodes[root], false};
        visit(&start, 1);
        m_writer.flush();
    }

private:
    struct Visit {
        const Node* node;
        bool within;
    };

    static constexpr int BATCH = 64;

    void visit(const Visit* batch, int size) {
        if (batch->node->level == 0) {
            visit_leaves(batch, size);
            return;
        }
        Visit next[BATCH];
        int count = 0;
        for (int k = 0; k < size; ++k) {
            const auto [node, within] = batch[k];
            unsigned chosen = valid_bits(*node);
            unsigned partly = 0;
            if (!within) {
                chosen &= m_query.meets(*node);
                partly = m_query.sticks_out(*node) | m_alwaysPartly;
            }
            for (; chosen; chosen &= chosen - 1) {
                const int i = std::countr_zero(chosen);
                const Node* child = &m_nodes[node->slot[i]];
                child->prefetch();
                next[count++] = {child, (partly >> i & 1) == 0};
            }
            if (count > BATCH - MAX_ENTRIES) {
                visit(next, count);
                count = 0;
            }
        }
        if (count > 0) {
            visit(next, count);
        }
    }

    void visit_leaves(const Visit* batch, int size) {
        for (int k = 0; k < size; ++k) {
            const Node& leaf = *batch[k].node;
            if (batch[k].within) {
                m_writer.add_all(leaf);
            } else {
                m_writer.add(leaf, valid_bits(leaf) & m_query.meets(leaf));
            }
        }
    }

    const NodePool& m_nodes;
    const unsigned m_alwaysPartly;
    const Query m_query;
    ResultWriter m_writer;
};

}  // namespace

slRTree::slRTree() {
    m_nodes.reserve(1);
    make_root();
}

slRTree::~slRTree() = default;

void slRTree::make_root() noexcept {
    m_root = m_nodes.take();
    m_nodes[m_root].clear(0);
    m_level = 0;
    m_inverted = false;
}

// Each insertion can split every node on its path and the root. Several can raise the tree in between, which
// the last one then needs nodes for.
void slRTree::Reserve(std::size_t inserts) {
    const auto path = static_cast<std::size_t>(m_level) + 2;
    m_nodes.reserve(inserts > 1 ? inserts * path + MAX_LEVEL : path);
}

void slRTree::Insert(const int min[2], const int max[2], const int& identifier) {
    Reserve(1);
    Entry entry{{min[0], min[1], max[0], max[1]}, static_cast<std::uint32_t>(identifier)};
    m_inverted |= min[0] > max[0] || min[1] > max[1];
    const Rect4 rect = all4(entry.rect);

    struct Step {
        Node* node;
        int child;
    };
    Step path[MAX_LEVEL];
    int depth = 0;
    Node* node = &m_nodes[m_root];
    while (node->level > 0) {
        const int i = choose_subtree(*node, rect);
        Node* child = &m_nodes[node->slot[i]];
        child->prefetch();
        // Enlarged on the way down; a split below sets the true cover on the way up.
        node->set_rect(i, combine(entry.rect, node->rect(i)));
        path[depth++] = {node, i};
        node = child;
    }

    while (node->count == MAX_ENTRIES) {
        const NodeRef siblingRef = m_nodes.take();
        Node& sibling = m_nodes[siblingRef];
        split(*node, entry, sibling);
        entry = {sibling.cover(), siblingRef};
        if (depth == 0) {
            const NodeRef newRoot = m_nodes.take();
            Node& root = m_nodes[newRoot];
            root.clear(++m_level);
            root.append({node->cover(), m_root});
            m_root = newRoot;
            node = &root;
            break;
        }
        const Step& parent = path[--depth];
        parent.node->set_rect(parent.child, node->cover());
        node = parent.node;
    }
    node->append(entry);
}

int slRTree::Search(const int min[2], const int max[2], std::vector<int>& results) const {
    results.clear();
    const Query query{all4(min[0]), all4(min[1]), all4(max[0]), all4(max[1])};
    BatchSearch(m_nodes, m_inverted, query, results).run(m_root);
    return static_cast<int>(results.size());
}

void slRTree::RemoveAll() noexcept {
    m_nodes.reset();
    make_root();
}

void slRTree::swap(slRTree& other) noexcept {
    m_nodes.swap(other.m_nodes);
    std::swap(m_root, other.m_root);
    std::swap(m_level, other.m_level);
    std::swap(m_inverted, other.m_inverted);
}

}  // namespace vex_util
