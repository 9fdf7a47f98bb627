// The R-tree as Guttman describes it, without SIMD and pools: the reference for slRTree.
#ifndef BASALT_TESTS_SPARSE_RTREE_MODEL_H
#define BASALT_TESTS_SPARSE_RTREE_MODEL_H

#include <algorithm>
#include <array>
#include <cmath>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "src/sparse/rtree.h"

namespace vex_util {

struct RTreeModel {
    using Rect = rtree::Rect;
    struct Node;
    struct Entry {
        Rect rect;
        int id;
        std::shared_ptr<Node> child;
    };
    struct Node {
        int level = 0;
        std::vector<Entry> entries;
    };

    void insert(const Rect& rect, int id) {
        if (const auto sibling = insert(*root, {rect, id, nullptr})) {
            const std::vector<Entry> halves = {{cover(*root), 0, root}, {cover(*sibling), 0, sibling}};
            root = std::make_shared<Node>(Node{root->level + 1, halves});
        }
    }

    std::vector<int> search(const Rect& query) const {
        std::vector<int> results;
        search(*root, query, results);
        return results;
    }

    // Levels, rectangles and identifiers, depth first.
    static std::string dump(const Node& node) {
        std::string text = 'L' + std::to_string(node.level) + '{';
        for (const Entry& e : node.entries) {
            for (const int n : {e.rect.minX, e.rect.minY, e.rect.maxX, e.rect.maxY}) {
                text += std::to_string(n) + ' ';
            }
            text += e.child ? dump(*e.child) : '#' + std::to_string(e.id) + ' ';
        }
        return text + '}';
    }

    std::shared_ptr<Node> root = std::make_shared<Node>();

private:
    static Rect combine(const Rect& a, const Rect& b) {
        return {std::min(a.minX, b.minX), std::min(a.minY, b.minY), std::max(a.maxX, b.maxX),
                std::max(a.maxY, b.maxY)};
    }

    static float volume(const Rect& r) {
        const float h0 = (static_cast<float>(r.maxX) - static_cast<float>(r.minX)) * 0.5F;
        const float h1 = (static_cast<float>(r.maxY) - static_cast<float>(r.minY)) * 0.5F;
        const float radius = std::sqrt((0.0F + h0 * h0) + h1 * h1);
        return (radius * radius) * 3.141593F;
    }

    static Rect cover(const Node& node) {
        Rect r = node.entries[0].rect;
        for (const Entry& e : node.entries) {
            r = combine(r, e.rect);
        }
        return r;
    }

    // The first of those that grow least, of them the smallest.
    static Entry& choose(Node& node, const Rect& rect) {
        return *std::ranges::min_element(node.entries, {}, [&](const Entry& e) {
            const float own = volume(e.rect);
            return std::pair(volume(combine(rect, e.rect)) - own, own);
        });
    }

    // The new sibling if the node was split.
    static std::shared_ptr<Node> insert(Node& node, const Entry& entry) {
        if (node.level == 0) {
            return add(node, entry);
        }
        Entry& branch = choose(node, entry.rect);
        const auto sibling = insert(*branch.child, entry);
        if (!sibling) {
            branch.rect = combine(entry.rect, branch.rect);
            return nullptr;
        }
        branch.rect = cover(*branch.child);
        return add(node, {cover(*sibling), 0, sibling});
    }

    static std::shared_ptr<Node> add(Node& node, const Entry& entry) {
        node.entries.push_back(entry);
        return node.entries.size() <= 8 ? nullptr : split(node);
    }

    static std::shared_ptr<Node> split(Node& node) {
        const std::vector<Entry> e = std::exchange(node.entries, {});
        std::array<int, 9> group;
        group.fill(-1);
        std::array<int, 2> count{};
        std::array<Rect, 2> covers{};
        std::array<float, 2> volumes{};
        const auto assign = [&](std::size_t i, std::size_t g) {
            group[i] = static_cast<int>(g);
            covers[g] = count[g]++ == 0 ? e[i].rect : combine(e[i].rect, covers[g]);
            volumes[g] = volume(covers[g]);
        };
        float worst = -volume(cover({0, e})) - 1;
        std::pair<std::size_t, std::size_t> seeds;
        for (std::size_t a = 0; a < 8; ++a) {
            for (std::size_t b = a + 1; b < 9; ++b) {
                const float waste =
                    volume(combine(e[a].rect, e[b].rect)) - volume(e[a].rect) - volume(e[b].rect);
                if (waste > worst) {
                    worst = waste;
                    seeds = {a, b};
                }
            }
        }
        assign(seeds.first, 0);
        assign(seeds.second, 1);
        while (count[0] + count[1] < 9 && count[0] < 5 && count[1] < 5) {
            float biggest = -1;
            std::size_t chosen = 0, into = 0;
            for (std::size_t i = 0; i < 9; ++i) {
                if (group[i] >= 0) {
                    continue;
                }
                const float difference = (volume(combine(e[i].rect, covers[1])) - volumes[1]) -
                                         (volume(combine(e[i].rect, covers[0])) - volumes[0]);
                const std::size_t g = difference >= 0 ? 0 : 1;
                const float size = g == 0 ? difference : -difference;
                if (size > biggest || (size == biggest && count[g] < count[into])) {
                    biggest = size;
                    chosen = i;
                    into = g;
                }
            }
            assign(chosen, into);
        }
        const int rest = count[0] >= 5 ? 1 : 0;
        const auto sibling = std::make_shared<Node>(Node{node.level, {}});
        for (std::size_t i = 0; i < 9; ++i) {
            ((group[i] >= 0 ? group[i] : rest) == 0 ? node : *sibling).entries.push_back(e[i]);
        }
        return sibling;
    }

    static void search(const Node& node, const Rect& query, std::vector<int>& results) {
        for (const Entry& e : node.entries) {
            const bool apart = e.rect.minX > query.maxX || query.minX > e.rect.maxX ||
                               e.rect.minY > query.maxY || query.minY > e.rect.maxY;
            if (!apart && e.child) {
                search(*e.child, query, results);
            } else if (!apart) {
                results.push_back(e.id);
            }
        }
    }
};

// Looks into a tree.
struct RTreeInspector {
    // In the form of RTreeModel::dump.
    static std::string dump(const slRTree& tree) { return RTreeModel::dump(*model_of(tree, tree.m_root)); }

    // Uses up reserved nodes until a split of the root needs one more.
    static void leave_too_few(slRTree& tree) {
        while (tree.m_nodes[tree.m_root].count == rtree::MAX_ENTRIES &&
               tree.m_nodes.spare() > static_cast<std::size_t>(tree.m_level) + 1) {
            tree.m_nodes.take();
        }
    }

private:
    static std::shared_ptr<RTreeModel::Node> model_of(const slRTree& tree, rtree::NodeRef ref) {
        const rtree::Node& node = tree.m_nodes[ref];
        auto model = std::make_shared<RTreeModel::Node>(RTreeModel::Node{node.level, {}});
        for (int i = 0; i < node.count; ++i) {
            const auto child = node.level > 0 ? model_of(tree, node.slot[i]) : nullptr;
            model->entries.push_back({node.rect(i), static_cast<int>(node.slot[i]), child});
        }
        return model;
    }
};

}  // namespace vex_util

#endif
