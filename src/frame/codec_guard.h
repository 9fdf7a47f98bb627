// Start-up guard of the image codec: shares one run of the codec among all live image objects.
#ifndef BASALT_SRC_FRAME_CODEC_GUARD_H
#define BASALT_SRC_FRAME_CODEC_GUARD_H

#include <cstdint>
#include <mutex>

#include "basalt/platform/error.h"
#include "basalt/platform/types.h"

namespace basalt::frame {

// How a codec is started and shut down.
struct CodecCalls {
    std::uintptr_t (*start)();                // a token, 0 when the codec does not start
    void (*shut_down)(std::uintptr_t token);  // ends the run that gave the token
};

// The order of use: AddImage, Start, the codec's own calls, ReleaseImage. Every operation is thread-safe;
// the lock is held while the codec starts and shuts down, so the calls may not use the guard.
class CodecGuard {
public:
    // lock_error: the platform's error where the lock could not be made, for a platform whose locks can
    // fail; the codec then never starts, quietly. This one's are part of the object.
    constexpr explicit CodecGuard(const CodecCalls& calls, DWORD lock_error = ERROR_SUCCESS)
        : m_calls(calls), m_last_error(HRESULT_FROM_WIN32(lock_error)) {}
    // Shuts the codec down if it is running, however many images are still alive.
    ~CodecGuard();
    CodecGuard(const CodecGuard&) = delete;
    CodecGuard& operator=(const CodecGuard&) = delete;

    // Counts one more live image.
    void AddImage();
    // Counts one fewer; the last shuts the codec down if it is running. Without a live image: nothing.
    void ReleaseImage();
    // Starts the codec unless it is running; whether it is running then.
    bool Start();

    // 0, or the result code that keeps the codec from starting.
    HRESULT LastError() const { return m_last_error; }

private:
    void ShutDown();

    const CodecCalls m_calls;
    std::mutex m_lock;
    std::uintptr_t m_token = 0;  // 0: not started
    std::uint32_t m_live_images = 0;
    const HRESULT m_last_error;
};

// The module's own.
extern CodecGuard codec_guard;

}  // namespace basalt::frame

#endif
