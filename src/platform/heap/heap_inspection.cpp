#include "src/platform/heap/heap_inspection.h"

#include <algorithm>
#include <mutex>

#include "src/platform/heap/private_heap.h"

namespace basalt::platform {
namespace {

const char* check_free_block(std::uint64_t head, bool after_free, Block* after) {
    if (after_free) {
        return "two neighbouring blocks are free";
    }
    if (after != nullptr && size_before(after) != size_of(head)) {
        return "a free block's end does not repeat its size";
    }
    return nullptr;
}

// Blocks from the first head to the end of the region, each with its neighbours. Adds up the bytes of the
// live ones.
const char* check_region(const Region& region, std::uint64_t tag, HeapReport& report, std::size_t& live) {
    std::byte* const end = region.begin + region.size - HEAD_BYTES;
    bool after_free = false;
    std::size_t blocks = 0;
    for (std::byte* at = region.begin + HEAD_BYTES; at != end; ++blocks) {
        const std::uint64_t head = head_of(block_at(at));
        const std::size_t size = size_of(head);
        if (size < MIN_BLOCK || size > static_cast<std::size_t>(end - at)) {
            return "a block's size is out of bounds";
        }
        at += size;
        if (is_last(head) != (at == end)) {
            return "the mark of a region's last block is wrong";
        }
        if (((head & PREVIOUS_FREE) != 0) != after_free) {
            return "a block is wrong about its predecessor being free";
        }
        if (is_free(head)) {
            if (const char* fault = check_free_block(head, after_free, at == end ? nullptr : block_at(at))) {
                return fault;
            }
            ++report.free_blocks;
            report.largest_free = std::max(report.largest_free, size - HEAD_BYTES - GUARD_BYTES);
        } else if ((head & TAG_BITS) == QUICK_TAG) {
            ++report.quick_blocks;
        } else if ((head & TAG_BITS) != tag) {
            return "a block carries another heap's mark";
        } else {
            ++report.live_blocks;
            live += size;
        }
        after_free = is_free(head);
    }
    return region.single && (blocks != 1 || live == 0) ? "a large block is not alone in its region" : nullptr;
}

const char* check_lists(const FreeLists& lists, const RegionTable& regions, std::size_t expected) {
    if (!lists.bitmaps_agree()) {
        return "bitmaps and free lists disagree";
    }
    std::size_t listed = 0;
    for (unsigned level = 0; level < FreeLists::LEVELS; ++level) {
        for (unsigned list = 0; list < FreeLists::LISTS; ++list) {
            Block* prev = nullptr;
            for (Block* block = lists.first({level, list}); block != nullptr; block = next_of(block)) {
                if (++listed > expected || regions.find(block) == nullptr) {
                    return "a free list runs astray";
                }
                const auto place = FreeLists::place_of(size_of(head_of(block)));
                if (!is_free(head_of(block)) || place.level != level || place.list != list) {
                    return "a free list holds a block that does not belong there";
                }
                if (prev_of(block) != prev) {
                    return "a free list's backward link is wrong";
                }
                prev = block;
            }
        }
    }
    return listed == expected ? nullptr : "a free block is in no list";
}

const char* check_quick_lists(const QuickLists& lists, const RegionTable& regions, std::size_t expected) {
    std::size_t listed = 0;
    std::size_t bytes = 0;
    for (std::size_t list = 0; list < QuickLists::LISTS; ++list) {
        for (Block* block = lists.first(list); block != nullptr; block = next_of(block)) {
            if (++listed > expected || regions.find(block) == nullptr) {
                return "a quick list runs astray";
            }
            const std::uint64_t head = head_of(block);
            if ((head & TAG_BITS) != QUICK_TAG || QuickLists::list_of(size_of(head)) != list) {
                return "a quick list holds a block that does not belong there";
            }
            bytes += size_of(head);
        }
    }
    if (bytes != lists.bytes()) {
        return "the count of bytes in the quick lists is wrong";
    }
    return listed == expected ? nullptr : "a block marked for the quick lists is in none";
}

}  // namespace

HeapReport inspect_heap(void* handle) {
    PrivateHeap& heap = *static_cast<PrivateHeap*>(handle);
    const std::lock_guard guard(heap.m_lock);
    HeapReport report;
    std::size_t shared = 0;
    std::size_t live_shared = 0;
    std::size_t idle = 0;
    const std::byte* end_before = nullptr;
    for (const Region& region : heap.m_regions.all()) {
        if (region.begin < end_before) {
            report.fault = "regions overlap or are out of order";
            return report;
        }
        end_before = region.begin + region.size;
        std::size_t live = 0;
        report.fault = check_region(region, heap.m_tag, report, live);
        if (report.fault != nullptr) {
            return report;
        }
        ++report.regions;
        report.mapped += region.size;
        shared += region.single ? 0 : region.size;
        live_shared += region.single ? 0 : live;
        idle += heap.is_idle_region(block_at(region.begin + HEAD_BYTES)) ? region.size : 0;
    }
    report.fault = check_lists(heap.m_free, heap.m_regions, report.free_blocks);
    if (report.fault == nullptr) {
        report.fault = check_quick_lists(heap.m_quick, heap.m_regions, report.quick_blocks);
    }
    if (report.fault != nullptr) {
        return report;
    }
    if (report.mapped != heap.m_mapped || shared != heap.m_mapped_shared || heap.m_mapped > heap.m_maximum) {
        report.fault = "the count of mapped bytes is wrong";
    } else if (live_shared != heap.m_live_shared) {
        report.fault = "the count of live bytes is wrong";
    } else if (idle != heap.m_idle) {
        report.fault = "the count of bytes in wholly free regions is wrong";
    }
    return report;
}

}  // namespace basalt::platform
