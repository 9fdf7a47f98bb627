/// @file
/// The screen's context, given back at the end.
#ifndef BASALT_SRC_GRAPHICS_SCREEN_CONTEXT_H
#define BASALT_SRC_GRAPHICS_SCREEN_CONTEXT_H

#include "basalt/platform/device_context.h"

namespace basalt::graphics {

class ScreenContext {
public:
    ScreenContext() = default;
    ~ScreenContext() {
        if (m_dc != nullptr) {
            ReleaseDC(nullptr, m_dc);
        }
    }
    ScreenContext(const ScreenContext&) = delete;
    ScreenContext& operator=(const ScreenContext&) = delete;
    HDC dc() const { return m_dc; }

private:
    HDC m_dc = GetDC(nullptr);
};

}  // namespace basalt::graphics

#endif
