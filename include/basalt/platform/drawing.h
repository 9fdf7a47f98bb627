/// @file
/// Drawing on the surface of a context. basalt/platform/graphics_objects.h has what holds for all handles.
///
/// Rectangles exclude their right column and bottom row. Any coordinates are allowed; what lies outside the
/// surface is ignored. A drawn colour becomes the nearest that the surface's depth has; at 32 bits the high
/// byte is written as 0. Under a transform BitBlt copies to a parallelogram: the pixels whose middles lie
/// inside. The other calls fail (ERROR_NOT_SUPPORTED) unless the transform is a shift by whole pixels. BitBlt
/// fails (ERROR_ARITHMETIC_OVERFLOW) under a transform that maps neighbouring pixels 2^30 or more source
/// pixels apart.
///
/// All return 0 for a wrong handle, unless noted.
#ifndef BASALT_PLATFORM_DRAWING_H
#define BASALT_PLATFORM_DRAWING_H

#include "basalt/export.h"
#include "basalt/platform/graphics_objects.h"
#include "basalt/platform/graphics_types.h"

/// @name Pixels and shapes
/// @{

/// Colour of a pixel, high byte 0; CLR_INVALID outside the surface, under a transform and for a wrong
/// context.
BASALT_API COLORREF GetPixel(HDC dc, int x, int y);

/// Sets a pixel.
/// @return the colour stored; CLR_INVALID outside the surface, under a transform and for a wrong context
BASALT_API COLORREF SetPixel(HDC dc, int x, int y, COLORREF colour);

/// Fills a rectangle; an empty or reversed one has no pixels.
/// @return nonzero; 0 for a null rectangle
BASALT_API int FillRect(HDC dc, const RECT* rectangle, HBRUSH brush);

/// Fills a rectangle with rounded corners with the context's brush. No outline is drawn.
/// @param dc the context
/// @param left,top,right,bottom the rectangle; opposite sides may be swapped
/// @param width,height of the whole ellipse of which each corner is a quarter: a corner is half of each.
/// Clamped to the rectangle's; negative ones count as positive.
/// @return nonzero
///
/// A pixel belongs to the shape if its middle lies inside, so the four corners are mirror images.
BASALT_API BOOL RoundRect(HDC dc, int left, int top, int right, int bottom, int width, int height);
/// @}

/// @name Gradients
/// @{

/// A corner of a gradient's rectangle. Channels run from 0 to 0xFF00: the level is the high byte.
struct TRIVERTEX {
    LONG x;      ///< column
    LONG y;      ///< row
    WORD Red;    ///< 8.8
    WORD Green;  ///< 8.8
    WORD Blue;   ///< 8.8
    WORD Alpha;  ///< not used
};

/// A gradient's rectangle, by the numbers of two opposite corners.
struct GRADIENT_RECT {
    DWORD UpperLeft;   ///< number of a corner
    DWORD LowerRight;  ///< number of the opposite one
};

inline constexpr DWORD GRADIENT_FILL_RECT_H = 0;  ///< colours change from left to right
inline constexpr DWORD GRADIENT_FILL_RECT_V = 1;  ///< colours change from top to bottom

/// Fills rectangles with gradients. Between the corners' coordinates a and b > a, column (or row) p takes
/// (C_b (p - a) + C_a (b - p)) / (b - a) in each channel: it starts with the first colour and ends one step
/// short of the second. At 16 bits levels are truncated, with fewer the nearest colour is taken.
/// @param dc the context
/// @param vertices,vertex_count the corners
/// @param mesh,mesh_count GRADIENT_RECT records; one without width or height has no pixels
/// @param mode GRADIENT_FILL_RECT_H or GRADIENT_FILL_RECT_V
/// @return nonzero; 0, and nothing is drawn, for a null pointer, an index of no corner or another mode
BASALT_API BOOL GradientFill(HDC dc, const TRIVERTEX* vertices, DWORD vertex_count, const void* mesh,
                             DWORD mesh_count, DWORD mode);
/// @}

/// @name Copies
/// @{
inline constexpr DWORD SRCCOPY = 0x00CC0020;     ///< the source
inline constexpr DWORD SRCPAINT = 0x00EE0086;    ///< destination or source
inline constexpr DWORD SRCAND = 0x008800C6;      ///< destination and source
inline constexpr DWORD SRCINVERT = 0x00660046;   ///< destination exclusive-or source
inline constexpr DWORD NOTSRCCOPY = 0x00330008;  ///< the source, inverted

/// Copies a rectangle, combining stored values bit by bit. Source pixels that do not exist leave the
/// destination unchanged; source and destination may overlap.
/// @param dc,x,y,width,height destination; a negative size draws nothing
/// @param source,source_x,source_y context and upper left corner copied from
/// @param rop one of the codes above, of which bits 16 to 23 count
/// @return nonzero; 0 for another code (ERROR_INVALID_PARAMETER), a source turned or sheared by its
/// transform, and when a surface is copied onto itself through a transform and there is no memory for a copy
/// of it (ERROR_NOT_ENOUGH_MEMORY)
///
/// Between depths the source is converted first: from monochrome, 1 becomes the destination's background
/// colour and 0 its text colour; to monochrome, a pixel of the source's background colour (from up to 16
/// bits, of the stored value nearest to it) becomes 1 and any other 0; otherwise to the nearest colour.
///
/// Through a transform, a destination pixel takes the source pixel in which its middle lies.
/// Accuracy: of that place, 2^-32 pixels times the number of pixels across, and 2^-50 of the largest
/// intermediate coordinate, in pixels of the source.
BASALT_API BOOL BitBlt(HDC dc, int x, int y, int width, int height, HDC source, int source_x, int source_y,
                       DWORD rop);

/// Copies a rectangle except the pixels of one colour, stretched where the sizes differ: destination column i
/// takes source column (2 i + 1) source_width / (2 width), rounded down, and rows likewise.
/// @param dc,x,y,width,height destination
/// @param source,source_x,source_y,source_width,source_height the rectangle copied from
/// @param key the colour left out, 0x00BBGGRR; the unused byte of a pixel is ignored. From up to 16 bits the
/// stored value nearest to it is left out.
/// @return nonzero; 0 for a negative size, and when a surface is copied onto itself and there is no memory
/// for a copy of it (ERROR_NOT_ENOUGH_MEMORY). An empty destination or source draws nothing.
///
/// Conversion between depths as for BitBlt. Source pixels that do not exist leave the destination unchanged.
/// A copy onto the same surface reads the pixels from before the call.
BASALT_API BOOL TransparentBlt(HDC dc, int x, int y, int width, int height, HDC source, int source_x,
                               int source_y, int source_width, int source_height, UINT key);
/// @}

#endif
