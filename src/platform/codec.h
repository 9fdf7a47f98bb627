// The image codec (GDI+): starting it, listing its encoders, and writing a bitmap to a file.
//
// The one encoder writes BMP: the bitmap's own depth, uncompressed, bottom row first, the unused byte of
// 32-bit pixels as 0. All other calls come between GdiplusStartup and GdiplusShutdown, with pointers that are
// not null unless it is said. Threads: all calls are thread-safe; one thread at a time uses an image.
#ifndef BASALT_SRC_PLATFORM_CODEC_H
#define BASALT_SRC_PLATFORM_CODEC_H

#include <cstdint>

#include "basalt/platform/graphics_types.h"

namespace Gdiplus {

enum Status : int {
    Ok = 0,
    InvalidParameter = 2,
    OutOfMemory = 3,
    Win32Error = 7,  // see the last error
};

}  // namespace Gdiplus

struct GUID {
    std::uint32_t Data1;
    std::uint16_t Data2;
    std::uint16_t Data3;
    std::uint8_t Data4[8];
    friend bool operator==(const GUID&, const GUID&) = default;
};
using CLSID = GUID;

// The BMP format.
inline constexpr GUID ImageFormatBMP = {
    0xB96B3CAB, 0x0728, 0x11D3, {0x9D, 0x7B, 0, 0, 0xF8, 0x1E, 0xF3, 0x2E}};

struct GdiplusStartupInput {
    std::uint32_t GdiplusVersion;
    void (*DebugEventCallback)(int level, char* message);
    BOOL SuppressBackgroundThread;
    BOOL SuppressExternalCodecs;
};

struct GdiplusStartupOutput;

// With the fields of Win32's that are used.
struct ImageCodecInfo {
    CLSID Clsid;
    GUID FormatID;
};

struct GpImage;
using GpBitmap = GpImage;
struct EncoderParameters;

// Begins a run. token takes the argument of GdiplusShutdown, never 0. The input's version is 1 and its other
// fields are ignored, as there is no background thread and no external codec; output may be null. There is
// nothing to start or to release here, so it does not fail.
Gdiplus::Status GdiplusStartup(std::uintptr_t* token, const GdiplusStartupInput* input,
                               GdiplusStartupOutput* output);
// Ends a run.
void GdiplusShutdown(std::uintptr_t token);

// The number of encoders and the bytes that GdipGetImageEncoders needs for their list.
Gdiplus::Status GdipGetImageEncodersSize(UINT* count, UINT* size);
// The list, with the count and size that GdipGetImageEncodersSize returned.
Gdiplus::Status GdipGetImageEncoders(UINT count, UINT size, ImageCodecInfo* encoders);

// Makes an image of a bitmap, which stays the caller's, outlives the image and is read when that is saved.
// InvalidParameter for a handle that is no bitmap. palette is null.
Gdiplus::Status GdipCreateBitmapFromHBITMAP(HBITMAP bitmap, void* palette, GpBitmap** image);
// Writes an image to a file, which is created or truncated. Win32Error when that fails; the file is deleted
// unless it could not be opened. OutOfMemory when out of memory for the name. encoder is from the list,
// parameters is null.
Gdiplus::Status GdipSaveImageToFile(GpImage* image, const wchar_t* name, const CLSID* encoder,
                                    const EncoderParameters* parameters);
// Deletes an image; the bitmap stays.
Gdiplus::Status GdipDisposeImage(GpImage* image);

#endif
