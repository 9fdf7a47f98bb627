/// @file
/// Handles, colours and records of the drawing calls, with the sizes of Win32.
#ifndef BASALT_PLATFORM_GRAPHICS_TYPES_H
#define BASALT_PLATFORM_GRAPHICS_TYPES_H

#include "basalt/platform/types.h"

/// Any drawing object: bitmap, brush or region. The typed handles below convert to it.
using HGDIOBJ = void*;
/// A device context: a surface and the settings drawn with.
using HDC = struct HDC__*;
/// A bitmap.
using HBITMAP = struct HBITMAP__*;
/// A brush, which fills.
using HBRUSH = struct HBRUSH__*;
/// A region: a set of pixels.
using HRGN = struct HRGN__*;
struct HWND__;
#ifndef __SQLTYPES_H  // unixODBC declares another HWND
/// A window. The only valid value is null, which stands for the screen.
using HWND = HWND__*;
#endif

/// A colour, 0x00BBGGRR: red in the low byte. The high byte is ignored.
using COLORREF = DWORD;

/// No colour: the result outside a surface.
inline constexpr COLORREF CLR_INVALID = 0xFFFFFFFF;

/// The colour of three channels; each is truncated to 8 bits.
constexpr COLORREF RGB(int red, int green, int blue) {
    return static_cast<COLORREF>((red & 0xFF) | (green & 0xFF) << 8 | (blue & 0xFF) << 16);
}
/// The red channel.
constexpr BYTE GetRValue(COLORREF colour) {
    return static_cast<BYTE>(colour & 0xFF);
}
/// The green channel.
constexpr BYTE GetGValue(COLORREF colour) {
    return static_cast<BYTE>(colour >> 8 & 0xFF);
}
/// The blue channel.
constexpr BYTE GetBValue(COLORREF colour) {
    return static_cast<BYTE>(colour >> 16 & 0xFF);
}

/// A point, or a pixel by its upper left corner; y grows downwards.
struct POINT {
    LONG x;  ///< to the right
    LONG y;  ///< downwards
};

/// A width and a height.
struct SIZE {
    LONG cx;  ///< width
    LONG cy;  ///< height
};

/// A rectangle of pixels: `right` and `bottom` are the first column and row outside.
struct RECT {
    LONG left;    ///< first column
    LONG top;     ///< first row
    LONG right;   ///< first column outside
    LONG bottom;  ///< first row outside
};

using LPPOINT = POINT*;       ///< points that a call changes
using LPRECT = RECT*;         ///< a rectangle that a call changes
using LPCRECT = const RECT*;  ///< a rectangle

/// A transform of the plane: x' = x eM11 + y eM21 + eDx, y' = x eM12 + y eM22 + eDy. With y downwards,
/// eM11 = eM22 = cos a, eM12 = -eM21 = sin a turns clockwise by a.
struct XFORM {
    float eM11;  ///< x to x'
    float eM12;  ///< x to y'
    float eM21;  ///< y to x'
    float eM22;  ///< y to y'
    float eDx;   ///< shift of x
    float eDy;   ///< shift of y
};

static_assert(sizeof(RECT) == 16 && sizeof(POINT) == 8 && sizeof(XFORM) == 24, "the sizes of Win32");

#endif
