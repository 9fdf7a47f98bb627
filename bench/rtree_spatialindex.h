// The R-tree of libspatialindex in memory, with the same split and entries per node.
#ifndef BASALT_BENCH_RTREE_SPATIALINDEX_H
#define BASALT_BENCH_RTREE_SPATIALINDEX_H

#include <spatialindex/SpatialIndex.h>

#include <memory>
#include <vector>

#include "bench/rtree_blocks.h"

namespace bench {

namespace si = SpatialIndex;

inline si::Region region(const Rectangle& b) {
    const double low[2] = {static_cast<double>(b.min[0]), static_cast<double>(b.min[1])};
    const double high[2] = {static_cast<double>(b.max[0]), static_cast<double>(b.max[1])};
    return {low, high, 2};
}

class SpatialTree {
public:
    explicit SpatialTree(const std::vector<Rectangle>& blocks) {
        si::id_type own = 0;
        m_tree.reset(si::RTree::createNewRTree(*m_storage, 0.5, 8, 8, 2, si::RTree::RV_QUADRATIC, own));
        si::id_type id = 0;
        for (const Rectangle& b : blocks) {
            m_tree->insertData(0, nullptr, region(b), id++);
        }
    }
    void search(const Rectangle& q, std::vector<int>& found) const {
        found.clear();
        Collector collector(found);
        m_tree->intersectsWithQuery(region(q), collector);
    }

private:
    class Collector : public si::IVisitor {
    public:
        explicit Collector(std::vector<int>& ids) : m_ids(ids) {}
        void visitNode(const si::INode&) override {}
        void visitData(const si::IData& data) override {
            m_ids.push_back(static_cast<int>(data.getIdentifier()));
        }
        void visitData(std::vector<const si::IData*>&) override {}

    private:
        std::vector<int>& m_ids;
    };

    std::unique_ptr<si::IStorageManager> m_storage{si::StorageManager::createNewMemoryStorageManager()};
    std::unique_ptr<si::ISpatialIndex> m_tree;
};

}  // namespace bench

#endif
