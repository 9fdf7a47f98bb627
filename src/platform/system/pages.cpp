#include "src/platform/pages.h"

#include <sys/mman.h>
#include <unistd.h>

#include <cstdint>

namespace basalt::platform {
namespace {

std::byte* map_anywhere(std::size_t size, int protection) noexcept {
    void* pages = mmap(nullptr, size, protection, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0);
    return pages == MAP_FAILED ? nullptr : static_cast<std::byte*>(pages);
}

std::size_t distance_to_multiple(const std::byte* pages, std::size_t alignment) noexcept {
    return (0 - reinterpret_cast<std::uintptr_t>(pages)) & (alignment - 1);
}

std::byte* map_aligned(std::size_t size, std::size_t alignment, int protection) noexcept {
    std::byte* pages = map_anywhere(size, protection);
    if (pages == nullptr || distance_to_multiple(pages, alignment) == 0) {
        return pages;
    }
    unmap_pages(pages, size);
    const std::size_t padded = size + alignment;
    pages = map_anywhere(padded, protection);
    if (pages == nullptr) {
        return nullptr;
    }
    const std::size_t before = distance_to_multiple(pages, alignment);
    if (before != 0 && !unmap_pages(pages, before)) {
        unmap_pages(pages, padded);
        return nullptr;
    }
    std::byte* aligned = pages + before;
    if (!unmap_pages(aligned + size, padded - before - size)) {
        unmap_pages(aligned, padded - before);
        return nullptr;
    }
    return aligned;
}

}  // namespace

std::size_t page_size() noexcept {
    return static_cast<std::size_t>(sysconf(_SC_PAGESIZE));
}

std::size_t whole_pages(std::size_t size) noexcept {
    const std::size_t page = page_size();
    return (size + page - 1) & ~(page - 1);
}

std::byte* map_pages(std::size_t size, std::size_t alignment) noexcept {
    return map_aligned(size, alignment, PROT_READ | PROT_WRITE);
}

std::byte* reserve_pages(std::size_t size, std::size_t alignment) noexcept {
    return map_aligned(size, alignment, PROT_NONE);
}

bool unmap_pages(std::byte* pages, std::size_t size) noexcept {
    return munmap(pages, size) == 0;
}

std::byte* remap_pages(std::byte* pages, std::size_t old_size, std::size_t new_size) noexcept {
    void* moved = mremap(pages, old_size, new_size, MREMAP_MAYMOVE);
    return moved == MAP_FAILED ? nullptr : static_cast<std::byte*>(moved);
}

void discard_pages(std::byte* begin, std::byte* end) noexcept {
    const std::size_t page = page_size();
    std::byte* first = begin + distance_to_multiple(begin, page);
    std::byte* last = end - (reinterpret_cast<std::uintptr_t>(end) & (page - 1));
    if (first < last) {
        // A refusal costs memory, not correctness.
        (void)madvise(first, static_cast<std::size_t>(last - first), MADV_DONTNEED);
    }
}

void prefer_large_pages(std::byte* pages, std::size_t size) noexcept {
    (void)madvise(pages, size, MADV_HUGEPAGE);
}

}  // namespace basalt::platform
