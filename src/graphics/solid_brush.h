/// @file
/// A brush of one colour, deleted at the end.
#ifndef BASALT_SRC_GRAPHICS_SOLID_BRUSH_H
#define BASALT_SRC_GRAPHICS_SOLID_BRUSH_H

#include "basalt/platform/graphics_objects.h"

namespace basalt::graphics {

class SolidBrush {
public:
    explicit SolidBrush(COLORREF colour) : m_brush(CreateSolidBrush(colour)) {}
    ~SolidBrush() {
        if (m_brush != nullptr) {
            DeleteObject(m_brush);
        }
    }
    SolidBrush(const SolidBrush&) = delete;
    SolidBrush& operator=(const SolidBrush&) = delete;

    bool is_ready() const { return m_brush != nullptr; }
    HBRUSH get() const { return m_brush; }

private:
    HBRUSH m_brush;
};

}  // namespace basalt::graphics

#endif
