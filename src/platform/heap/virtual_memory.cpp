#include "src/platform/virtual_memory.h"

#include <sys/mman.h>

#include <cerrno>
#include <cstdint>

#include "basalt/platform/error.h"
#include "src/platform/pages.h"
#include "src/platform/system/failure.h"
#include "src/platform/system/no_destructor.h"
#include "src/platform/system/registry.h"

namespace basalt::platform {
namespace {

constexpr std::uintptr_t GRANULARITY = std::uintptr_t{64} << 10;  // of the bases of reservations

// Addresses from `base` up to `end`.
struct Range {
    std::uintptr_t base = 0;
    std::uintptr_t end = 0;

    std::size_t size() const noexcept { return end - base; }
    bool is_within(const Range& outer) const noexcept { return base >= outer.base && end <= outer.end; }
    std::byte* pages() const noexcept { return reinterpret_cast<std::byte*>(base); }
};

using Reservations = Registry<std::uintptr_t, Range>;  // by base

Reservations& reservations() noexcept {
    static NoDestructor<Reservations> s_reservations;
    return *s_reservations;
}

// Rounds a range out to whole pages, its front to a multiple of `front`. False beyond the last address.
bool round_out(const void* address, std::size_t size, std::uintptr_t front, Range& range) noexcept {
    const auto start = reinterpret_cast<std::uintptr_t>(address);
    if (size > UINTPTR_MAX - start) {
        return false;
    }
    range.base = start & ~(front - 1);
    range.end = whole_pages(start + size);
    return range.end > range.base;
}

DWORD reserve(void* address, std::size_t size, Range& range) {
    Reservations::Entry reservation = Reservations::make_entry({});
    if (address == nullptr) {
        std::byte* const pages = reserve_pages(whole_pages(size), GRANULARITY);
        if (pages == nullptr) {
            return ERROR_NOT_ENOUGH_MEMORY;
        }
        range.base = reinterpret_cast<std::uintptr_t>(pages);
        range.end = range.base + whole_pages(size);
    } else {
        if (!round_out(address, size, GRANULARITY, range)) {
            return ERROR_INVALID_ADDRESS;
        }
        void* const pages = mmap(range.pages(), range.size(), PROT_NONE,
                                 MAP_PRIVATE | MAP_ANONYMOUS | MAP_FIXED_NOREPLACE, -1, 0);
        if (pages == MAP_FAILED) {
            return errno == ENOMEM ? ERROR_NOT_ENOUGH_MEMORY : ERROR_INVALID_ADDRESS;
        }
        if (pages != range.pages()) {  // systems before 4.17 may choose another
            munmap(pages, range.size());
            return ERROR_INVALID_ADDRESS;
        }
    }
    reservation.mapped() = range;
    reservations().add(range.base, reservation);
    return ERROR_SUCCESS;
}

// The pages of a range within one reservation. False for any other.
bool find_reserved(const void* address, std::size_t size, Range& range) noexcept {
    return round_out(address, size, page_size(), range) &&
           range.is_within(reservations().find_last_up_to(range.base));
}

DWORD commit(const void* address, std::size_t size, Range& range) noexcept {
    if (!find_reserved(address, size, range)) {
        return ERROR_INVALID_ADDRESS;
    }
    return mprotect(range.pages(), range.size(), PROT_READ | PROT_WRITE) == 0 ? ERROR_SUCCESS
                                                                              : ERROR_NOT_ENOUGH_MEMORY;
}

DWORD decommit(const void* address, std::size_t size) noexcept {
    Range range;
    if (!find_reserved(address, size, range)) {
        return ERROR_INVALID_ADDRESS;
    }
    // New pages in one step: madvise() refuses to drop locked pages.
    void* const pages =
        mmap(range.pages(), range.size(), PROT_NONE, MAP_PRIVATE | MAP_ANONYMOUS | MAP_FIXED, -1, 0);
    return pages != MAP_FAILED ? ERROR_SUCCESS : ERROR_NOT_ENOUGH_MEMORY;
}

DWORD release(const void* base) noexcept {
    Reservations::Entry reservation = reservations().take(reinterpret_cast<std::uintptr_t>(base));
    if (reservation.empty()) {
        return ERROR_INVALID_ADDRESS;
    }
    // Unregistered before it is unmapped: from then on another thread may be given its addresses.
    const Range range = reservation.mapped();
    if (!unmap_pages(range.pages(), range.size())) {
        reservations().add(range.base, reservation);
        return ERROR_NOT_ENOUGH_MEMORY;
    }
    return ERROR_SUCCESS;
}

}  // namespace
}  // namespace basalt::platform

using basalt::platform::fail_with;
using basalt::platform::or_out_of_memory;
using basalt::platform::Range;

void* VirtualAlloc(void* address, std::size_t size, DWORD type, DWORD /*protection*/) {
    using Address = void*;
    const bool commits = type == MEM_COMMIT;
    if (size == 0) {
        return fail_with(ERROR_INVALID_PARAMETER, Address{});
    }
    return or_out_of_memory(Address{}, [&] {
        Range range;
        DWORD error = ERROR_SUCCESS;
        if (!commits || address == nullptr) {
            error = basalt::platform::reserve(address, size, range);
        }
        const bool is_new = error == ERROR_SUCCESS && address == nullptr;
        if (error == ERROR_SUCCESS && commits) {
            error = basalt::platform::commit(is_new ? range.pages() : address, size, range);
            if (error != ERROR_SUCCESS && is_new) {
                basalt::platform::release(range.pages());
            }
        }
        return error == ERROR_SUCCESS ? Address{range.pages()} : fail_with(error, Address{});
    });
}

BOOL VirtualFree(void* address, std::size_t size, DWORD type) {
    const DWORD error =
        type == MEM_DECOMMIT ? basalt::platform::decommit(address, size) : basalt::platform::release(address);
    return error == ERROR_SUCCESS ? 1 : fail_with(error, 0);
}
