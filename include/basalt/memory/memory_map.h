/// @file
/// CMemoryMap, one large block of memory on a temporary file.
#ifndef BASALT_MEMORY_MEMORY_MAP_H
#define BASALT_MEMORY_MEMORY_MAP_H

#include <cstdint>

#include "basalt/export.h"
#include "basalt/platform/types.h"

namespace vex_util {

/// One block of memory that the system pages to a hidden file of its own in the temporary folder
/// (_tempFilePath() of basalt/frame.h), "~" with a random number in seven digits and ".mem". Where no file
/// can be made, on a full disk for instance, the block comes from the heap instead.
///
/// Disk space is reserved at creation, so that a full disk is never a signal later. The file is opened
/// exclusively and deleted with the block, when the process returns from main() or calls exit(), and by
/// CleanUp() after a process that was killed. Nothing here throws or is reported.
/// Threads: reentrant; one object is used by one thread at a time.
class BASALT_API CMemoryMap {
public:
    /// Without a block.
    CMemoryMap();

    /// With a block, as by Create(); `operator void*` is null if that failed.
    explicit CMemoryMap(unsigned long size);

    /// As Destroy().
    ~CMemoryMap();

    /// The block has one owner: copies are refused.
    CMemoryMap(const CMemoryMap&) = delete;
    CMemoryMap& operator=(const CMemoryMap&) = delete;

    /// Releases the object's block and makes another.
    /// @param size bytes, up to 2^32 - 1; 0 gives a block from the heap, of no bytes
    /// @return true with a block that reads as zero; false, without one, when neither a file nor the heap can
    /// provide it, and for a size out of range
    bool Create(unsigned long size);

    /// Releases the block and deletes its file, even if the temporary folder has changed; in the current one,
    /// a file of the same name that is not open is deleted too, as by CleanUp(). Does nothing without a
    /// block.
    /// @return true
    bool Destroy();

    /// The block; null when there is none.
    operator void*() const;

    /// Deletes every file "~*.mem" in the temporary folder that is not open in this process or another; files
    /// that cannot be deleted stay. Does nothing without a temporary folder.
    /// Threads: thread-safe.
    static void CleanUp();

private:
    BASALT_LOCAL bool create_on_file();

    void* m_data;
    std::uint32_t m_size;
    HANDLE m_file;
    HANDLE m_mapping;
    std::uint16_t m_number;
};

}  // namespace vex_util

#endif
