/// @file
/// Drawing on the surface of a context. What holds for all handles is said in
/// basalt/platform/graphics_objects.h.
///
/// Rectangles end before their right column and bottom row. Whatever lies outside the surface is left out,
/// for any coordinates. A drawn colour becomes the nearest the surface's depth has; at 32 bits the high byte
/// is written as 0. Under a transform, FillRect fills and BitBlt copies to a parallelogram: the pixels whose
/// middles lie inside; GetPixel and SetPixel take the nearest pixel; the other calls fail
/// (ERROR_NOT_SUPPORTED) unless the transform is a shift by whole pixels. FillRect and BitBlt fail
/// (ERROR_ARITHMETIC_OVERFLOW) under a transform that reduces so strongly that the places two neighbouring
/// pixels come from lie 2^30 or more apart, across or down: in units of the context, or in pixels of BitBlt's
/// source.
///
/// All give 0 for a wrong handle, unless said otherwise.
#ifndef BASALT_PLATFORM_DRAWING_H
#define BASALT_PLATFORM_DRAWING_H

#include "basalt/export.h"
#include "basalt/platform/device_context.h"
#include "basalt/platform/graphics_types.h"

/// @name Pixels and shapes
/// @{

/// Colour of a pixel, high byte 0; CLR_INVALID outside the surface and for a wrong context.
BASALT_API COLORREF GetPixel(HDC dc, int x, int y);

/// Sets a pixel.
/// @return the colour it has now; CLR_INVALID outside the surface and for a wrong context
BASALT_API COLORREF SetPixel(HDC dc, int x, int y, COLORREF colour);

/// Fills a rectangle; an empty or reversed one is filled nowhere.
/// @return nonzero; 0 for a null rectangle and a transform that reduces too strongly
BASALT_API int FillRect(HDC dc, const RECT* rectangle, HBRUSH brush);

/// Fills a rectangle with rounded corners by the context's brush, and outlines it by its pen.
/// @param dc the context
/// @param left,top,right,bottom the rectangle; opposite sides may be exchanged
/// @param width,height of the whole ellipse of which each corner is a quarter: a corner is half of each.
/// Larger ones are cut to the rectangle's, negative ones count as positive.
/// @return nonzero
///
/// A pixel belongs to the shape if its middle lies inside, so the four corners are mirror images; with a null
/// pen too the shape fills the whole rectangle. The outline is the shape's own border pixels.
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
/// (C_b (p - a) + C_a (b - p)) / (b - a) in each channel: it starts with the first colour, and ends one step
/// short of the second. At 16 bits levels are cut, with fewer the nearest colour is taken.
/// @param dc the context
/// @param vertices,vertex_count the corners
/// @param mesh,mesh_count GRADIENT_RECT records; a rectangle without width or height is filled nowhere
/// @param mode GRADIENT_FILL_RECT_H or GRADIENT_FILL_RECT_V
/// @return nonzero; 0, and nothing is drawn, for a null pointer, a corner that is not there or another mode
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
inline constexpr DWORD PATCOPY = 0x00F00021;     ///< the brush
inline constexpr DWORD DSTINVERT = 0x00550009;   ///< the destination, inverted
inline constexpr DWORD BLACKNESS = 0x00000042;   ///< zeros
inline constexpr DWORD WHITENESS = 0x00FF0062;   ///< ones

/// Copies a rectangle, combining stored values bit by bit. Source pixels that do not exist leave the
/// destination alone; source and destination may overlap.
/// @param dc,x,y,width,height destination; a negative size draws nothing
/// @param source,source_x,source_y context and upper left corner copied from; the context may be null when
/// the code needs none
/// @param rop a code as above, or any other: bits 16 to 23 are its truth table, bit brush * 4 + source * 2 +
/// destination
/// @return nonzero; 0 for a source turned or sheared by its transform, for a transform that reduces too
/// strongly, and where a surface copied onto itself through a transform finds no memory for the picture it is
/// read from (ERROR_NOT_ENOUGH_MEMORY)
///
/// Between depths the source is brought to the destination's first: from monochrome, 1 becomes the
/// destination's background colour and 0 its text colour; to monochrome, a pixel of the source's background
/// colour (from up to 16 bits, of the stored value whose colour is nearest to it) becomes 1 and any other 0;
/// otherwise to the nearest colour.
///
/// Through a transform, a destination pixel takes the source pixel in which its middle lies.
/// Accuracy: of that place, 2^-32 pixels times the number of pixels across, and 2^-50 of the largest
/// coordinate on the way, in pixels of the source.
BASALT_API BOOL BitBlt(HDC dc, int x, int y, int width, int height, HDC source, int source_x, int source_y,
                       DWORD rop);

/// Copies a rectangle but for the pixels of one colour. To another size it stretches: destination column i
/// takes source column (2 i + 1) source_width / (2 width), rounded down, and rows likewise.
/// @param dc,x,y,width,height destination
/// @param source,source_x,source_y,source_width,source_height the rectangle copied from
/// @param key the colour left out, 0x00BBGGRR; the unused byte of a pixel plays no part. From up to 16 bits
/// the stored value whose colour is nearest to it is left out.
/// @return nonzero; 0 for a negative size, and where a surface copied onto itself finds no memory for the
/// picture it is read from (ERROR_NOT_ENOUGH_MEMORY). An empty destination or source draws nothing.
///
/// Between depths as BitBlt. Source pixels that do not exist leave the destination alone. Copying onto the
/// same surface gives what copying from a picture of it taken before would.
BASALT_API BOOL TransparentBlt(HDC dc, int x, int y, int width, int height, HDC source, int source_x,
                               int source_y, int source_width, int source_height, UINT key);
/// @}

#endif
