// Anonymous memory of the system, in whole pages, readable and writable.
//
// Sizes are in bytes and multiples of page_size(). Nothing is touched: a page costs memory from its
// first use on. No call sets the last error. Threads: thread-safe.
#ifndef BASALT_SRC_PLATFORM_PAGES_H
#define BASALT_SRC_PLATFORM_PAGES_H

#include <cstddef>

namespace basalt::platform {

inline constexpr std::size_t LARGE_PAGE = std::size_t{2} << 20;
inline constexpr std::size_t SMALLEST_PAGE = 4096;  // of any system; asking for the true one costs a call

std::size_t page_size() noexcept;

// The size brought up to whole pages; within a page of 2^64 it comes to 0.
std::size_t whole_pages(std::size_t size) noexcept;

// Maps zeroed memory whose address is a multiple of alignment (a power of two, at least a page).
// Null when the system has none; nothing stays mapped then.
std::byte* map_pages(std::size_t size, std::size_t alignment) noexcept;

// The same of address space alone, which may not be touched.
std::byte* reserve_pages(std::size_t size, std::size_t alignment) noexcept;

// Gives memory back. False when the system refuses (it may for want of bookkeeping): still mapped then.
bool unmap_pages(std::byte* pages, std::size_t size) noexcept;

// Changes the size of a mapping, moving it where it must, contents kept without copying them.
// Null when the system refuses; the mapping is as it was then.
std::byte* remap_pages(std::byte* pages, std::size_t old_size, std::size_t new_size) noexcept;

// Gives back what the whole pages within a span hold, keeping them mapped; they read as zero afterwards.
void discard_pages(std::byte* begin, std::byte* end) noexcept;

// Asks for large pages: one fault for 512 pages.
void prefer_large_pages(std::byte* pages, std::size_t size) noexcept;

}  // namespace basalt::platform

#endif
