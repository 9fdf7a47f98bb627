#include "src/platform/codec.h"

#include <new>

#include "src/platform/drawing/bmp_file.h"
#include "src/platform/drawing/objects.h"
#include "src/platform/system/failure.h"

struct GpImage {
    const basalt::platform::Bitmap& bitmap;
};

namespace {

using namespace basalt::platform;

constexpr CLSID BMP_ENCODER = {0x557CF400, 0x1A04, 0x11D3, {0x9A, 0x73, 0x00, 0x00, 0xF8, 0x1E, 0xF3, 0x2E}};
constexpr ImageCodecInfo ENCODER = {BMP_ENCODER, ImageFormatBMP};
constexpr std::uintptr_t TOKEN = 0xB17C0DEC;  // all runs share one

}  // namespace

Gdiplus::Status GdiplusStartup(std::uintptr_t* token, const GdiplusStartupInput* /*input*/,
                               GdiplusStartupOutput* /*output*/) {
    *token = TOKEN;
    return Gdiplus::Ok;
}

void GdiplusShutdown(std::uintptr_t /*token*/) {}

Gdiplus::Status GdipGetImageEncodersSize(UINT* count, UINT* size) {
    *count = 1;
    *size = sizeof ENCODER;
    return Gdiplus::Ok;
}

Gdiplus::Status GdipGetImageEncoders(UINT /*count*/, UINT /*size*/, ImageCodecInfo* encoders) {
    *encoders = ENCODER;
    return Gdiplus::Ok;
}

Gdiplus::Status GdipCreateBitmapFromHBITMAP(HBITMAP bitmap, void* /*palette*/, GpBitmap** image) {
    const auto* const source = object_of<Bitmap>(bitmap);
    if (source == nullptr) {
        return Gdiplus::InvalidParameter;
    }
    *image = new (std::nothrow) GpImage{*source};
    return *image != nullptr ? Gdiplus::Ok : Gdiplus::OutOfMemory;
}

Gdiplus::Status GdipSaveImageToFile(GpImage* image, const wchar_t* name, const CLSID* /*encoder*/,
                                    const EncoderParameters* /*parameters*/) {
    return or_out_of_memory(Gdiplus::OutOfMemory, [&] {
        return write_bmp_file(image->bitmap.surface, name) ? Gdiplus::Ok : Gdiplus::Win32Error;
    });
}

Gdiplus::Status GdipDisposeImage(GpImage* image) {
    delete image;
    return Gdiplus::Ok;
}
