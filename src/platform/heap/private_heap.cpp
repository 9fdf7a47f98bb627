#include "src/platform/heap/private_heap.h"

#include <algorithm>
#include <cstring>
#include <new>

#include "src/platform/pages.h"

namespace basalt::platform {
namespace {

constexpr std::uint64_t MAGIC = 0x6261'7361'6c74'4850;

// Regions without a live block are kept up to this: the page faults of new ones cost more than all the rest
// of an allocation.
constexpr std::size_t MOST_IDLE = std::size_t{32} << 20;
constexpr std::size_t MOST_IDLE_FURTHER = std::size_t{2} << 20;  // in each further part

static_assert(sizeof(PrivateHeap) <= SMALLEST_PAGE, "an unused heap costs one page");

}  // namespace

PrivateHeap::PrivateHeap(std::size_t maximum)
    : m_magic(MAGIC), m_has_maximum(maximum != 0), m_first(maximum, MOST_IDLE) {}

PrivateHeap* PrivateHeap::create(std::size_t maximum) {
    std::byte* record = map_pages(whole_pages(sizeof(PrivateHeap)), page_size());
    return record == nullptr ? nullptr : new (record) PrivateHeap(maximum);
}

PrivateHeap* PrivateHeap::from_handle(void* handle) {
    if (handle == nullptr || (reinterpret_cast<std::uintptr_t>(handle) & (SMALLEST_PAGE - 1)) != 0) {
        return nullptr;
    }
    auto* heap = static_cast<PrivateHeap*>(handle);
    return heap->m_magic == MAGIC ? heap : nullptr;
}

void PrivateHeap::destroy() {
    for (const std::atomic<HeapPart*>& further : m_further) {
        if (HeapPart* part = further.load(std::memory_order_relaxed)) {
            part->~HeapPart();
            unmap_pages(reinterpret_cast<std::byte*>(part), whole_pages(sizeof(HeapPart)));
        }
    }
    m_magic = 0;
    this->~PrivateHeap();
    unmap_pages(reinterpret_cast<std::byte*>(this), whole_pages(sizeof(PrivateHeap)));
}

// The part of a thread that has none yet; the first one when out of memory.
HeapPart& PrivateHeap::make_part() {
    const std::uintptr_t thread = this_thread();
    std::uintptr_t first = 0;
    if (m_first_thread.compare_exchange_strong(first, thread, std::memory_order_relaxed)) {
        return m_first;
    }
    std::byte* const record = map_pages(whole_pages(sizeof(HeapPart)), page_size());
    if (record == nullptr) {
        return m_first;
    }
    auto* const part = new (record) HeapPart(0, MOST_IDLE_FURTHER);
    HeapPart* made = nullptr;
    if (place_of(thread).compare_exchange_strong(made, part, std::memory_order_acq_rel)) {
        return *part;
    }
    // A thread of the same place was faster.
    part->~HeapPart();
    unmap_pages(record, whole_pages(sizeof(HeapPart)));
    return *made;
}

// Calls visit(part), the thread's own part first, until it returns true.
template <class Visit>
void PrivateHeap::for_each_part(Visit visit) {
    HeapPart* const own = own_part();
    if ((own != nullptr && visit(*own)) || m_has_maximum || (own != &m_first && visit(m_first))) {
        return;
    }
    for (const std::atomic<HeapPart*>& further : m_further) {
        HeapPart* const part = further.load(std::memory_order_acquire);
        if (part != nullptr && part != own && visit(*part)) {
            return;
        }
    }
}

// From free memory of any part, when the thread's own can have no more.
void* PrivateHeap::allocate_anywhere(std::size_t size) {
    void* block = nullptr;
    for_each_part([&](HeapPart& part) { return (block = part.allocate(size)) != nullptr; });
    return block;
}

DWORD PrivateHeap::release(void* payload) {
    if (payload == nullptr) {
        return ERROR_SUCCESS;
    }
    DWORD error = ERROR_INVALID_PARAMETER;
    for_each_part([&](HeapPart& part) { return (error = part.release(payload)) != ERROR_INVALID_PARAMETER; });
    return error;
}

void* PrivateHeap::resize(void* payload, std::size_t size, DWORD& error) {
    error = ERROR_INVALID_PARAMETER;
    void* moved = nullptr;
    std::size_t old_size = 0;
    HeapPart* owner = nullptr;
    for_each_part([&](HeapPart& part) {
        moved = part.resize(payload, size, old_size, error);
        owner = &part;
        return moved != nullptr || error != ERROR_INVALID_PARAMETER;
    });
    if (moved != nullptr || error == ERROR_INVALID_PARAMETER) {
        return moved;
    }
    // No other thread uses either block: copying needs no lock.
    moved = allocate(size);
    if (moved != nullptr) {
        permit_access(payload, old_size);
        std::memcpy(moved, payload, std::min(old_size, size));
        owner->release(payload);
    }
    return moved;
}

std::size_t PrivateHeap::compact() {
    std::size_t largest = 0;
    for_each_part([&](HeapPart& part) {
        // A heap that was used keeps a region, so that it has a free block to report.
        largest = std::max(largest, part.compact(&part == &m_first));
        return false;
    });
    return largest;
}

}  // namespace basalt::platform
