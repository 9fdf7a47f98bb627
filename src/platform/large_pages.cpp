#include "src/platform/large_pages.h"

#include <sys/mman.h>

#include <cerrno>
#include <cstdint>

namespace basalt::platform {

void advise_large_pages(void* memory, std::size_t bytes) noexcept {
    const auto start = reinterpret_cast<std::uintptr_t>(memory);
    const std::uintptr_t first = (start + LARGE_PAGE_BYTES - 1) & ~(LARGE_PAGE_BYTES - 1);
    const std::uintptr_t last = (start + bytes) & ~(LARGE_PAGE_BYTES - 1);
    if (first >= last) {
        return;
    }
    const int error_before = errno;
    madvise(reinterpret_cast<void*>(first), last - first, MADV_HUGEPAGE);  // refusal changes nothing
    errno = error_before;
}

}  // namespace basalt::platform
