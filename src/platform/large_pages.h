// Large pages for big pools.
#ifndef BASALT_SRC_PLATFORM_LARGE_PAGES_H
#define BASALT_SRC_PLATFORM_LARGE_PAGES_H

#include <cstddef>

namespace basalt::platform {

inline constexpr std::size_t LARGE_PAGE_BYTES = std::size_t{2} << 20;

// Asks the system to back the memory with large pages as it is first touched. A wish, not a demand: where it
// is not granted, ordinary pages serve. Only whole large pages inside the range are affected.
void advise_large_pages(void* memory, std::size_t bytes) noexcept;

}  // namespace basalt::platform

#endif
