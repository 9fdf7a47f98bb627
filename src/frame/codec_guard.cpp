#include "src/frame/codec_guard.h"

#include "src/platform/codec.h"

namespace basalt::frame {

CodecGuard::~CodecGuard() {
    // In a forked child the lock may be held by a thread that does not exist there.
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
        const GdiplusStartupInput input = {1, nullptr, 0, 0};
        if (GdiplusStartup(&m_token, &input, nullptr) != Gdiplus::Ok) {
            m_token = 0;
        }
    }
    return m_token != 0;
}

void CodecGuard::ShutDown() {
    if (m_token != 0) {
        GdiplusShutdown(m_token);
        m_token = 0;
    }
}

}  // namespace basalt::frame
