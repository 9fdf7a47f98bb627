/// @file
/// Contexts and surfaces in memory that are released on every way out.
#ifndef BASALT_SRC_GRAPHICS_OWNED_OBJECTS_H
#define BASALT_SRC_GRAPHICS_OWNED_OBJECTS_H

#include "basalt/platform/bitmap.h"
#include "basalt/platform/device_context.h"

namespace basalt::graphics {

/// A memory context with a bitmap of the caller selected into it until the end.
class MemoryContext {
public:
    /// @param like a context to be compatible with
    /// @param bitmap stays the caller's
    MemoryContext(HDC like, HBITMAP bitmap) {
        m_dc.Attach(CreateCompatibleDC(like));
        m_before = SelectObject(m_dc, bitmap);
    }
    ~MemoryContext() {
        if (m_before != nullptr) {
            SelectObject(m_dc, m_before);
        }
    }
    MemoryContext(const MemoryContext&) = delete;
    MemoryContext& operator=(const MemoryContext&) = delete;

    /// Whether there is a context and the bitmap is selected into it.
    bool is_ready() const { return m_before != nullptr; }
    HDC dc() const { return m_dc; }

private:
    CDC m_dc;
    HGDIOBJ m_before = nullptr;
};

/// A memory context with a bitmap of its own.
class MemorySurface {
public:
    /// @param like a context to be compatible with
    /// @param bitmap owned from now on
    MemorySurface(HDC like, HBITMAP bitmap) : m_context(like, bitmap) { m_bitmap.Attach(bitmap); }

    bool is_ready() const { return m_context.is_ready(); }
    HDC dc() const { return m_context.dc(); }

private:
    CBitmap m_bitmap;  // outlives the context it is selected into
    MemoryContext m_context;
};

}  // namespace basalt::graphics

#endif
