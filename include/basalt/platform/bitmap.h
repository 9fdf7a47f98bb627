/// @file
/// Bitmaps: creation, description, and their rows in a given format. basalt/platform/graphics_objects.h has
/// what holds for all drawing objects.
///
/// Depths and stored values: 1 bit (bit 7 of the first byte is the left pixel; 0 black, 1 white), 4 (the high
/// nibble is the left pixel) and 8 bits are indices into a fixed table of colours: the 16 standard ones, and
/// 256 that include the 20 system colours, 0 black and 255 white. 16 bits are 5-5-5: red in bits 10 to 14,
/// green in 5 to 9, blue in 0 to 4. 24 bits are bytes blue, green, red; 32 bits the word 0x00RRGGBB, whose
/// high byte is copied but has no meaning.
#ifndef BASALT_PLATFORM_BITMAP_H
#define BASALT_PLATFORM_BITMAP_H

#include "basalt/export.h"
#include "basalt/platform/graphics_objects.h"
#include "basalt/platform/graphics_types.h"

/// Description of a bitmap.
struct BITMAP {
    LONG bmType;        ///< 0
    LONG bmWidth;       ///< columns
    LONG bmHeight;      ///< rows
    LONG bmWidthBytes;  ///< bytes of a row, padded to 16 bits
    WORD bmPlanes;      ///< 1
    WORD bmBitsPixel;   ///< 1, 4, 8, 16, 24 or 32
    void* bmBits;       ///< null: the rows belong to the platform
};

/// Header of a device-independent image.
struct BITMAPINFOHEADER {
    DWORD biSize;          ///< 40
    LONG biWidth;          ///< columns
    LONG biHeight;         ///< rows: positive with the bottom row first, negative with the top row first
    WORD biPlanes;         ///< 1
    WORD biBitCount;       ///< bits per pixel
    DWORD biCompression;   ///< BI_RGB
    DWORD biSizeImage;     ///< bytes of all rows
    LONG biXPelsPerMeter;  ///< pixels per metre, 0 if not known
    LONG biYPelsPerMeter;  ///< pixels per metre, 0 if not known
    DWORD biClrUsed;       ///< colours in the table, 0 for all
    DWORD biClrImportant;  ///< important colours, 0 for all
};

/// An entry of an image's table of colours.
struct RGBQUAD {
    BYTE rgbBlue;      ///< blue
    BYTE rgbGreen;     ///< green
    BYTE rgbRed;       ///< red
    BYTE rgbReserved;  ///< 0
};

/// Header of a device-independent image with the first entry of its table.
struct BITMAPINFO {
    BITMAPINFOHEADER bmiHeader;  ///< the header
    RGBQUAD bmiColors[1];        ///< the table: 2, 16 or 256 entries at 1, 4 or 8 bits
};

static_assert(sizeof(BITMAPINFOHEADER) == 40 && sizeof(RGBQUAD) == 4, "the sizes of Win32");

inline constexpr DWORD BI_RGB = 0;         ///< uncompressed
inline constexpr UINT DIB_RGB_COLORS = 0;  ///< a table of colours follows the header

/// @name Bitmaps
/// Width or height 0 gives a monochrome bitmap of one pixel. The result is null for a negative size and for
/// rows that together take 2^31 bytes or more (ERROR_INVALID_PARAMETER), and when out of memory
/// (ERROR_NOT_ENOUGH_MEMORY).
/// @{

/// A bitmap in the format of a context: that of its selected bitmap, which in a new memory context is
/// monochrome; 32 bits for the screen. All its pixels are 0.
BASALT_API HBITMAP CreateCompatibleBitmap(HDC dc, int width, int height);

/// A bitmap of any depth.
/// @param width columns
/// @param height rows
/// @param planes 1
/// @param bits_per_pixel 1, 4, 8, 16, 24 or 32
/// @param bits the rows, top row first, each padded to 16 bits; null for pixels that are all 0
/// @return null for other planes and depths too (ERROR_INVALID_PARAMETER)
BASALT_API HBITMAP CreateBitmap(int width, int height, UINT planes, UINT bits_per_pixel, const void* bits);

/// Copies rows of a bitmap in the format of a header: in the bitmap's own depth as they are stored, in
/// another with each colour replaced by the nearest of that depth.
/// @param dc any context
/// @param bitmap the bitmap, selected or not; the stock bitmap that SelectObject returns has no rows of its
/// own: 0 (ERROR_INVALID_HANDLE)
/// @param first first row to copy, counted in the header's order of rows
/// @param count number of rows; those beyond the last are ignored
/// @param[out] bits buffer for the rows, each padded to 32 bits: (width * bits + 31) / 32 * 4 bytes; null
/// copies nothing
/// @param[in,out] info header: size 40, the bitmap's width, its height of either sign, planes 1, a depth,
/// BI_RGB. biSizeImage is filled in. The table of 2, 16 or 256 colours at 1, 4 or 8 bits follows it. With
/// null bits and biBitCount 0, width, height, planes, depth and compression are filled in instead.
/// @param usage DIB_RGB_COLORS
/// @return rows copied; without bits 1 on success; 0 for any other header or usage (ERROR_INVALID_PARAMETER)
BASALT_API int GetDIBits(HDC dc, HBITMAP bitmap, UINT first, UINT count, void* bits, BITMAPINFO* info,
                         UINT usage);
/// @}

class CDC;

/// Owner of a bitmap.
class BASALT_API CBitmap : public CGdiObject {
public:
    CBitmap() = default;
    ~CBitmap() = default;
    CBitmap(const CBitmap&) = delete;
    CBitmap& operator=(const CBitmap&) = delete;

    /// A wrapper that does not own the bitmap; valid as long as the bitmap exists.
    /// @return null for a wrong handle
    static CBitmap* FromHandle(HBITMAP bitmap);

    /// The handle; null when there is none.
    operator HBITMAP() const { return static_cast<HBITMAP>(m_hObject); }

    /// Creates as ::CreateBitmap does.
    /// @return nonzero; 0 when it fails or a bitmap is owned already
    BOOL CreateBitmap(int width, int height, UINT planes, UINT bits_per_pixel, const void* bits) {
        return m_hObject == nullptr ? Attach(::CreateBitmap(width, height, planes, bits_per_pixel, bits)) : 0;
    }
    /// Creates as ::CreateCompatibleBitmap does.
    /// @return nonzero; 0 when it fails, the context is null or a bitmap is owned already
    BOOL CreateCompatibleBitmap(CDC* dc, int width, int height);
    /// Describes the bitmap.
    /// @return bytes written; 0 without a bitmap
    int GetBitmap(BITMAP* record) const { return GetObject(static_cast<int>(sizeof *record), record); }
};

#endif
