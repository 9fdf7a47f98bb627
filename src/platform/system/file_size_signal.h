// Keeps the signal of the limit on file sizes away from calls that make a file longer.
#ifndef BASALT_SRC_PLATFORM_SYSTEM_FILE_SIZE_SIGNAL_H
#define BASALT_SRC_PLATFORM_SYSTEM_FILE_SIZE_SIGNAL_H

#include <signal.h>

#include <ctime>

namespace basalt::platform {

// Beyond the limit the system sends SIGXFSZ to the calling thread, which ends the process unless the host has
// arranged for it, and fails the call with EFBIG, which is all that is wanted. While one lives the signal is
// blocked for this thread, and what came meanwhile is taken away at the end. The host's disposition stays
// untouched, and so does a signal that was waiting before.
class SigxfszBlocker {
public:
    SigxfszBlocker() noexcept {
        sigset_t waiting;
        sigemptyset(&waiting);
        sigpending(&waiting);
        m_was_waiting = sigismember(&waiting, SIGXFSZ) == 1;
        sigemptyset(&m_signal);
        sigaddset(&m_signal, SIGXFSZ);
        pthread_sigmask(SIG_BLOCK, &m_signal, &m_mask_before);
    }

    ~SigxfszBlocker() {
        constexpr timespec AT_ONCE = {0, 0};
        if (!m_was_waiting) {
            sigtimedwait(&m_signal, nullptr, &AT_ONCE);
        }
        pthread_sigmask(SIG_SETMASK, &m_mask_before, nullptr);
    }

    SigxfszBlocker(const SigxfszBlocker&) = delete;
    SigxfszBlocker& operator=(const SigxfszBlocker&) = delete;

private:
    sigset_t m_signal;
    sigset_t m_mask_before;
    bool m_was_waiting;
};

}  // namespace basalt::platform

#endif
