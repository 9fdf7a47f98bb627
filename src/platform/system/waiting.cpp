#include "src/platform/system/waiting.h"

#include <linux/futex.h>
#include <linux/membarrier.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace basalt::platform {
namespace {

void futex(std::atomic<std::uint32_t>& word, int operation, std::uint32_t value,
           const timespec* period) noexcept {
    static_assert(sizeof(word) == sizeof(std::uint32_t) && std::atomic<std::uint32_t>::is_always_lock_free);
    syscall(SYS_futex, &word, operation, value, period, nullptr, 0);
}

}  // namespace

void sleep_on(std::atomic<std::uint32_t>& word, std::uint32_t value, const timespec* period) noexcept {
    futex(word, FUTEX_WAIT_PRIVATE, value, period);
}

void wake_one_on(std::atomic<std::uint32_t>& word) noexcept {
    futex(word, FUTEX_WAKE_PRIVATE, 1, nullptr);
}

bool barrier_on_all_threads() noexcept {
    if (syscall(SYS_membarrier, MEMBARRIER_CMD_PRIVATE_EXPEDITED, 0, 0) == 0) {
        return true;
    }
    // A process has to register once; asking again is harmless.
    return errno == EPERM && syscall(SYS_membarrier, MEMBARRIER_CMD_REGISTER_PRIVATE_EXPEDITED, 0, 0) == 0 &&
           syscall(SYS_membarrier, MEMBARRIER_CMD_PRIVATE_EXPEDITED, 0, 0) == 0;
}

}  // namespace basalt::platform
