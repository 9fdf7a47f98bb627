/// @file
/// What drawing objects have in common, and brushes and pens.
///
/// Every call on a handle that is null, was deleted or names another kind of object fails with
/// ERROR_INVALID_HANDLE and changes nothing. There may be 65,536 objects and contexts at once.
///
/// Threads: an object is used by one thread at a time; brushes and pens may be shared while nobody deletes
/// them. Calls on different objects need no lock.
#ifndef BASALT_PLATFORM_GRAPHICS_OBJECTS_H
#define BASALT_PLATFORM_GRAPHICS_OBJECTS_H

#include "basalt/export.h"
#include "basalt/platform/graphics_types.h"

/// @name Objects
/// @{

/// Deletes a bitmap, brush, pen or region.
/// @return nonzero; 0 for a wrong handle and for an object that is selected into a context (ERROR_BUSY).
/// Stock objects stay, which counts as success.
BASALT_API BOOL DeleteObject(HGDIOBJ object);

/// Describes a bitmap.
/// @param object a bitmap; of other objects nothing is told
/// @param size bytes of room, at least those of a BITMAP
/// @param[out] record a BITMAP, or null to ask for the size it takes
/// @return bytes written or needed; 0 for a wrong handle or too little room
BASALT_API int GetObjectW(HGDIOBJ object, int size, void* record);
/// @}

/// @name Stock objects
/// They belong to the platform, are the same for all contexts, and need not be deleted.
/// @{
inline constexpr int WHITE_BRUSH = 0;            ///< solid, 0xFFFFFF; a new context's brush
inline constexpr int LTGRAY_BRUSH = 1;           ///< solid, 0xC0C0C0
inline constexpr int GRAY_BRUSH = 2;             ///< solid, 0x808080
inline constexpr int DKGRAY_BRUSH = 3;           ///< solid, 0x404040
inline constexpr int BLACK_BRUSH = 4;            ///< solid, 0
inline constexpr int NULL_BRUSH = 5;             ///< fills nothing
inline constexpr int HOLLOW_BRUSH = NULL_BRUSH;  ///< fills nothing
inline constexpr int WHITE_PEN = 6;              ///< one pixel, 0xFFFFFF
inline constexpr int BLACK_PEN = 7;              ///< one pixel, 0; a new context's pen
inline constexpr int NULL_PEN = 8;               ///< draws nothing

/// A stock brush or pen.
/// @return null for any other number (ERROR_INVALID_PARAMETER)
BASALT_API HGDIOBJ GetStockObject(int number);
/// @}

/// @name Brushes and pens
/// @{
inline constexpr int PS_SOLID = 0;  ///< a pen that draws
inline constexpr int PS_NULL = 5;   ///< a pen that draws nothing

/// A brush of one colour.
/// @return null when there is no room for it
BASALT_API HBRUSH CreateSolidBrush(COLORREF colour);

/// A pen.
/// @param style PS_SOLID or PS_NULL
/// @param width pixels; 0 is one, a negative one counts as positive. Outlines are one pixel at any width.
/// @param colour of a pen that draws
/// @return null for another style (ERROR_INVALID_PARAMETER), or when there is no room for it
BASALT_API HPEN CreatePen(int style, int width, COLORREF colour);
/// @}

/// Owner of a drawing object: deletes it at its own end. Wrappers cannot be copied.
class CGdiObject {
public:
    CGdiObject(const CGdiObject&) = delete;
    CGdiObject& operator=(const CGdiObject&) = delete;

    /// Whatever is owned; null when nothing is.
    HGDIOBJ m_hObject = nullptr;

    /// The handle; null when there is none.
    HGDIOBJ GetSafeHandle() const { return m_hObject; }
    /// Gives the object up: the caller owns the handle returned.
    HGDIOBJ Detach() {
        HGDIOBJ const object = m_hObject;
        m_hObject = nullptr;
        return object;
    }
    /// Takes ownership of a handle.
    /// @return nonzero; 0, and nothing changes, when the handle is null or an object is owned already
    BOOL Attach(HGDIOBJ object) {
        if (object == nullptr || m_hObject != nullptr) {
            return 0;
        }
        m_hObject = object;
        return 1;
    }
    /// Deletes the object. What cannot be deleted (it is selected into a context) is given up.
    /// @return as ::DeleteObject; 0 when nothing is owned
    BOOL DeleteObject() {
        // A wrapper lent by FromHandle ends with its object: nothing of it is touched after the call.
        return m_hObject == nullptr ? 0 : ::DeleteObject(Detach());
    }
    /// Describes the object as ::GetObjectW does.
    int GetObject(int size, void* record) const { return ::GetObjectW(m_hObject, size, record); }

protected:
    CGdiObject() = default;
    ~CGdiObject() { DeleteObject(); }
};

#endif
