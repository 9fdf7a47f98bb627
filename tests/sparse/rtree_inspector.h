// Looks into a tree: its structure as text, and whether it is sound.
#ifndef BASALT_TESTS_SPARSE_RTREE_INSPECTOR_H
#define BASALT_TESTS_SPARSE_RTREE_INSPECTOR_H

#include <set>
#include <string>

#include "src/sparse/rtree.h"

namespace vex_util {

struct RTreeInspector {
    // In the form of RTreeModel::dump.
    static std::string dump(const slRTree& tree) {
        std::string text;
        dump(tree, tree.m_root, text);
        return text;
    }

    // The first broken invariant in words, or "". An internal rectangle has to be the exact cover of its
    // child.
    static std::string check(const slRTree& tree) {
        std::set<rtree::NodeRef> seen;
        if (tree.m_nodes[tree.m_root].level != tree.m_level)
            return "root level";
        return check(tree, tree.m_root, seen);
    }

    static int level(const slRTree& tree) { return tree.m_level; }

    // Uses up free nodes until only so many are left before the pool has to grow; only where the next
    // insertion could split the root, since each growth is larger than the last.
    static void leave_spare(slRTree& tree, int count) {
        if (tree.m_nodes[tree.m_root].count < rtree::MAX_ENTRIES)
            return;
        while (tree.m_nodes.spare() > static_cast<std::size_t>(count))
            tree.m_nodes.take();
    }

private:
    static void dump(const slRTree& tree, rtree::NodeRef ref, std::string& text) {
        const rtree::Node& node = tree.m_nodes[ref];
        text += 'L' + std::to_string(node.level) + '{';
        for (int i = 0; i < node.count; ++i) {
            const rtree::Rect r = node.rect(i);
            for (const int n : {r.minX, r.minY, r.maxX, r.maxY})
                text += std::to_string(n) + ' ';
            if (node.level > 0)
                dump(tree, node.slot[i], text);
            else
                text += '#' + std::to_string(static_cast<int>(node.slot[i])) + ' ';
        }
        text += '}';
    }

    static std::string check(const slRTree& tree, rtree::NodeRef ref, std::set<rtree::NodeRef>& seen) {
        const rtree::Node& node = tree.m_nodes[ref];
        if (!seen.insert(ref).second)
            return "node reached twice";
        const int fewest = ref != tree.m_root ? rtree::MIN_ENTRIES : node.level > 0 ? 2 : 0;
        if (node.count < fewest || node.count > rtree::MAX_ENTRIES)
            return "count " + std::to_string(node.count) + " at level " + std::to_string(node.level);
        for (int i = 0; i < node.count; ++i) {
            if (node.level == 0) {
                const rtree::Rect r = node.rect(i);
                if ((r.minX > r.maxX || r.minY > r.maxY) && !tree.m_inverted)
                    return "inverted rectangle unknown to the tree";
                continue;
            }
            const rtree::Node& child = tree.m_nodes[node.slot[i]];
            if (child.level != node.level - 1)
                return "level of a child";
            if (child.count == 0 || !(child.cover() == node.rect(i)))
                return "cover of a child at level " + std::to_string(child.level);
            if (const std::string fault = check(tree, node.slot[i], seen); !fault.empty())
                return fault;
        }
        return "";
    }
};

}  // namespace vex_util

#endif
