#include <algorithm>
#include <new>

#include "basalt/memory/block_allocator.h"
#include "src/memory/vm_segment.h"
#include "src/platform/file.h"
#include "src/platform/file_mapping.h"
#include "src/platform/temporary_file.h"
#include "src/platform/temporary_folder.h"

namespace vex_lib {
namespace {

constexpr std::size_t FIRST_CAPACITY = 16;
constexpr DWORD LONGEST_PATH = MAX_PATH + 1;  // characters, the terminator included

// A new, hidden file in the temporary folder, held alone and deleted when closed; null on failure.
HANDLE create_temporary_file() {
    wchar_t folder[LONGEST_PATH];
    const DWORD length = GetTempPathW(LONGEST_PATH, folder);
    wchar_t name[LONGEST_PATH];
    if (length == 0 || length >= LONGEST_PATH || GetTempFileNameW(folder, L"vma", 0, name) == 0) {
        return nullptr;
    }
    const HANDLE file = CreateFileW(name, GENERIC_READ | GENERIC_WRITE, 0, nullptr, OPEN_EXISTING,
                                    FILE_ATTRIBUTE_HIDDEN | FILE_ATTRIBUTE_TEMPORARY |
                                        FILE_FLAG_DELETE_ON_CLOSE | FILE_FLAG_SEQUENTIAL_SCAN,
                                    nullptr);
    return file != INVALID_HANDLE_VALUE ? file : nullptr;
}

}  // namespace

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

// A segment with room for its first block, entered in the index; null, and nothing is left behind, on
// failure.
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

// Room for the state of further blocks; false when there is no memory.
bool vlVmAllocator::add_chunk(Segment* segment) {
    void* const chunk = m_bookkeeping->Alloc(segment->chunk_bytes());
    if (chunk == nullptr) {
        return false;
    }
    segment->chunks()[segment->chunk_count++] = static_cast<std::uint32_t*>(chunk);
    return true;
}

// Room for one more segment in the index; false when there is no memory.
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
