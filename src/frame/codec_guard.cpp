#include "src/frame/codec_guard.h"

namespace basalt::frame {

CodecGuard::~CodecGuard() {
    // In a forked child a thread that is not there may hold it for ever.
    if (const std::unique_lock hold(m_lock, std::try_to_lock); hold) {
        ShutDown();
    }
}

void CodecGuard::AddImage() {
    const std::lock_guard hold(m_lock);
    ++m_live_images;
}

void CodecGuard::ReleaseImage() {
    const std::lock_guard hold(m_lock);
    if (m_live_images > 0 && --m_live_images == 0) {
        ShutDown();
    }
}

bool CodecGuard::Start() {
    if (m_last_error != 0) {
        return false;
    }
    const std::lock_guard hold(m_lock);
    if (m_token == 0) {
        m_token = m_calls.start();
    }
    return m_token != 0;
}

void CodecGuard::ShutDown() {
    if (m_token != 0) {
        m_calls.shut_down(m_token);
        m_token = 0;
    }
}

}  // namespace basalt::frame
