/// @file
/// A growable buffer of bytes.
#ifndef BASALT_MEMORY_BUFFER_H
#define BASALT_MEMORY_BUFFER_H

#include <cstdint>

#include "basalt/export.h"

namespace vex_lib {

/// A block of the general-purpose heap that can be resized. Growth may be rounded up in steps, so that a
/// buffer that grows a little at a time is reallocated once a step.
///
/// With a step, a size of n is rounded up to the next multiple of the step above n, which for a multiple is a
/// whole step more: with a step of 64, 100 gives 128 and 128 gives 192. Sizes have 32 bits: a request that is
/// larger, or rounds up to more, is refused. Failures are not reported and nothing throws.
/// Threads: one buffer is used by one thread at a time.
class BASALT_API vlVmBuffer {
public:
    /// A block of `initialSize` bytes, contents undefined, rounded up by `step`; a step of 0 rounds nothing.
    /// The buffer is empty when out of memory, and for a size of 0 without a step. With a step above 2^32 - 1
    /// every growth is refused. `reserve` has no effect.
    vlVmBuffer(unsigned long initialSize, unsigned long reserve, unsigned long step);
    ~vlVmBuffer();

    /// The block has one owner: copies are refused.
    vlVmBuffer(const vlVmBuffer&) = delete;
    vlVmBuffer& operator=(const vlVmBuffer&) = delete;

    /// Resizes the block to `newSize` bytes, rounded up by the step when it grows. Contents are kept up to
    /// the smaller size, perhaps at another address; the same size changes nothing.
    /// @return the block; null when the buffer is now empty (a size of 0), and on failure, which leaves the
    /// buffer unchanged
    void* ReSize(std::uint64_t newSize);

    /// The block, null when empty. Valid until the size changes.
    void* GetData() const;

    /// A fixed exercise of growing arrays, for profiling: five times, 10,000 records of six doubles are
    /// appended one by one to a new array, which is then assigned to one that is kept. Leaves nothing behind;
    /// ends early when out of memory. Threads: reentrant.
    static void Test();

private:
    BASALT_LOCAL bool round_up(std::uint64_t& size) const;
    BASALT_LOCAL void* Alloc(std::uint64_t, std::uint64_t size);
    BASALT_LOCAL void Free(void*);

    void* m_data = nullptr;
    std::uint32_t m_size = 0;
    std::uint32_t m_step;
    [[maybe_unused]] std::uint32_t m_reserve;
    bool m_step_fits;
};

}  // namespace vex_lib

#endif
