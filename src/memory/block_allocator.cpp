#include "basalt/memory/block_allocator.h"

#include <algorithm>
#include <atomic>
#include <limits>
#include <new>

#include "src/memory/allocators.h"
#include "src/memory/block_allocator_segment.h"
#include "src/platform/file.h"
#include "src/platform/file_mapping.h"

namespace vex_lib {
namespace {

constexpr unsigned long LARGEST_SEGMENT = std::numeric_limits<std::uint32_t>::max();
constexpr std::size_t FIRST_CAPACITY = 16;
constexpr DWORD LONGEST_PATH = MAX_PATH + 1;  // characters, the terminator included

constexpr wchar_t PREFIX[] = L"vma";

constinit std::atomic_flag s_has_cleaned_up;

// A new, hidden file in the temporary folder, opened exclusively and deleted when closed; null on failure.
// The first call of a process also deletes what killed processes left there.
HANDLE create_temporary_file() {
    wchar_t folder[LONGEST_PATH];
    const DWORD length = GetTempPathW(LONGEST_PATH, folder);
    if (length == 0 || length >= LONGEST_PATH) {
        return nullptr;
    }
    if (!s_has_cleaned_up.test_and_set()) {
        basalt::platform::delete_abandoned_files(folder, PREFIX);
    }
    wchar_t name[LONGEST_PATH];
    if (GetTempFileNameW(folder, PREFIX, 0, name) == 0) {
        return nullptr;
    }
    const HANDLE file = CreateFileW(name, GENERIC_READ | GENERIC_WRITE, 0, nullptr, OPEN_EXISTING,
                                    FILE_ATTRIBUTE_HIDDEN | FILE_ATTRIBUTE_TEMPORARY |
                                        FILE_FLAG_DELETE_ON_CLOSE | FILE_FLAG_SEQUENTIAL_SCAN,
                                    nullptr);
    return file != INVALID_HANDLE_VALUE ? file : nullptr;
}

}  // namespace

// Invalid sizes get no bookkeeping allocator; every Alloc() then returns null.
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
        // To the partial list even when this was its only block.
        Segment::push_front(m_partial, segment);
    } else if (segment->is_unused()) {
        Segment::unlink(m_partial, segment);
        Segment::push_front(m_empty, segment);
    }
}

// The segment whose view holds an address, or null.
vlVmAllocator::Segment* vlVmAllocator::find_segment(const void* block) const {
    const auto address = reinterpret_cast<std::uintptr_t>(block);
    // Blocks freed in a row mostly lie in one segment, which is then the first: no search.
    if (m_partial != nullptr &&
        address - reinterpret_cast<std::uintptr_t>(m_partial->base) < m_segment_size) {
        return m_partial;
    }
    if (m_segments == nullptr || m_segments->count == 0) {
        return nullptr;
    }
    // Branchless binary search for the last segment that starts at or before the address.
    const SegmentIndex::Entry* first = m_segments->begin();
    for (std::size_t count = m_segments->count; count > 1;) {
        const std::size_t half = count / 2;
        first += first[half].base <= address ? half : 0;
        count -= half;
    }
    return address - first->base < m_segment_size ? first->segment : nullptr;
}

vlVmAllocator::MemoryMappedFile* vlVmAllocator::CreateMemoryMappedFile() {
    void* const record = m_bookkeeping->Alloc(sizeof(MemoryMappedFile));
    if (record == nullptr) {
        return nullptr;
    }
    auto* const mapped = new (record) MemoryMappedFile;
    mapped->file = create_temporary_file();
    if (mapped->file != nullptr) {
        mapped->mapping =
            CreateFileMappingW(mapped->file, nullptr, PAGE_READWRITE, 0, m_segment_size, nullptr);
    }
    if (mapped->mapping != nullptr) {
        mapped->view = MapViewOfFile(mapped->mapping, FILE_MAP_ALL_ACCESS, 0, 0, m_segment_size);
    }
    if (mapped->view == nullptr) {
        DestroyMemoryMappedFile(mapped);
        return nullptr;
    }
    return mapped;
}

void vlVmAllocator::DestroyMemoryMappedFile(MemoryMappedFile* mapped) {
    if (mapped == nullptr) {
        return;
    }
    if (mapped->view != nullptr) {
        UnmapViewOfFile(mapped->view);
    }
    if (mapped->mapping != nullptr) {
        CloseHandle(mapped->mapping);
    }
    if (mapped->file != nullptr) {
        CloseHandle(mapped->file);
    }
    m_bookkeeping->Free(mapped);
}

// A new segment in the index, with the state of its first blocks; null on failure, with nothing left behind.
vlVmAllocator::Segment* vlVmAllocator::create_segment() {
    if (!reserve_index_entry()) {
        return nullptr;
    }
    const std::uint32_t block_count = m_segment_size / m_block_size;
    void* const record = m_bookkeeping->Alloc(Segment::record_bytes(block_count));
    MemoryMappedFile* const file = record != nullptr ? CreateMemoryMappedFile() : nullptr;
    if (file == nullptr) {
        m_bookkeeping->Free(record);
        return nullptr;
    }
    auto* const segment = new (record) Segment(file, block_count);
    if (!add_chunk(segment)) {
        destroy_segment(segment);
        return nullptr;
    }
    m_segments->insert(segment);
    return segment;
}

void vlVmAllocator::destroy_segment(Segment* segment) {
    std::for_each(segment->chunks(), segment->chunks() + segment->chunk_count,
                  [this](std::uint32_t* chunk) { m_bookkeeping->Free(chunk); });
    DestroyMemoryMappedFile(segment->file);
    m_bookkeeping->Free(segment);
}

// Adds space for the state of further blocks; false when out of memory.
bool vlVmAllocator::add_chunk(Segment* segment) {
    void* const chunk = m_bookkeeping->Alloc(segment->chunk_bytes());
    if (chunk == nullptr) {
        return false;
    }
    segment->chunks()[segment->chunk_count++] = static_cast<std::uint32_t*>(chunk);
    return true;
}

// Makes space for one more segment in the index; false when out of memory.
bool vlVmAllocator::reserve_index_entry() {
    if (m_segments != nullptr && m_segments->count < m_segments->capacity) {
        return true;
    }
    const std::size_t capacity = m_segments != nullptr ? 2 * m_segments->capacity : FIRST_CAPACITY;
    void* const record = m_bookkeeping->Alloc(SegmentIndex::record_bytes(capacity));
    if (record == nullptr) {
        return false;
    }
    auto* const larger = new (record) SegmentIndex(capacity);
    if (m_segments != nullptr) {
        larger->count = m_segments->count;
        std::copy(m_segments->begin(), m_segments->end(), larger->begin());
        m_bookkeeping->Free(m_segments);
    }
    m_segments = larger;
    return true;
}

}  // namespace vex_lib
