// Start-up guard of the image codec: all live image objects share one run of it.
#ifndef BASALT_SRC_FRAME_CODEC_GUARD_H
#define BASALT_SRC_FRAME_CODEC_GUARD_H

#include <cstdint>
#include <mutex>

#include "basalt/platform/error.h"
#include "basalt/platform/types.h"

namespace basalt::frame {

// Order of use: AddImage, Start, the codec's own calls, ReleaseImage. Threads: thread-safe; the lock is held
// while the codec starts and shuts down.
class CodecGuard {
public:
    // lock_error: the error of a platform on which the lock could not be created; the codec then never
    // starts. The lock here is part of the object and cannot fail.
    constexpr explicit CodecGuard(DWORD lock_error = ERROR_SUCCESS)
        : m_last_error(HRESULT_FROM_WIN32(lock_error)) {}
    // Shuts down a running codec, whatever images are still alive.
    ~CodecGuard();
    CodecGuard(const CodecGuard&) = delete;
    CodecGuard& operator=(const CodecGuard&) = delete;

    // Counts one more live image.
    void AddImage();
    // Counts one fewer; the last shuts down a running codec. Ignored if no image is alive.
    void ReleaseImage();
    // Starts the codec unless it is running; returns whether it is running then.
    bool Start();

    // 0, or the result code that keeps the codec from starting.
    HRESULT LastError() const { return m_last_error; }

private:
    void ShutDown();

    std::mutex m_lock;
    std::uintptr_t m_token = 0;  // 0: not started
    std::uint32_t m_live_images = 0;
    const HRESULT m_last_error;
};

// The guard of all image objects, constructed at load.
extern CodecGuard codec_guard;

}  // namespace basalt::frame

#endif
