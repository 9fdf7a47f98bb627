/// @file
/// Regions: sets of pixels. basalt/platform/graphics_objects.h has what holds for all drawing objects.
#ifndef BASALT_PLATFORM_REGION_H
#define BASALT_PLATFORM_REGION_H

#include "basalt/export.h"
#include "basalt/platform/graphics_objects.h"
#include "basalt/platform/graphics_types.h"

/// @name Kinds of regions, as calls return them
/// @{
inline constexpr int RGN_ERROR = 0;      ///< the call failed; the name ERROR is left to the host
inline constexpr int NULLREGION = 1;     ///< empty
inline constexpr int SIMPLEREGION = 2;   ///< one rectangle
inline constexpr int COMPLEXREGION = 3;  ///< more than one rectangle
/// @}

/// @name Ways to combine two regions
/// @{
inline constexpr int RGN_AND = 1;   ///< what is in both
inline constexpr int RGN_OR = 2;    ///< what is in either
inline constexpr int RGN_XOR = 3;   ///< what is in one of them alone
inline constexpr int RGN_DIFF = 4;  ///< what is in the first but not in the second
inline constexpr int RGN_COPY = 5;  ///< the first
/// @}

/// @name Regions
/// @{

/// A region's rectangles, as GetRegionData writes them. Those of one band of rows share top and bottom; bands
/// come from top to bottom, in each band rectangles from left to right.
struct RGNDATAHEADER {
    DWORD dwSize;    ///< 32
    DWORD iType;     ///< RDH_RECTANGLES
    DWORD nCount;    ///< number of rectangles
    DWORD nRgnSize;  ///< bytes of the rectangles
    RECT rcBound;    ///< the smallest rectangle around the region
};

/// A region's rectangles behind their header.
struct RGNDATA {
    RGNDATAHEADER rdh;  ///< the header
    char Buffer[1];     ///< the first byte of nCount RECT records
};

inline constexpr DWORD RDH_RECTANGLES = 1;  ///< the data are rectangles

static_assert(sizeof(RGNDATAHEADER) == 32, "the size of Win32");

/// A region of one rectangle. Opposite sides may be swapped; equal ones give the empty region.
/// @return null on failure
BASALT_API HRGN CreateRectRgn(int left, int top, int right, int bottom);

/// Stores the combination of two regions in a region that exists, which may be either of them.
/// @param destination takes the result; unchanged when the call fails
/// @param a,b the two; b is ignored for RGN_COPY
/// @param mode one of the ways above
/// @return kind of the result; RGN_ERROR for a wrong handle or mode, or when out of memory
BASALT_API int CombineRgn(HRGN destination, HRGN a, HRGN b, int mode);

/// Whether a pixel is in a region: 1 or 0; 0 for a wrong handle.
BASALT_API BOOL PtInRegion(HRGN region, int x, int y);

/// The smallest rectangle around a region.
/// @param region the region
/// @param[out] box takes the rectangle; all zero for the empty region
/// @return kind of the region; RGN_ERROR for a wrong handle or a null pointer
BASALT_API int GetRgnBox(HRGN region, RECT* box);

/// Whether two regions hold the same pixels: 1 or 0; 0 for a wrong handle.
BASALT_API BOOL EqualRgn(HRGN a, HRGN b);

/// Moves a region.
/// @return kind of the region; RGN_ERROR, and nothing changes, for a wrong handle or coordinates that would
/// not fit 32 bits
BASALT_API int OffsetRgn(HRGN region, int x, int y);

/// Writes a region's rectangles.
/// @param region the region
/// @param size bytes of the buffer
/// @param[out] data the buffer, or null to request its size
/// @return bytes written or needed; 0 for a wrong handle or a smaller buffer (ERROR_INSUFFICIENT_BUFFER)
BASALT_API DWORD GetRegionData(HRGN region, DWORD size, RGNDATA* data);

/// A region of one rectangle, as ::CreateRectRgn makes it.
inline HRGN CreateRectRgnIndirect(const RECT* r) {
    return CreateRectRgn(r->left, r->top, r->right, r->bottom);
}

/// Makes a region that exists one of one rectangle.
/// @return nonzero; 0 for a wrong handle and when out of memory
inline BOOL SetRectRgn(HRGN region, int left, int top, int right, int bottom) {
    HRGN const rectangle = CreateRectRgn(left, top, right, bottom);
    const int kind = rectangle != nullptr ? CombineRgn(region, rectangle, nullptr, RGN_COPY) : RGN_ERROR;
    DeleteObject(rectangle);
    return kind != RGN_ERROR ? 1 : 0;
}
/// @}

/// Owner of a region.
class BASALT_API CRgn : public CGdiObject {
public:
    CRgn() = default;
    ~CRgn() = default;
    CRgn(const CRgn&) = delete;
    CRgn& operator=(const CRgn&) = delete;

    /// A wrapper that does not own the region; valid as long as the region exists.
    /// @return null for a wrong handle
    static CRgn* FromHandle(HRGN region);

    /// The handle; null when there is none.
    operator HRGN() const { return static_cast<HRGN>(m_hObject); }

    /// Creates as ::CreateRectRgn does.
    /// @return nonzero; 0 when it fails or a region is owned already
    BOOL CreateRectRgn(int left, int top, int right, int bottom) {
        return m_hObject == nullptr ? Attach(::CreateRectRgn(left, top, right, bottom)) : 0;
    }
    /// Creates as ::CreateRectRgn does.
    BOOL CreateRectRgnIndirect(const RECT* r) { return CreateRectRgn(r->left, r->top, r->right, r->bottom); }
    /// Makes this region, which must exist, one of one rectangle, as ::SetRectRgn does.
    // NOLINTNEXTLINE(readability-make-member-function-const): the region changes, if not its handle
    BOOL SetRectRgn(int left, int top, int right, int bottom) {
        return ::SetRectRgn(*this, left, top, right, bottom);
    }
    /// The same by a rectangle.
    BOOL SetRectRgn(const RECT* r) { return SetRectRgn(r->left, r->top, r->right, r->bottom); }
    /// Makes this region, which must exist, the combination of two, as ::CombineRgn does.
    // NOLINTNEXTLINE(readability-make-member-function-const): the region changes, if not its handle
    int CombineRgn(const CRgn* a, const CRgn* b, int mode) {
        return ::CombineRgn(*this, a != nullptr ? HRGN(*a) : nullptr, b != nullptr ? HRGN(*b) : nullptr,
                            mode);
    }
    /// Makes this region, which must exist, a copy of another, as ::CombineRgn does.
    int CopyRgn(const CRgn* other) { return CombineRgn(other, nullptr, RGN_COPY); }
    /// Moves the region as ::OffsetRgn does.
    // NOLINTNEXTLINE(readability-make-member-function-const): the region changes, if not its handle
    int OffsetRgn(int x, int y) { return ::OffsetRgn(*this, x, y); }
    /// Moves the region as ::OffsetRgn does.
    int OffsetRgn(POINT by) { return OffsetRgn(by.x, by.y); }
    /// Whether a pixel is in the region.
    BOOL PtInRegion(int x, int y) const { return ::PtInRegion(*this, x, y); }
    /// Whether a pixel is in the region.
    BOOL PtInRegion(POINT point) const { return ::PtInRegion(*this, point.x, point.y); }
    /// Writes the region's rectangles, as ::GetRegionData does.
    int GetRegionData(RGNDATA* data, int size) const {
        return static_cast<int>(::GetRegionData(*this, size > 0 ? static_cast<DWORD>(size) : 0, data));
    }
    /// The smallest rectangle around the region, as ::GetRgnBox returns it.
    int GetRgnBox(RECT* box) const { return ::GetRgnBox(*this, box); }
    /// Whether another region holds the same pixels.
    BOOL EqualRgn(const CRgn* other) const {
        return ::EqualRgn(*this, other != nullptr ? HRGN(*other) : nullptr);
    }
};

#endif
