#include "src/frame/codec_guard.h"

namespace basalt::frame {

CodecGuard::~CodecGuard() {
    const std::lock_guard hold(m_lock);
    ShutDown();
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
