/// @file
/// Bitmaps: to a file, to rows of pixels, rotated, and as a region. What holds for all of graphics is said in
/// basalt/graphics.h.
///
/// Threads: those that may use the bitmap and the context given. Nothing is shared but the run of the image
/// codec, which calls of DumpBitmap at the same time use together.
#ifndef BASALT_GRAPHICS_BITMAP_H
#define BASALT_GRAPHICS_BITMAP_H

#include "basalt/export.h"
#include "basalt/platform/bitmap.h"
#include "basalt/platform/cstring.h"
#include "basalt/platform/device_context.h"
#include "basalt/platform/region.h"

namespace vex_util::mfc {

/// Writes a bitmap to a file in the BMP format, whatever the name ends in. An existing file is replaced.
/// @param bitmap the bitmap, not selected into a context; it stays the caller's
/// @param fileName path, UTF-8 on this system
///
/// Bad input: nothing is reported. A handle that is no bitmap leaves the name as it is; a file that cannot be
/// written to its end, for a full disk or a limit on file sizes, is deleted again.
BASALT_API void DumpBitmap(HBITMAP bitmap, const CString& fileName);

/// Reads a bitmap's pixels in its own depth, top row first.
/// @param bitmap the bitmap
/// @param[out] header of the pixels: size 40, width, the height as a negative number, planes, bits per pixel,
/// no compression; also on failure
/// @return the rows, each padded to a multiple of 4 bytes, for the caller to release with delete[]; null when
/// there is no bitmap or its rows cannot be read. 1, 4 and 8 bits are numbers in the platform's table of
/// colours (basalt/platform/bitmap.h).
///
/// std::bad_alloc without memory for the rows.
BASALT_API unsigned char* GetDIBits(CBitmap& bitmap, BITMAPINFOHEADER& header);

/// Turns a bitmap's picture about the middle, (width / 2, height / 2) in whole pixels. The bitmap keeps its
/// size: what turns out of it is lost, and what nothing turns into becomes red 128, green 128, blue 0.
/// @param dc context to be compatible with
/// @param bitmap the bitmap, not selected into a context
/// @param angle degrees, clockwise
/// @return whether the picture was turned. False, and nothing changes, for an angle of 0 or that is not
/// finite, a null pointer, a bitmap that does not exist or is selected elsewhere, and without memory.
///
/// A pixel takes the one its middle comes from, without mixing. On a bitmap of even sides multiples of 90
/// degrees turn the square in the middle exactly, pixel for pixel; of an odd side one line goes the way of
/// the corners.
BASALT_API bool RotateBitmap(CDC* dc, CBitmap* bitmap, float angle);

/// Makes a region of a bitmap's pixels that are not of one colour.
/// @param[out] region without a region so far; takes the new one, which is empty when all pixels are of the
/// colour
/// @param bitmap the bitmap
/// @param transparentColour 0x00BBGGRR, the high byte plays no part. At 32 bits a pixel whose unused byte is
/// not 0 is of no colour; at 16 the colour is brought to the nearest of 5 bits a channel first, as drawing in
/// it does, and a pixel whose unused bit is set is of no colour; at other depths the colours of the pixels
/// are compared.
/// @return false, and the region stays as it is, when it holds one already, the colour exceeds 32 bits, the
/// bitmap cannot be read or no region can be made
///
/// std::bad_alloc without memory for rows or rectangles; the region stays as it is. Time: by the pixels and
/// the runs of pixels in the rows.
BASALT_API bool RegionFromBitmap(CRgn& region, CBitmap& bitmap, unsigned long transparentColour);

}  // namespace vex_util::mfc

#endif
