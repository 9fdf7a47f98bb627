/// @file
/// Device contexts: a surface and the settings drawn with. What holds for all handles is said in
/// basalt/platform/graphics_objects.h.
#ifndef BASALT_PLATFORM_DEVICE_CONTEXT_H
#define BASALT_PLATFORM_DEVICE_CONTEXT_H

#include "basalt/export.h"
#include "basalt/platform/bitmap.h"
#include "basalt/platform/graphics_objects.h"
#include "basalt/platform/graphics_types.h"

/// @name Contexts
/// @{

/// A memory context: a monochrome surface of one pixel, black text on white, white brush, black pen, no
/// transform.
/// @param dc a context to be compatible with; null for the screen. All are.
/// @return null for a wrong context, or when there is no room
BASALT_API HDC CreateCompatibleDC(HDC dc);

/// Deletes a memory context; objects selected into it are free again and stay.
/// @return nonzero; 0 for a wrong handle and for a context that GetDC gave
BASALT_API BOOL DeleteDC(HDC dc);

/// A context of the screen: 32 bits, and without a pixel that could be drawn or read.
/// @param window null
/// @return null for a window (ERROR_INVALID_HANDLE), or when there is no room
BASALT_API HDC GetDC(HWND__* window);

/// Gives a context of GetDC back.
/// @return 1; 0 for any other
BASALT_API int ReleaseDC(HWND__* window, HDC dc);

/// Makes a bitmap, brush or pen the one a context uses.
/// @return the object of the same kind used before; null for a wrong handle, for a region, and for a bitmap
/// when the context is the screen's or the bitmap is selected into another context (ERROR_BUSY). The one
/// pixel of a new context is a stock bitmap: it is selected back like any other, into any context.
BASALT_API HGDIOBJ SelectObject(HDC dc, HGDIOBJ object);
/// @}

/// @name Colours
/// For copies between monochrome and colour. CLR_INVALID for a wrong context.
/// @{

/// Sets the background colour; gives the one before.
BASALT_API COLORREF SetBkColor(HDC dc, COLORREF colour);
/// The background colour.
BASALT_API COLORREF GetBkColor(HDC dc);
/// Sets the text colour; gives the one before.
BASALT_API COLORREF SetTextColor(HDC dc, COLORREF colour);
/// The text colour.
BASALT_API COLORREF GetTextColor(HDC dc);
/// @}

/// @name Coordinates
/// @{
inline constexpr int MM_TEXT = 1;              ///< one unit is one pixel, y downwards
inline constexpr int MM_ANISOTROPIC = 8;       ///< units as the host sets them: here always one pixel
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

/// Turns pixels into the context's own coordinates: takes points back through the transform, rounded to the
/// nearest whole number.
/// @return nonzero; 0, with the points as they were, for a wrong context, a negative count, a null pointer
/// to points, or a point whose coordinates would not fit
BASALT_API BOOL DPtoLP(HDC dc, POINT* points, int count);

/// Sets the graphics mode, GM_COMPATIBLE or GM_ADVANCED.
/// @return the mode before; 0 for another, for GM_COMPATIBLE while a transform is set, or a wrong context
BASALT_API int SetGraphicsMode(HDC dc, int mode);

/// Sets the transform from the context's own coordinates to pixels.
/// @return nonzero; 0 in GM_COMPATIBLE, or for a transform that is null, not finite or cannot be undone
BASALT_API BOOL SetWorldTransform(HDC dc, const XFORM* transform);

/// Joins a transform to the current one. With MWT_LEFTMULTIPLY a point goes through the new one first.
/// @param dc the context
/// @param transform not looked at for MWT_IDENTITY
/// @param mode MWT_IDENTITY, MWT_LEFTMULTIPLY or MWT_RIGHTMULTIPLY
/// @return as SetWorldTransform; 0 for another mode too
BASALT_API BOOL ModifyWorldTransform(HDC dc, const XFORM* transform, DWORD mode);
/// @}

/// Owner of a memory context. Contexts of GetDC are not owned: give them back with ReleaseDC.
class BASALT_API CDC {
public:
    CDC() = default;
    ~CDC() { DeleteDC(); }
    CDC(const CDC&) = delete;
    CDC& operator=(const CDC&) = delete;

    /// The handle; null when there is none.
    HDC m_hDC = nullptr;

    /// A wrapper that does not own the context: lent by the platform, good as long as the context exists.
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
    /// Gives the context up: the caller owns the handle returned.
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
    /// Deletes the context. What cannot be deleted (a context of GetDC) is given up.
    /// @return as ::DeleteDC; 0 when nothing is owned
    BOOL DeleteDC() {
        // A wrapper lent by FromHandle ends with its context: nothing of it is touched after the call.
        return m_hDC == nullptr ? 0 : ::DeleteDC(Detach());
    }

    /// Selects a bitmap as ::SelectObject does.
    /// @return a lent wrapper of the bitmap used before, to be selected back; null on failure
    CBitmap* SelectObject(const CBitmap* bitmap) const {
        HGDIOBJ const before = ::SelectObject(m_hDC, bitmap != nullptr ? bitmap->GetSafeHandle() : nullptr);
        return before != nullptr ? CBitmap::FromHandle(static_cast<HBITMAP>(before)) : nullptr;
    }
};

inline BOOL CBitmap::CreateCompatibleBitmap(CDC* dc, int width, int height) {
    return m_hObject == nullptr && dc != nullptr ? Attach(::CreateCompatibleBitmap(dc->m_hDC, width, height))
                                                 : 0;
}

#endif
