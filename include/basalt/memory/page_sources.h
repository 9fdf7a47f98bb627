/// @file
/// Page sources: where a container that reserves a large range of addresses and commits it piece by piece
/// gets its pages from.
///
/// Both classes are pairs of functions of one form. What they do is said by a code:
/// commit 0x1000 and reserve 0x2000 for Alloc, decommit 0x4000 and release 0x8000 for Free.
#ifndef BASALT_MEMORY_PAGE_SOURCES_H
#define BASALT_MEMORY_PAGE_SOURCES_H

#include "basalt/export.h"

namespace vex_lib {

/// Pages of virtual memory. A reservation costs addresses alone; committed pages read as zero at first, and
/// again after they were decommitted and committed anew.
///
/// Failures are reported to the debugger output (see basalt/memory/allocators.h), but for codes that are not
/// served. More than 2^32 - 1 bytes are refused in this way too.
/// Threads: thread-safe; who works on one range from several threads keeps them apart.
class BASALT_API vlSharedMemoryAllocator {
public:
    /// Reserves a range, or commits pages of one.
    /// @param address reserve: where the range is to begin, brought down to a multiple of 64 KiB, or null for
    ///        anywhere; commit: the first byte to use; null reserves the first
    ///        piece as well, and any further one fails
    /// @param size bytes, up to 2^32 - 1, whose pages are reserved or committed whole; committing 0 does
    ///        nothing and gives null, unreported
    /// @param type 0x1000 commits, 0x2000 reserves
    /// @param handle not used, may be null
    /// @return reserve: the base of the range; commit: the base of the first page; null on failure and for
    ///         any other code. A commit that fails keeps the pieces, of up to 32 MiB each, that succeeded.
    static void* Alloc(void* address, unsigned long size, unsigned long type, unsigned long* handle);

    /// Decommits pages, or releases a range.
    /// @param address decommit: the first byte to give up; release: the base of the range
    /// @param size decommit: bytes, up to 2^32 - 1, whose pages are given up whole; 0 does nothing and gives
    ///        0, unreported. Release: not used
    /// @param type 0x4000 decommits, 0x8000 releases
    /// @param handle not used
    /// @return not 0 on success, 0 on failure and for any other code
    static int Free(void* address, unsigned long size, unsigned long type, unsigned long handle);
};

/// Views of memory of its own: each reservation is usable as a whole at once and reads as zero.
/// Threads: thread-safe; who works on one range from several threads keeps them apart.
class BASALT_API vlMMapFileAllocator {
public:
    /// Reserves a view, or returns what is usable anyway.
    /// @param address commit: given back; reserve: not used
    /// @param size reserve: bytes, 1 to 2^32 - 1; commit: not used
    /// @param type 0x1000 commits, 0x2000 reserves
    /// @param handle reserve: receives what Free needs to release the view, 0 on failure; commit: not used
    /// @return reserve: the view, null on failure (unreported) and for a null `handle`; commit: `address`;
    ///         null for any other code
    static void* Alloc(void* address, unsigned long size, unsigned long type, unsigned long* handle);

    /// Releases a view; its pages cannot be given up one by one, so decommitting does nothing.
    /// @param address release: the view; decommit: not used
    /// @param size not used
    /// @param type 0x4000 decommits, 0x8000 releases
    /// @param handle release: what Alloc stored for this view; decommit: not used
    /// @return decommit: 1; release: not 0 on success, 0 when the view or the handle is not valid, which is
    ///         reported; 0 for any other code
    static int Free(void* address, unsigned long size, unsigned long type, unsigned long handle);
};

}  // namespace vex_lib

#endif
