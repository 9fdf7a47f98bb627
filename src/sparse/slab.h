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

// About so many bytes on a cache line's boundary, for whole units. On large pages where they fill one to a
// fair part: faults on ordinary pages would cost more than everything an insertion does. Untouched, and
// without memory of its own until it is used.
class Slab {
public:
    Slab() noexcept = default;
    // The bytes, a unit at least, are brought up to whole large pages; down to whole units where more than an
    // eighth of those could not be used, by any unit or by the only one. Throws std::bad_alloc.
    explicit Slab(std::size_t bytes, std::size_t unit = 1) : m_bytes(bytes / unit * unit) {
        using namespace basalt::platform;
        if (bytes > std::numeric_limits<std::ptrdiff_t>::max()) {
            throw std::bad_alloc();
        }
        const std::size_t large = (bytes + LARGE_PAGE - 1) & ~(LARGE_PAGE - 1);
        const std::size_t idle = bytes == unit ? large - bytes : large % unit;
        if (bytes >= LARGE_PAGE / 4 && idle <= large / 8) {
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

private:
    void Swap(Slab& other) noexcept {
        std::swap(m_begin, other.m_begin);
        std::swap(m_bytes, other.m_bytes);
        std::swap(m_alignment, other.m_alignment);
    }

    std::byte* m_begin = nullptr;
    std::size_t m_bytes = 0;
    std::align_val_t m_alignment{CACHE_LINE};
};

}  // namespace vex_util

#endif
