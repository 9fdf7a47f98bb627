/// @file
/// What drawing objects have in common, and brushes.
///
/// Every call on a handle that is null, was deleted or names another kind of object fails with
/// ERROR_INVALID_HANDLE and changes nothing. There may be 65,536 objects and contexts at once.
///
/// Threads: one thread at a time uses an object; brushes may be shared while no thread deletes them. Calls on
/// different objects need no lock.
#ifndef BASALT_PLATFORM_GRAPHICS_OBJECTS_H
#define BASALT_PLATFORM_GRAPHICS_OBJECTS_H

#include "basalt/export.h"
#include "basalt/platform/graphics_types.h"

/// @name Objects
/// @{

/// Deletes a bitmap, brush or region.
/// @return nonzero, also for stock objects, which stay; 0 for a wrong handle and for an object that is
/// selected into a context (ERROR_BUSY)
BASALT_API BOOL DeleteObject(HGDIOBJ object);

/// Describes a bitmap.
/// @param object a bitmap
/// @param size bytes of the buffer, at least those of a BITMAP
/// @param[out] record a BITMAP, or null to request its size
/// @return bytes written or needed; 0 for any other handle or a smaller buffer
BASALT_API int GetObjectW(HGDIOBJ object, int size, void* record);
/// The same by its general name.
inline int GetObject(HGDIOBJ object, int size, void* record) {
    return GetObjectW(object, size, record);
}
/// @}

/// @name Stock objects
/// They belong to the platform, are the same for all contexts, and need not be deleted. Pens can be selected,
/// but no call draws with one.
/// @{
inline constexpr int WHITE_BRUSH = 0;            ///< solid, 0xFFFFFF; a new context's brush
inline constexpr int LTGRAY_BRUSH = 1;           ///< solid, 0xC0C0C0
inline constexpr int GRAY_BRUSH = 2;             ///< solid, 0x808080
inline constexpr int DKGRAY_BRUSH = 3;           ///< solid, 0x404040
inline constexpr int BLACK_BRUSH = 4;            ///< solid, 0
inline constexpr int NULL_BRUSH = 5;             ///< fills nothing
inline constexpr int HOLLOW_BRUSH = NULL_BRUSH;  ///< fills nothing
inline constexpr int WHITE_PEN = 6;              ///< a pen
inline constexpr int BLACK_PEN = 7;              ///< a new context's pen
inline constexpr int NULL_PEN = 8;               ///< no outline

/// A stock brush or pen.
/// @return null for any other number (ERROR_INVALID_PARAMETER)
BASALT_API HGDIOBJ GetStockObject(int number);
/// @}

/// A brush of one colour.
/// @return null on failure
BASALT_API HBRUSH CreateSolidBrush(COLORREF colour);

/// Owner of a drawing object, which it deletes in its destructor. Cannot be copied.
class CGdiObject {
public:
    CGdiObject(const CGdiObject&) = delete;
    CGdiObject& operator=(const CGdiObject&) = delete;

    /// The object owned, or null.
    HGDIOBJ m_hObject = nullptr;

    /// The handle; null when there is none.
    HGDIOBJ GetSafeHandle() const { return m_hObject; }
    /// Releases the object to the caller, who then owns the handle returned.
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
    /// Deletes the object. One that cannot be deleted, as it is selected into a context, is no longer owned.
    /// @return as ::DeleteObject; 0 when nothing is owned
    BOOL DeleteObject() {
        // A wrapper lent by FromHandle dies with its object: no member is used after the call.
        return m_hObject == nullptr ? 0 : ::DeleteObject(Detach());
    }
    /// Describes the object as ::GetObjectW does.
    int GetObject(int size, void* record) const { return ::GetObjectW(m_hObject, size, record); }

protected:
    CGdiObject() = default;
    ~CGdiObject() { DeleteObject(); }
};

/// Owner of a brush.
class BASALT_API CBrush : public CGdiObject {
public:
    CBrush() = default;
    /// Creates a brush of one colour.
    explicit CBrush(COLORREF colour) { CreateSolidBrush(colour); }
    ~CBrush() = default;
    CBrush(const CBrush&) = delete;
    CBrush& operator=(const CBrush&) = delete;

    /// A wrapper that does not own the brush; valid as long as the brush exists.
    /// @return null for a wrong handle
    static CBrush* FromHandle(HBRUSH brush);

    /// The handle; null when there is none.
    operator HBRUSH() const { return static_cast<HBRUSH>(m_hObject); }

    /// Creates as ::CreateSolidBrush does.
    /// @return nonzero; 0 when it fails or a brush is owned already
    BOOL CreateSolidBrush(COLORREF colour) {
        return m_hObject == nullptr ? Attach(::CreateSolidBrush(colour)) : 0;
    }
};

#endif
