/// @file
/// Device contexts: a surface and the settings drawn with. basalt/platform/graphics_objects.h has what holds
/// for all handles.
#ifndef BASALT_PLATFORM_DEVICE_CONTEXT_H
#define BASALT_PLATFORM_DEVICE_CONTEXT_H

#include "basalt/export.h"
#include "basalt/platform/bitmap.h"
#include "basalt/platform/drawing.h"
#include "basalt/platform/graphics_objects.h"
#include "basalt/platform/graphics_types.h"

/// @name Contexts
/// @{

/// A memory context: a monochrome surface of one pixel, black text on white, white brush, no transform.
/// @param dc a context to be compatible with, or null for the screen; all are compatible
/// @return null for a wrong context and on failure
BASALT_API HDC CreateCompatibleDC(HDC dc);

/// Deletes a memory context. Objects selected into it stay and are free again.
/// @return nonzero; 0 for a wrong handle and for a context of GetDC
BASALT_API BOOL DeleteDC(HDC dc);

/// A context of the screen: 32 bits, with no pixel that can be drawn or read.
/// @param window null
/// @return null for a window (ERROR_INVALID_HANDLE) and on failure
BASALT_API HDC GetDC(HWND__* window);

/// Deletes a context of GetDC.
/// @return 1; 0 for any other
BASALT_API int ReleaseDC(HWND__* window, HDC dc);

/// Makes a bitmap, brush or stock pen the one that a context uses.
/// @return the object of the same kind used before; null for a wrong handle, for a region, and for a bitmap
/// when the context is the screen's or the bitmap is selected into another context (ERROR_BUSY). The one
/// pixel of a new context is a stock bitmap, which can be selected into any context again.
BASALT_API HGDIOBJ SelectObject(HDC dc, HGDIOBJ object);
/// @}

/// @name Colours
/// For copies between monochrome and colour. CLR_INVALID for a wrong context.
/// @{

/// Sets the background colour; returns the one before.
BASALT_API COLORREF SetBkColor(HDC dc, COLORREF colour);
/// Sets the text colour; returns the one before.
BASALT_API COLORREF SetTextColor(HDC dc, COLORREF colour);
/// @}

/// @name Coordinates
/// @{
inline constexpr int MM_TEXT = 1;              ///< one unit is one pixel, y downwards
inline constexpr int MM_ANISOTROPIC = 8;       ///< units set by the host; here always one pixel
inline constexpr int GM_COMPATIBLE = 1;        ///< no transform
inline constexpr int GM_ADVANCED = 2;          ///< a transform may be set
inline constexpr DWORD MWT_IDENTITY = 1;       ///< back to no transform
inline constexpr DWORD MWT_LEFTMULTIPLY = 2;   ///< the new transform comes before the current one
inline constexpr DWORD MWT_RIGHTMULTIPLY = 3;  ///< the new transform comes after the current one

/// Sets the mapping mode, MM_TEXT or MM_ANISOTROPIC.
/// @return the mode before; 0 for another (ERROR_INVALID_PARAMETER) or a wrong context
BASALT_API int SetMapMode(HDC dc, int mode);
/// The mapping mode; 0 for a wrong context.
BASALT_API int GetMapMode(HDC dc);

/// Converts pixels to the context's own coordinates: maps points back through the transform, rounded to the
/// nearest whole number.
/// @return nonzero; 0, with the points unchanged, for a wrong context, a negative count, a null pointer to
/// points, or a point whose coordinates would not fit
BASALT_API BOOL DPtoLP(HDC dc, POINT* points, int count);

/// Sets the graphics mode, GM_COMPATIBLE or GM_ADVANCED.
/// @return the mode before; 0 for another, for GM_COMPATIBLE while a transform is set, or a wrong context
BASALT_API int SetGraphicsMode(HDC dc, int mode);

/// Sets the transform from the context's own coordinates to pixels.
/// @return nonzero; 0 in GM_COMPATIBLE, or for a transform that is null, not finite or not invertible
BASALT_API BOOL SetWorldTransform(HDC dc, const XFORM* transform);

/// Combines a transform with the current one. With MWT_LEFTMULTIPLY a point goes through the new one first.
/// @param dc the context
/// @param transform ignored for MWT_IDENTITY
/// @param mode MWT_IDENTITY, MWT_LEFTMULTIPLY or MWT_RIGHTMULTIPLY
/// @return as SetWorldTransform; 0 for another mode too
BASALT_API BOOL ModifyWorldTransform(HDC dc, const XFORM* transform, DWORD mode);
/// @}

/// Owner of a memory context. Contexts of GetDC cannot be owned; ReleaseDC deletes them.
class BASALT_API CDC {
public:
    CDC() = default;
    ~CDC() { DeleteDC(); }
    CDC(const CDC&) = delete;
    CDC& operator=(const CDC&) = delete;

    /// The handle; null when there is none.
    HDC m_hDC = nullptr;

    /// A wrapper that does not own the context; valid as long as the context exists.
    /// @return null for a wrong handle
    static CDC* FromHandle(HDC dc);

    /// The handle; null when there is none.
    HDC GetSafeHdc() const { return m_hDC; }
    /// The handle; null when there is none.
    operator HDC() const { return m_hDC; }

    /// Takes ownership of a context.
    /// @return nonzero; 0, and nothing changes, when the handle is null or a context is owned already
    BOOL Attach(HDC dc) {
        if (dc == nullptr || m_hDC != nullptr) {
            return 0;
        }
        m_hDC = dc;
        return 1;
    }
    /// Releases the context to the caller, who then owns the handle returned.
    HDC Detach() {
        HDC const dc = m_hDC;
        m_hDC = nullptr;
        return dc;
    }
    /// Creates as ::CreateCompatibleDC does.
    /// @param dc a context; null, or one without a handle, for the screen
    /// @return nonzero; 0 when it fails or a context is owned already
    BOOL CreateCompatibleDC(CDC* dc) {
        return m_hDC == nullptr ? Attach(::CreateCompatibleDC(dc != nullptr ? dc->m_hDC : nullptr)) : 0;
    }
    /// Deletes the context. A context of GetDC is no longer owned, but stays.
    /// @return as ::DeleteDC; 0 when nothing is owned
    BOOL DeleteDC() {
        // A wrapper lent by FromHandle dies with its context: no member is used after the call.
        return m_hDC == nullptr ? 0 : ::DeleteDC(Detach());
    }

    /// Selects a bitmap as ::SelectObject does.
    /// @return a wrapper, not owned, of the bitmap used before, to be selected again; null on failure
    CBitmap* SelectObject(const CBitmap* bitmap) const {
        HGDIOBJ const before = exchange(bitmap);
        return before != nullptr ? CBitmap::FromHandle(static_cast<HBITMAP>(before)) : nullptr;
    }
    /// Selects a brush as ::SelectObject does.
    /// @return a wrapper, not owned, of the brush used before; null on failure
    CBrush* SelectObject(const CBrush* brush) const {
        HGDIOBJ const before = exchange(brush);
        return before != nullptr ? CBrush::FromHandle(static_cast<HBRUSH>(before)) : nullptr;
    }
    /// Selects a stock brush or pen.
    /// @return a wrapper, not owned, of the brush used before; null for a pen and on failure
    CBrush* SelectStockObject(int number) const {
        HGDIOBJ const stock = ::GetStockObject(number);
        HGDIOBJ const before = stock != nullptr ? ::SelectObject(m_hDC, stock) : nullptr;
        return before != nullptr && number <= NULL_BRUSH ? CBrush::FromHandle(static_cast<HBRUSH>(before))
                                                         : nullptr;
    }

    /// @name The calls of the same names on this context
    /// With wrappers for handles; their results are those of the calls.
    /// @{
    /// As ::SetBkColor.
    COLORREF SetBkColor(COLORREF colour) const { return ::SetBkColor(m_hDC, colour); }
    /// As ::SetTextColor.
    COLORREF SetTextColor(COLORREF colour) const { return ::SetTextColor(m_hDC, colour); }
    /// As ::SetMapMode.
    int SetMapMode(int mode) const { return ::SetMapMode(m_hDC, mode); }
    /// As ::GetMapMode.
    int GetMapMode() const { return ::GetMapMode(m_hDC); }
    /// As ::SetGraphicsMode.
    int SetGraphicsMode(int mode) const { return ::SetGraphicsMode(m_hDC, mode); }
    /// As ::SetWorldTransform.
    BOOL SetWorldTransform(const XFORM* transform) const { return ::SetWorldTransform(m_hDC, transform); }
    /// As ::ModifyWorldTransform.
    BOOL ModifyWorldTransform(const XFORM* transform, DWORD mode) const {
        return ::ModifyWorldTransform(m_hDC, transform, mode);
    }
    /// As ::DPtoLP.
    void DPtoLP(POINT* points, int count = 1) const { ::DPtoLP(m_hDC, points, count); }
    /// As ::GetPixel.
    COLORREF GetPixel(int x, int y) const { return ::GetPixel(m_hDC, x, y); }
    /// As ::GetPixel.
    COLORREF GetPixel(POINT point) const { return ::GetPixel(m_hDC, point.x, point.y); }
    /// As ::SetPixel.
    COLORREF SetPixel(int x, int y, COLORREF colour) const { return ::SetPixel(m_hDC, x, y, colour); }
    /// As ::SetPixel.
    COLORREF SetPixel(POINT point, COLORREF colour) const {
        return ::SetPixel(m_hDC, point.x, point.y, colour);
    }
    /// As ::SetPixel; nonzero when there is a pixel.
    BOOL SetPixelV(int x, int y, COLORREF colour) const {
        return ::SetPixel(m_hDC, x, y, colour) != CLR_INVALID ? 1 : 0;
    }
    /// As ::FillRect.
    void FillRect(const RECT* rectangle, const CBrush* brush) const {
        ::FillRect(m_hDC, rectangle, brush != nullptr ? HBRUSH(*brush) : nullptr);
    }
    /// Fills a rectangle with a colour.
    void FillSolidRect(const RECT* rectangle, COLORREF colour) const {
        const CBrush brush(colour);
        FillRect(rectangle, &brush);
    }
    /// Fills a rectangle with a colour; its right and bottom must fit 32 bits.
    void FillSolidRect(int x, int y, int width, int height, COLORREF colour) const {
        const RECT rectangle = {x, y, x + width, y + height};
        FillSolidRect(&rectangle, colour);
    }
    /// As ::RoundRect.
    BOOL RoundRect(int left, int top, int right, int bottom, int width, int height) const {
        return ::RoundRect(m_hDC, left, top, right, bottom, width, height);
    }
    /// As ::RoundRect.
    BOOL RoundRect(const RECT* r, POINT ellipse) const {
        return RoundRect(r->left, r->top, r->right, r->bottom, ellipse.x, ellipse.y);
    }
    /// As ::GradientFill.
    BOOL GradientFill(const TRIVERTEX* vertices, DWORD vertex_count, const void* mesh, DWORD mesh_count,
                      DWORD mode) const {
        return ::GradientFill(m_hDC, vertices, vertex_count, mesh, mesh_count, mode);
    }
    /// As ::BitBlt.
    BOOL BitBlt(int x, int y, int width, int height, const CDC* source, int source_x, int source_y,
                DWORD rop) const {
        return ::BitBlt(m_hDC, x, y, width, height, handle_of(source), source_x, source_y, rop);
    }
    /// As ::TransparentBlt.
    BOOL TransparentBlt(int x, int y, int width, int height, const CDC* source, int source_x, int source_y,
                        int source_width, int source_height, UINT key) const {
        return ::TransparentBlt(m_hDC, x, y, width, height, handle_of(source), source_x, source_y,
                                source_width, source_height, key);
    }
    /// @}

private:
    static HDC handle_of(const CDC* dc) { return dc != nullptr ? dc->m_hDC : nullptr; }
    HGDIOBJ exchange(const CGdiObject* object) const {
        return ::SelectObject(m_hDC, object != nullptr ? object->GetSafeHandle() : nullptr);
    }
};

inline BOOL CBitmap::CreateCompatibleBitmap(CDC* dc, int width, int height) {
    return m_hObject == nullptr && dc != nullptr ? Attach(::CreateCompatibleBitmap(dc->m_hDC, width, height))
                                                 : 0;
}

#endif
