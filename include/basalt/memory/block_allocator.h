/// @file
/// Blocks of one size from temporary files.
#ifndef BASALT_MEMORY_BLOCK_ALLOCATOR_H
#define BASALT_MEMORY_BLOCK_ALLOCATOR_H

#include <cstdint>

#include "basalt/export.h"
#include "basalt/memory/allocators.h"

namespace vex_lib {

/// Allocator of blocks of one fixed size in temporary files that are mapped into memory, so that cold blocks
/// go to the disk and not to the paging file.
///
/// Files ("vma*.tmp") are made one at a time in the system's temporary folder, when every block of those
/// there are is taken; each is mapped whole and holds segmentSize / blockSize blocks. They are held alone,
/// cost no descriptor, are kept for later blocks when they fall empty, and are gone when the allocator is
/// destroyed. A process that ends by returning or exit() leaves none either; one that is killed does.
/// Their space on the disk is reserved when they are made, so that a full disk is a failed Alloc() and never
/// a signal later. A view holds nothing but the caller's data; besides it, a block costs 4 1/8 bytes of the
/// general-purpose heap, taken by the 16,384 blocks as they are first used.
///
/// Blocks start at multiples of blockSize from the start of a page: they are aligned as far as that is.
/// Failures are null and not reported. Threads: one allocator is used by one thread at a time.
class BASALT_API vlVmAllocator : public vlAllocator {
public:
    /// Files of `segmentSize` bytes, cut into blocks of `blockSize` bytes; makes no file yet. With a block
    /// size of 0, one above the segment size, or either above 2^32 - 1, every Alloc() is null.
    vlVmAllocator(unsigned long segmentSize, unsigned long blockSize);

    /// Gives back every file and block.
    ~vlVmAllocator() override;

    /// The files have one owner: copies are refused.
    vlVmAllocator(const vlVmAllocator&) = delete;
    vlVmAllocator& operator=(const vlVmAllocator&) = delete;

    /// A block of exactly blockSize bytes, zero at its first use and as it was left later; null for any other
    /// size, and when there is no memory, address space, file or room on the disk. Nothing is left behind
    /// then but, where a file just made could not be opened again, that file, empty. The block freed last in
    /// a file is used again first, and a file with free blocks before a new one. Constant time, but for
    /// making a file.
    void* Alloc(std::uint64_t size) override;

    /// Frees a block; any other address (null, foreign, inside a block, freed already) is ignored. The time
    /// grows with the logarithm of the number of files, and not with that of blocks.
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
    Segment* m_partial = nullptr;        // blocks to hand out: those of the first
    SegmentIndex* m_segments = nullptr;  // all, by address; those on neither list are full
    std::uint32_t m_segment_size;
    std::uint32_t m_block_size;
    vlAllocator* m_bookkeeping;
};

}  // namespace vex_lib

#endif
