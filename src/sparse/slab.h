// Memory of the sparse array in large pieces.
#ifndef BASALT_SRC_SPARSE_SLAB_H
#define BASALT_SRC_SPARSE_SLAB_H

#include <cstddef>
#include <limits>
#include <new>
#include <utility>

#include "src/platform/pages.h"

namespace vex_util {

inline constexpr std::size_t CACHE_LINE = 64;

// About the given number of bytes, aligned to a cache line, untouched. On large pages if it fills most of
// them: faults on small pages would cost more than everything else an insertion does.
class Slab {
public:
    Slab() noexcept = default;
    // The bytes, at least one unit, are rounded up to whole large pages, or down to whole units if more than
    // an eighth of the large pages would be lost. Throws std::bad_alloc.
    explicit Slab(std::size_t bytes, std::size_t unit = 1) : m_bytes(bytes / unit * unit) {
        using namespace basalt::platform;
        if (bytes > std::numeric_limits<std::ptrdiff_t>::max()) {
            throw std::bad_alloc();
        }
        const std::size_t large = (bytes + LARGE_PAGE - 1) & ~(LARGE_PAGE - 1);
        const std::size_t lost = bytes == unit ? large - bytes : large % unit;
        if (bytes >= LARGE_PAGE / 4 && lost <= large / 8) {
            m_bytes = large;
        }
        const std::size_t on_large_pages = m_bytes & ~(LARGE_PAGE - 1);
        if (on_large_pages != 0) {
            m_alignment = std::align_val_t{LARGE_PAGE};
        }
        m_begin = static_cast<std::byte*>(::operator new[](m_bytes, m_alignment));
        if (on_large_pages != 0) {
            prefer_large_pages(m_begin, on_large_pages);
        }
    }
    ~Slab() { ::operator delete[](m_begin, m_alignment); }
    Slab(Slab&& other) noexcept { Swap(other); }
    Slab& operator=(Slab&& other) noexcept {
        Slab(std::move(other)).Swap(*this);
        return *this;
    }

    std::byte* Begin() const noexcept { return m_begin; }
    std::size_t Bytes() const noexcept { return m_bytes; }

    void Swap(Slab& other) noexcept {
        std::swap(m_begin, other.m_begin);
        std::swap(m_bytes, other.m_bytes);
        std::swap(m_alignment, other.m_alignment);
    }

private:
    std::byte* m_begin = nullptr;
    std::size_t m_bytes = 0;
    std::align_val_t m_alignment{CACHE_LINE};
};

}  // namespace vex_util

#endif
