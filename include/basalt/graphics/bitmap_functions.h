/// @file
/// Bitmaps: to a file, to rows of pixels, rotated, and as a region. basalt/graphics.h has what holds for all
/// of graphics.
///
/// Threads: those that may use the bitmap and the context. Calls of DumpBitmap at the same time share one run
/// of the image codec.
#ifndef BASALT_GRAPHICS_BITMAP_FUNCTIONS_H
#define BASALT_GRAPHICS_BITMAP_FUNCTIONS_H

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
/// Bad input: nothing is reported. A handle that is no bitmap leaves an existing file unchanged; a file that
/// cannot be written completely, for a full disk or a limit on file sizes, is deleted.
BASALT_API void DumpBitmap(HBITMAP bitmap, const CString& fileName);

/// Reads a bitmap's pixels in its own depth, top row first.
/// @param bitmap the bitmap
/// @param[out] header of the pixels: size 40, width, the height as a negative number, planes, bits per pixel,
/// no compression; also on failure
/// @return the rows, each padded to a multiple of 4 bytes, for the caller to release with delete[]; null when
/// there is no bitmap or its rows cannot be read. 1, 4 and 8 bits are indices into the platform's table of
/// colours (basalt/platform/bitmap.h).
///
/// std::bad_alloc when out of memory.
BASALT_API unsigned char* GetDIBits(CBitmap& bitmap, BITMAPINFOHEADER& header);

/// Rotates a bitmap's picture about the middle, (width / 2, height / 2) in whole pixels. The bitmap keeps its
/// size: what leaves it is lost, and pixels that no source pixel covers become red 128, green 128, blue 0.
/// @param dc context to be compatible with
/// @param bitmap the bitmap, not selected into a context
/// @param angle degrees, clockwise
/// @return whether the picture was rotated. False, and nothing changes, for an angle of 0 or not finite, a
/// null pointer, a bitmap that does not exist or is selected elsewhere, and when out of memory.
///
/// A pixel takes the source pixel in which its middle lies, without mixing. On a bitmap of even sides
/// multiples of 90 degrees rotate the square in the middle exactly, pixel for pixel; at an odd side one line
/// is lost and one uncovered.
BASALT_API bool RotateBitmap(CDC* dc, CBitmap* bitmap, float angle);

/// Makes a region of a bitmap's pixels that are not of one colour.
/// @param[out] region owns no region yet; takes the new one, which is empty when all pixels are of the colour
/// @param bitmap the bitmap
/// @param transparentColour 0x00BBGGRR, the high byte is ignored. At 32 bits a pixel whose unused byte is not
/// 0 equals no colour; at 16 the colour is rounded to 5 bits a channel first, as drawing in it does, and a
/// pixel whose unused bit is set equals no colour; at other depths the colours of the pixels are compared.
/// @return false, and the region is unchanged, when it owns one already, the colour exceeds 32 bits, the
/// bitmap cannot be read or no region can be made
///
/// std::bad_alloc when out of memory for the rectangles; the region is unchanged. Time: by the pixels and
/// their runs; memory: by the rectangles.
BASALT_API bool RegionFromBitmap(CRgn& region, CBitmap& bitmap, unsigned long transparentColour);

}  // namespace vex_util::mfc

#endif
