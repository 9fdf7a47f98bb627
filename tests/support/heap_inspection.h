// Walks a private heap and checks its invariants.
#ifndef BASALT_TESTS_SUPPORT_HEAP_INSPECTION_H
#define BASALT_TESTS_SUPPORT_HEAP_INSPECTION_H

#include <cstddef>
#include <mutex>

#include "src/platform/heap/private_heap.h"

namespace basalt::platform {

struct HeapReport {
    const char* fault = nullptr;                           // the first violated invariant; null when all hold
    std::size_t regions = 0, mapped = 0, live_blocks = 0;  // mapped: bytes
};

// The friend of the heap's classes.
class HeapInspection {
public:
    static HeapReport inspect(PrivateHeap& heap) {
        HeapReport report;
        HeapInspection(heap.m_first, report);
        for (const std::atomic<HeapPart*>& further : heap.m_further) {
            HeapPart* const part = further.load();
            part != nullptr ? static_cast<void>(HeapInspection(*part, report)) : void();
        }
        return report;
    }

private:
    HeapInspection(HeapPart& heap, HeapReport& report) : m_heap(heap), m_report(report) {
        const std::lock_guard guard(heap.m_lock);
        const std::byte* end_before = nullptr;
        for (const Region& region : heap.m_regions.all()) {
            expect(region.begin >= end_before, "regions are in order and apart");
            end_before = region.begin + region.size;
            check_region(region);
        }
        if (m_report.fault == nullptr) {
            check_lists();
        }
        expect(m_mapped == heap.m_mapped && m_shared == heap.m_mapped_shared, "mapped bytes are counted");
        expect(heap.m_mapped <= heap.m_maximum, "the maximum holds");
        expect(m_live_shared == heap.m_live_shared, "live bytes are counted");
        expect(m_idle == heap.m_idle, "bytes of idle regions are counted");
    }

    void expect(bool holds, const char* invariant) {
        m_report.fault = holds || m_report.fault != nullptr ? m_report.fault : invariant;
    }

    void check_region(const Region& region) {
        std::byte* const end = region.begin + region.size - HEAD_BYTES;
        bool after_free = false;
        std::size_t blocks = 0, live = 0;
        for (std::byte* at = region.begin + HEAD_BYTES; at != end; ++blocks) {
            const std::uint64_t head = head_of(block_at(at)), tag = head & TAG_BITS;
            const std::size_t size = size_of(head);
            if (size < MIN_BLOCK || size > static_cast<std::size_t>(end - at)) {
                return expect(false, "a block lies within its region");
            }
            at += size;
            expect(is_last(head) == (at == end), "the last block of a region is marked");
            expect(((head & PREVIOUS_FREE) != 0) == after_free, "the successor of a free block is marked");
            expect(!is_free(head) || !after_free, "no two neighbours are free");
            expect(!is_free(head) || at == end || size_before(block_at(at)) == size, "its end has its size");
            expect(is_free(head) || tag == QUICK_TAG || tag == m_heap.m_tag, "a block has its heap's tag");
            after_free = is_free(head);
            ++(after_free ? m_free : tag == QUICK_TAG ? m_quick : m_report.live_blocks);
            live += after_free || tag == QUICK_TAG ? 0 : size;
        }
        expect(!region.single || (blocks == 1 && live != 0), "a large block is alone in its region");
        ++m_report.regions;
        m_report.mapped += region.size;
        m_mapped += region.size;
        m_shared += region.single ? 0 : region.size;
        m_live_shared += region.single ? 0 : live;
        m_idle += m_heap.is_idle_region(block_at(region.begin + HEAD_BYTES)) ? region.size : 0;
    }

    void check_lists() {
        const FreeLists& lists = m_heap.m_free;
        for (unsigned i = 0; i < FreeLists::LEVELS * FreeLists::LISTS; ++i) {
            const unsigned level = i / FreeLists::LISTS, list = i % FreeLists::LISTS,
                           bits = lists.m_lists[level];
            Block *block = lists.first({level, list}), *previous = nullptr;
            expect((lists.m_levels >> level & 1) == (bits != 0), "a level is marked if it has a block");
            expect((bits >> list & 1) == (block != nullptr), "a list is marked if it has a block");
            for (; block != nullptr && m_report.fault == nullptr; previous = block, block = next_of(block)) {
                const auto place = FreeLists::place_of(size_of(head_of(block)));
                expect(m_free-- > 0 && is_free(head_of(block)) && prev_of(block) == previous &&
                           place.level == level && place.list == list,
                       "a free list holds free blocks of its sizes");
            }
        }
        std::size_t bytes = 0;
        for (std::size_t list = 0; list < QuickLists::LISTS; ++list) {
            Block* block = m_heap.m_quick.first(list);
            for (; block != nullptr && m_report.fault == nullptr; block = next_of(block)) {
                const std::size_t head = head_of(block), size = size_of(head);
                expect(m_quick-- > 0 && (head & TAG_BITS) == QUICK_TAG && QuickLists::list_of(size) == list,
                       "a quick list holds quick blocks of its sizes");
                bytes += size;
            }
        }
        expect(m_free == 0 && m_quick == 0, "every free block is in a list");
        expect(bytes == m_heap.m_quick.bytes(), "bytes in quick lists are counted");
    }

    HeapPart& m_heap;
    HeapReport& m_report;
    std::size_t m_free = 0, m_quick = 0;                                    // blocks not yet found in a list
    std::size_t m_mapped = 0, m_shared = 0, m_live_shared = 0, m_idle = 0;  // bytes
};

// Takes the heap's lock; time grows with the number of blocks. The handle must be valid.
inline HeapReport inspect_heap(void* handle) {
    return HeapInspection::inspect(*static_cast<PrivateHeap*>(handle));
}

}  // namespace basalt::platform

#endif
