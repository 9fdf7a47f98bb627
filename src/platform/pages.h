// Anonymous memory of the system, in whole pages, readable and writable.
//
// Sizes are in bytes and multiples of page_size(). Pages take memory at their first use. No call sets the
// last error. Threads: thread-safe.
#ifndef BASALT_SRC_PLATFORM_PAGES_H
#define BASALT_SRC_PLATFORM_PAGES_H

#include <cstddef>

namespace basalt::platform {

inline constexpr std::size_t LARGE_PAGE = std::size_t{2} << 20;
inline constexpr std::size_t SMALLEST_PAGE = 4096;  // of any system; page_size() costs a call

std::size_t page_size() noexcept;

// The size rounded up to whole pages; 0 within a page of 2^64.
std::size_t whole_pages(std::size_t size) noexcept;

// Maps zeroed memory whose address is a multiple of alignment (a power of two, at least a page).
// Null when out of memory, with nothing left mapped.
std::byte* map_pages(std::size_t size, std::size_t alignment) noexcept;

// The same for address space only: its pages are not accessible.
std::byte* reserve_pages(std::size_t size, std::size_t alignment) noexcept;

// Unmaps memory. False when the system refuses, which it may when out of memory itself; still mapped then.
bool unmap_pages(std::byte* pages, std::size_t size) noexcept;

// Resizes a mapping, perhaps to another address, without copying its contents. Null when the system refuses;
// the mapping is unchanged then.
std::byte* remap_pages(std::byte* pages, std::size_t old_size, std::size_t new_size) noexcept;

// Releases the memory of the whole pages within a range; they stay mapped and read as zero.
void discard_pages(std::byte* begin, std::byte* end) noexcept;

// Requests large pages: one page fault instead of 512.
void prefer_large_pages(std::byte* pages, std::size_t size) noexcept;

}  // namespace basalt::platform

#endif
