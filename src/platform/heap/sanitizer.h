// Reports the use of a heap's regions to AddressSanitizer, so that overruns and uses after free are found as
// they are for malloc. Empty functions without the sanitizer.
#ifndef BASALT_SRC_PLATFORM_HEAP_SANITIZER_H
#define BASALT_SRC_PLATFORM_HEAP_SANITIZER_H

#include <cstddef>

#if defined(__SANITIZE_ADDRESS__)
#define BASALT_ADDRESS_SANITIZER 1
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
#define BASALT_ADDRESS_SANITIZER 1
#endif
#endif

#ifdef BASALT_ADDRESS_SANITIZER
#include <sanitizer/asan_interface.h>
#include <sanitizer/lsan_interface.h>
#endif

namespace basalt::platform {

#ifdef BASALT_ADDRESS_SANITIZER

// Poisoned bytes behind every block.
inline constexpr std::size_t GUARD_BYTES = 16;

inline void forbid_access(const void* begin, std::size_t size) {
    __asan_poison_memory_region(begin, size);
}
inline void permit_access(const void* begin, std::size_t size) {
    __asan_unpoison_memory_region(begin, size);
}

// Regions are roots of the leak check: what heap blocks point to is reachable.
inline void enter_region(const void* begin, std::size_t size) {
    __lsan_register_root_region(begin, size);
    forbid_access(begin, size);
}
inline void leave_region(const void* begin, std::size_t size) {
    __lsan_unregister_root_region(begin, size);
    permit_access(begin, size);
}

#else

inline constexpr std::size_t GUARD_BYTES = 0;

inline void forbid_access(const void*, std::size_t) {}
inline void permit_access(const void*, std::size_t) {}
inline void enter_region(const void*, std::size_t) {}
inline void leave_region(const void*, std::size_t) {}

#endif

}  // namespace basalt::platform

#endif
