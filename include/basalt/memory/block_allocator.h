/// @file
/// Blocks of one size from temporary files.
#ifndef BASALT_MEMORY_BLOCK_ALLOCATOR_H
#define BASALT_MEMORY_BLOCK_ALLOCATOR_H

#include <cstdint>

#include "basalt/export.h"
#include "basalt/memory/allocators.h"

namespace vex_lib {

/// Allocator of blocks of one fixed size in mapped temporary files, so that cold blocks are paged out to
/// those and not to the paging file.
///
/// Files ("vma*.tmp") are made one at a time in the system's temporary folder, when every block of the
/// existing ones is in use; each is mapped whole and holds segmentSize / blockSize blocks. They are opened
/// exclusively, take no descriptor, are kept for later blocks when they fall empty, and are deleted with the
/// allocator or when the process returns from main() or calls exit(). The first file that a process makes
/// deletes those that killed processes left: regular files "vma*.tmp" of the same user that no process has
/// open and that were not written for a minute.
/// Disk space is reserved when a file is made, so that a full disk is a failed Alloc() and never a signal
/// later. The views hold only the caller's data; the state of a block takes 4 1/8 bytes of the
/// general-purpose heap, allocated for 16,384 blocks at a time.
///
/// Blocks start at multiples of blockSize from the start of a page, which gives their alignment.
/// Failures are null and not reported. Threads: one allocator is used by one thread at a time.
class BASALT_API vlVmAllocator : public vlAllocator {
public:
    /// Files of `segmentSize` bytes with blocks of `blockSize` bytes; makes no file yet. With a block size of
    /// 0, one above the segment size, or either above 2^32 - 1, every Alloc() is null.
    vlVmAllocator(unsigned long segmentSize, unsigned long blockSize);

    /// Releases every block and deletes the files.
    ~vlVmAllocator() override;

    /// The files have one owner: copies are refused.
    vlVmAllocator(const vlVmAllocator&) = delete;
    vlVmAllocator& operator=(const vlVmAllocator&) = delete;

    /// A block of exactly blockSize bytes, zero at its first use and unchanged since it was freed later; null
    /// for any other size, and when out of memory, address space, files or disk space. A failure leaves
    /// nothing behind except, when a file just made could not be opened again, that file, empty. The block
    /// freed last in a file is used first, and a file with free blocks before a new one. Constant time except
    /// for making a file.
    void* Alloc(std::uint64_t size) override;

    /// Frees a block; any other address (null, foreign, inside a block, freed already) is ignored.
    /// Logarithmic in the number of files, constant in the number of blocks.
    void Free(void* block) override;

private:
    struct MemoryMappedFile;
    struct Segment;
    struct SegmentIndex;

    BASALT_LOCAL MemoryMappedFile* CreateMemoryMappedFile();
    BASALT_LOCAL void DestroyMemoryMappedFile(MemoryMappedFile* mapped);

    BASALT_LOCAL Segment* create_segment();
    BASALT_LOCAL void destroy_segment(Segment* segment);
    BASALT_LOCAL Segment* find_segment(const void* block) const;
    BASALT_LOCAL bool add_chunk(Segment* segment);
    BASALT_LOCAL bool reserve_index_entry();

    Segment* m_empty = nullptr;          // no block in use, latest first
    Segment* m_partial = nullptr;        // some blocks free; the first serves Alloc()
    SegmentIndex* m_segments = nullptr;  // all, by address; those in neither list are full
    std::uint32_t m_segment_size;
    std::uint32_t m_block_size;
    vlAllocator* m_bookkeeping;
};

}  // namespace vex_lib

#endif
