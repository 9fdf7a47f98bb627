/// @file
/// Page sources: pages for a container that reserves a large range of addresses and commits it piece by
/// piece.
///
/// Both classes are pairs of functions of one form, controlled by a code: commit 0x1000 and reserve 0x2000
/// for Alloc, decommit 0x4000 and release 0x8000 for Free.
#ifndef BASALT_MEMORY_PAGE_SOURCES_H
#define BASALT_MEMORY_PAGE_SOURCES_H

#include "basalt/export.h"

namespace vex_lib {

/// Pages of virtual memory. A reservation takes address space only; committed pages read as zero at first,
/// and when they are committed again after a decommit.
///
/// Failures are reported to the debugger output (see basalt/memory/allocators.h), sizes above 2^32 - 1 bytes
/// too; an unknown code is not.
/// Threads: thread-safe; calls on one range must not overlap in time.
class BASALT_API vlSharedMemoryAllocator {
public:
    /// Reserves a range, or commits pages of one.
    /// @param address reserve: where the range begins, rounded down to a multiple of 64 KiB, or null for
    /// anywhere; commit: the first byte to use; null reserves the first piece as well, and any further one
    /// fails
    /// @param size bytes, up to 2^32 - 1, rounded out to whole pages; committing 0 does nothing and returns
    /// null, not reported
    /// @param type 0x1000 commits, 0x2000 reserves
    /// @param handle not used, may be null
    /// @return reserve: the base of the range; commit: the base of the first page; null on failure and for
    /// any other code. A commit that fails keeps the pieces, of up to 32 MiB each, that succeeded.
    static void* Alloc(void* address, unsigned long size, unsigned long type, unsigned long* handle);

    /// Decommits pages, or releases a range.
    /// @param address decommit: the first byte; release: the base of the range
    /// @param size decommit: bytes, up to 2^32 - 1, rounded out to whole pages; 0 does nothing and returns 0,
    /// not reported. Release: not used
    /// @param type 0x4000 decommits, 0x8000 releases
    /// @param handle not used
    /// @return not 0 on success, 0 on failure and for any other code
    static int Free(void* address, unsigned long size, unsigned long type, unsigned long handle);
};

/// Anonymous mapped memory: each reservation is usable as a whole at once and reads as zero.
/// Threads: thread-safe; calls on one range must not overlap in time.
class BASALT_API vlMMapFileAllocator {
public:
    /// Reserves a view; committing does nothing.
    /// @param address commit: returned; reserve: not used
    /// @param size reserve: bytes, 1 to 2^32 - 1; commit: not used
    /// @param type 0x1000 commits, 0x2000 reserves
    /// @param handle reserve: receives the handle that Free needs to release the view, 0 on failure; commit:
    /// not used
    /// @return reserve: the view, null on failure (not reported) and for a null `handle`; commit: `address`;
    /// null for any other code
    static void* Alloc(void* address, unsigned long size, unsigned long type, unsigned long* handle);

    /// Releases a view; decommitting does nothing.
    /// @param address release: the view; decommit: not used
    /// @param size not used
    /// @param type 0x4000 decommits, 0x8000 releases
    /// @param handle release: the handle from Alloc; decommit: not used
    /// @return decommit: 1; release: not 0 on success, 0 when the view or the handle is not valid, which is
    /// reported; 0 for any other code
    static int Free(void* address, unsigned long size, unsigned long type, unsigned long handle);
};

}  // namespace vex_lib

#endif
