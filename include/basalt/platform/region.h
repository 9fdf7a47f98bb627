/// @file
/// Regions: sets of pixels. What holds for all drawing objects is said in
/// basalt/platform/graphics_objects.h.
#ifndef BASALT_PLATFORM_REGION_H
#define BASALT_PLATFORM_REGION_H

#include "basalt/export.h"
#include "basalt/platform/graphics_objects.h"
#include "basalt/platform/graphics_types.h"

/// @name What a region is, as its calls answer
/// @{
inline constexpr int RGN_ERROR = 0;      ///< the call failed; its other name, ERROR, is left to the host
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

/// A region of one rectangle; opposite sides may be exchanged, equal ones give the empty region.
/// @return null when there is no room
BASALT_API HRGN CreateRectRgn(int left, int top, int right, int bottom);

/// Puts the combination of two regions into one that exists, which may be either of them.
/// @param destination takes the result; as before when the call fails
/// @param a,b the two; b is not looked at for RGN_COPY
/// @param mode one of the ways above
/// @return what the result is; RGN_ERROR for a wrong handle or mode, or a lack of memory
BASALT_API int CombineRgn(HRGN destination, HRGN a, HRGN b, int mode);

/// Whether a pixel is in a region: 1 or 0; 0 for a wrong handle.
BASALT_API BOOL PtInRegion(HRGN region, int x, int y);

/// The smallest rectangle around a region.
/// @param region the region
/// @param[out] box takes the rectangle; all zero for the empty region
/// @return what the region is; RGN_ERROR for a wrong handle or a null pointer
BASALT_API int GetRgnBox(HRGN region, RECT* box);

/// Whether two regions hold the same pixels, however they came about: 1 or 0; 0 for a wrong handle.
BASALT_API BOOL EqualRgn(HRGN a, HRGN b);
/// @}

/// Owner of a region.
class BASALT_API CRgn : public CGdiObject {
public:
    CRgn() = default;
    ~CRgn() = default;
    CRgn(const CRgn&) = delete;
    CRgn& operator=(const CRgn&) = delete;

    /// A wrapper that does not own the region: lent by the platform, good as long as the region exists.
    /// @return null for a wrong handle
    static CRgn* FromHandle(HRGN region);

    /// The handle; null when there is none.
    operator HRGN() const { return static_cast<HRGN>(m_hObject); }

    /// Creates as ::CreateRectRgn does.
    /// @return nonzero; 0 when it fails or a region is owned already
    BOOL CreateRectRgn(int left, int top, int right, int bottom) {
        return m_hObject == nullptr ? Attach(::CreateRectRgn(left, top, right, bottom)) : 0;
    }
    /// Makes this region, which must exist, the combination of two, as ::CombineRgn does.
    // NOLINTNEXTLINE(readability-make-member-function-const): the region changes, if not its handle
    int CombineRgn(const CRgn* a, const CRgn* b, int mode) {
        return ::CombineRgn(*this, a != nullptr ? HRGN(*a) : nullptr, b != nullptr ? HRGN(*b) : nullptr,
                            mode);
    }
    /// Makes this region, which must exist, a copy of another, as ::CombineRgn does.
    int CopyRgn(const CRgn* other) { return CombineRgn(other, nullptr, RGN_COPY); }
    /// Whether a pixel is in the region.
    BOOL PtInRegion(int x, int y) const { return ::PtInRegion(*this, x, y); }
    /// The smallest rectangle around the region, as ::GetRgnBox gives it.
    int GetRgnBox(RECT* box) const { return ::GetRgnBox(*this, box); }
    /// Whether another region holds the same pixels.
    BOOL EqualRgn(const CRgn* other) const {
        return ::EqualRgn(*this, other != nullptr ? HRGN(*other) : nullptr);
    }
};

#endif
