// The image codec (GDI+): starting it, listing its encoders, and writing a bitmap to a file.
//
// The one encoder writes BMP: the bitmap's own depth, uncompressed, bottom row first, the unused byte of
// 32-bit pixels as 0. All calls but GdiplusStartup and GdiplusShutdown return GdiplusNotInitialized while the
// codec does not run. Threads: all calls are thread-safe; one thread at a time uses an image.
#ifndef BASALT_SRC_PLATFORM_CODEC_H
#define BASALT_SRC_PLATFORM_CODEC_H

#include <cstdint>

#include "basalt/platform/graphics_types.h"

namespace Gdiplus {

enum Status : int {
    Ok = 0,
    GenericError = 1,
    InvalidParameter = 2,
    OutOfMemory = 3,
    InsufficientBuffer = 5,
    Win32Error = 7,  // see the last error
    UnsupportedGdiplusVersion = 17,
    GdiplusNotInitialized = 18,
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

struct ImageCodecInfo {
    CLSID Clsid;
    GUID FormatID;
    const wchar_t* CodecName;
    const wchar_t* DllName;  // null: built in
    const wchar_t* FormatDescription;
    const wchar_t* FilenameExtension;  // patterns, separated by ;
    const wchar_t* MimeType;
    DWORD Flags;
    DWORD Version;
    DWORD SigCount;
    DWORD SigSize;
    const BYTE* SigPattern;
    const BYTE* SigMask;
};

struct GpImage;
using GpBitmap = GpImage;
struct EncoderParameters;

// Begins a run. token takes the argument of GdiplusShutdown, never 0. The version is 1; the input's other
// fields are ignored, as there is no background thread and no external codec, and output may be null.
Gdiplus::Status GdiplusStartup(std::uintptr_t* token, const GdiplusStartupInput* input,
                               GdiplusStartupOutput* output);
// Ends a run; any other token is ignored.
void GdiplusShutdown(std::uintptr_t token);

// The number of encoders and the bytes that GdipGetImageEncoders needs for their list.
Gdiplus::Status GdipGetImageEncodersSize(UINT* count, UINT* size);
// The list; InsufficientBuffer when the size is too small, InvalidParameter for another count.
Gdiplus::Status GdipGetImageEncoders(UINT count, UINT size, ImageCodecInfo* encoders);

// Makes an image of a bitmap, which stays the caller's and is read when the image is saved. InvalidParameter
// for a handle that is no bitmap. palette is null.
Gdiplus::Status GdipCreateBitmapFromHBITMAP(HBITMAP bitmap, void* palette, GpBitmap** image);
// Writes an image to a file, which is created or truncated. Win32Error when that fails; the file is deleted
// unless it could not be opened. OutOfMemory when out of memory for the name. parameters is null.
Gdiplus::Status GdipSaveImageToFile(GpImage* image, const wchar_t* name, const CLSID* encoder,
                                    const EncoderParameters* parameters);
// Deletes an image; the bitmap stays.
Gdiplus::Status GdipDisposeImage(GpImage* image);

#endif
