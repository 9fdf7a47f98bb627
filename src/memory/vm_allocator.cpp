#include <limits>
#include <new>

#include "basalt/memory/block_allocator.h"
#include "src/memory/heap_allocator.h"
#include "src/memory/vm_segment.h"

namespace vex_lib {
namespace {

constexpr unsigned long LARGEST_SEGMENT = std::numeric_limits<std::uint32_t>::max();

}  // namespace

// Sizes that cannot work get no bookkeeping, without which nothing is handed out.
vlVmAllocator::vlVmAllocator(unsigned long segmentSize, unsigned long blockSize)
    : m_segment_size(static_cast<std::uint32_t>(segmentSize)),
      m_block_size(static_cast<std::uint32_t>(blockSize)),
      m_bookkeeping(blockSize != 0 && blockSize <= segmentSize && segmentSize <= LARGEST_SEGMENT
                        ? new (std::nothrow) vlHeapAllocator
                        : nullptr) {}

vlVmAllocator::~vlVmAllocator() {
    if (m_segments != nullptr) {
        for (const SegmentIndex::Entry& entry : *m_segments) {
            destroy_segment(entry.segment);
        }
        m_bookkeeping->Free(m_segments);
    }
    delete m_bookkeeping;
}

void* vlVmAllocator::Alloc(std::uint64_t size) {
    if (m_bookkeeping == nullptr || size != m_block_size) {
        return nullptr;
    }
    Segment* segment = m_partial;
    if (segment == nullptr) {
        segment = m_empty != nullptr ? m_empty : create_segment();
        if (segment == nullptr) {
            return nullptr;
        }
        if (segment == m_empty) {
            Segment::unlink(m_empty, segment);
        }
        Segment::push_front(m_partial, segment);
    }
    if (segment->needs_chunk() && !add_chunk(segment)) {
        return nullptr;
    }
    const std::size_t block = segment->take();
    if (segment->is_full()) {
        Segment::unlink(m_partial, segment);
    }
    return segment->base + block * m_block_size;
}

void vlVmAllocator::Free(void* block) {
    Segment* const segment = find_segment(block);
    if (segment == nullptr) {
        return;
    }
    const auto offset = static_cast<std::uint32_t>(static_cast<char*>(block) - segment->base);
    const std::uint32_t number = offset / m_block_size;
    const bool was_full = segment->is_full();
    if (number * m_block_size != offset || !segment->give_back(number)) {
        return;
    }
    if (was_full) {
        // Partial even when this was its only block.
        Segment::push_front(m_partial, segment);
    } else if (segment->is_unused()) {
        Segment::unlink(m_partial, segment);
        Segment::push_front(m_empty, segment);
    }
}

// The segment whose view holds an address, null when there is none.
vlVmAllocator::Segment* vlVmAllocator::find_segment(const void* block) const {
    const auto address = reinterpret_cast<std::uintptr_t>(block);
    // Blocks freed one after the other mostly lie together, and their segment comes first: saves the search.
    if (m_partial != nullptr &&
        address - reinterpret_cast<std::uintptr_t>(m_partial->base) < m_segment_size) {
        return m_partial;
    }
    if (m_segments == nullptr || m_segments->count == 0) {
        return nullptr;
    }
    // The last one that starts at or before the address, by halves and without a branch to mispredict.
    const SegmentIndex::Entry* first = m_segments->begin();
    for (std::size_t count = m_segments->count; count > 1;) {
        const std::size_t half = count / 2;
        first += first[half].base <= address ? half : 0;
        count -= half;
    }
    return address - first->base < m_segment_size ? first->segment : nullptr;
}

}  // namespace vex_lib
