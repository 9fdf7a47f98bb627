// The R-tree written down plainly, one number at a time: what slRTree is held against.
#ifndef BASALT_TESTS_SPARSE_RTREE_MODEL_H
#define BASALT_TESTS_SPARSE_RTREE_MODEL_H

#include <algorithm>
#include <array>
#include <cmath>
#include <memory>
#include <string>
#include <vector>

#include "src/sparse/rtree_node.h"

namespace vex_util {

class RTreeModel {
public:
    using Rect = rtree::Rect;

    RTreeModel() { RemoveAll(); }

    void Insert(const int min[2], const int max[2], int id) {
        Entry entry{{min[0], min[1], max[0], max[1]}, nullptr, id};
        std::unique_ptr<Node> sibling = insert(*m_root, entry);
        if (!sibling)
            return;
        auto root = std::make_unique<Node>();
        root->level = m_root->level + 1;
        const Rect left = cover(*m_root);
        const Rect right = cover(*sibling);
        root->entries.push_back({left, std::move(m_root), 0});
        root->entries.push_back({right, std::move(sibling), 0});
        m_root = std::move(root);
    }

    int Search(const int min[2], const int max[2], std::vector<int>& results) const {
        results.clear();
        search(*m_root, {min[0], min[1], max[0], max[1]}, results);
        return static_cast<int>(results.size());
    }

    void RemoveAll() {
        m_root = std::make_unique<Node>();
        m_root->level = 0;
    }

    // Every node depth first: its level and its entries.
    std::string dump() const {
        std::string text;
        dump(*m_root, text);
        return text;
    }

private:
    struct Node;
    struct Entry {
        Rect rect;
        std::unique_ptr<Node> child;
        int id;
    };
    struct Node {
        int level = -1;
        std::vector<Entry> entries;
    };

    static Rect combine(const Rect& a, const Rect& b) {
        return {std::min(a.minX, b.minX), std::min(a.minY, b.minY), std::max(a.maxX, b.maxX),
                std::max(a.maxY, b.maxY)};
    }

    static float volume(const Rect& r) {
        const float h0 = (float(r.maxX) - float(r.minX)) * 0.5f;
        const float h1 = (float(r.maxY) - float(r.minY)) * 0.5f;
        const float s = (0.0f + h0 * h0) + h1 * h1;
        const float radius = std::sqrt(s);
        return (radius * radius) * 3.141593f;
    }

    static bool overlap(const Rect& a, const Rect& b) {
        return !(a.minX > b.maxX || b.minX > a.maxX || a.minY > b.maxY || b.minY > a.maxY);
    }

    static Rect cover(const Node& node) {
        Rect r = node.entries[0].rect;
        for (const Entry& e : node.entries)
            r = combine(r, e.rect);
        return r;
    }

    static std::size_t choose(const Node& node, const Rect& rect) {
        std::size_t best = 0;
        float bestIncrease = 0, bestVolume = 0;
        for (std::size_t i = 0; i < node.entries.size(); ++i) {
            const float v = volume(node.entries[i].rect);
            const float increase = volume(combine(rect, node.entries[i].rect)) - v;
            if (i == 0 || increase < bestIncrease || (increase == bestIncrease && v < bestVolume)) {
                best = i;
                bestIncrease = increase;
                bestVolume = v;
            }
        }
        return best;
    }

    static std::unique_ptr<Node> insert(Node& node, Entry& entry) {
        if (node.level == 0)
            return add(node, std::move(entry));
        const Rect rect = entry.rect;
        Entry& branch = node.entries[choose(node, rect)];
        std::unique_ptr<Node> sibling = insert(*branch.child, entry);
        if (!sibling) {
            branch.rect = combine(rect, branch.rect);
            return nullptr;
        }
        branch.rect = cover(*branch.child);
        const Rect siblingCover = cover(*sibling);
        return add(node, {siblingCover, std::move(sibling), 0});
    }

    static std::unique_ptr<Node> add(Node& node, Entry entry) {
        node.entries.push_back(std::move(entry));
        return node.entries.size() <= 8 ? nullptr : split(node);
    }

    struct Groups {
        const std::vector<Entry>& entries;
        std::array<int, 9> group;
        std::array<bool, 9> taken{};
        std::array<int, 2> count{};
        std::array<Rect, 2> cover{};
        std::array<float, 2> volume{};

        explicit Groups(const std::vector<Entry>& e) : entries(e) { group.fill(-1); }

        void assign(std::size_t i, int g) {
            const auto k = static_cast<std::size_t>(g);
            group[i] = g;
            taken[i] = true;
            cover[k] = count[k] == 0 ? entries[i].rect : combine(entries[i].rect, cover[k]);
            volume[k] = RTreeModel::volume(cover[k]);
            ++count[k];
        }
    };

    static void seed(Groups& groups, const Rect& total) {
        const std::vector<Entry>& e = groups.entries;
        float worst = -volume(total) - 1;
        std::size_t first = 0, second = 0;
        for (std::size_t a = 0; a < 8; ++a) {
            for (std::size_t b = a + 1; b < 9; ++b) {
                const float waste =
                    volume(combine(e[a].rect, e[b].rect)) - volume(e[a].rect) - volume(e[b].rect);
                if (waste > worst) {
                    worst = waste;
                    first = a;
                    second = b;
                }
            }
        }
        groups.assign(first, 0);
        groups.assign(second, 1);
    }

    static std::unique_ptr<Node> split(Node& node) {
        const std::vector<Entry>& e = node.entries;
        Groups groups(e);
        seed(groups, cover(node));
        while (groups.count[0] + groups.count[1] < 9 && groups.count[0] < 5 && groups.count[1] < 5) {
            float biggest = -1;
            std::size_t chosen = 0;
            int chosenGroup = 0;
            for (std::size_t i = 0; i < 9; ++i) {
                if (groups.taken[i])
                    continue;
                const float growth0 = volume(combine(e[i].rect, groups.cover[0])) - groups.volume[0];
                const float growth1 = volume(combine(e[i].rect, groups.cover[1])) - groups.volume[1];
                float diff = growth1 - growth0;
                const int group = diff >= 0 ? 0 : 1;
                if (group == 1)
                    diff = -diff;
                const auto count = [&](int g) { return groups.count[static_cast<std::size_t>(g)]; };
                if (diff > biggest || (diff == biggest && count(group) < count(chosenGroup))) {
                    biggest = diff;
                    chosen = i;
                    chosenGroup = group;
                }
            }
            groups.assign(chosen, chosenGroup);
        }
        const int rest = groups.count[0] >= 5 ? 1 : 0;
        for (std::size_t i = 0; i < 9; ++i) {
            if (!groups.taken[i])
                groups.assign(i, rest);
        }
        auto sibling = std::make_unique<Node>();
        sibling->level = node.level;
        std::vector<Entry> old = std::move(node.entries);
        node.entries.clear();
        for (std::size_t i = 0; i < 9; ++i)
            (groups.group[i] == 0 ? node : *sibling).entries.push_back(std::move(old[i]));
        return sibling;
    }

    static void search(const Node& node, const Rect& query, std::vector<int>& results) {
        for (const Entry& e : node.entries) {
            if (!overlap(e.rect, query))
                continue;
            if (node.level > 0)
                search(*e.child, query, results);
            else
                results.push_back(e.id);
        }
    }

    static void dump(const Node& node, std::string& text) {
        text += 'L' + std::to_string(node.level) + '{';
        for (const Entry& e : node.entries) {
            for (const int n : {e.rect.minX, e.rect.minY, e.rect.maxX, e.rect.maxY})
                text += std::to_string(n) + ' ';
            if (node.level > 0)
                dump(*e.child, text);
            else
                text += '#' + std::to_string(e.id) + ' ';
        }
        text += '}';
    }

    std::unique_ptr<Node> m_root;
};

}  // namespace vex_util

#endif
