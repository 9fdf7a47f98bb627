#include "src/platform/codec.h"

#include <atomic>
#include <cstring>
#include <new>

#include "src/platform/drawing/bmp_file.h"
#include "src/platform/drawing/objects.h"
#include "src/platform/system/failure.h"

struct GpImage {
    HBITMAP bitmap;
};

namespace {

using namespace basalt::platform;

constexpr CLSID BMP_ENCODER = {0x557CF400, 0x1A04, 0x11D3, {0x9A, 0x73, 0x00, 0x00, 0xF8, 0x1E, 0xF3, 0x2E}};
constexpr BYTE BMP_SIGNATURE[] = {'B', 'M'};
constexpr BYTE BMP_SIGNATURE_MASK[] = {0xFF, 0xFF};
// Encoder, reads bitmaps in memory, built in.
constexpr DWORD ENCODER_FLAGS = 0x00000001 | 0x00000004 | 0x00010000;

constexpr ImageCodecInfo ENCODERS[] = {{BMP_ENCODER, ImageFormatBMP, L"Built-in BMP Codec", nullptr, L"BMP",
                                        L"*.BMP;*.DIB;*.RLE", L"image/bmp", ENCODER_FLAGS, 1, 1,
                                        sizeof BMP_SIGNATURE, BMP_SIGNATURE, BMP_SIGNATURE_MASK}};
constexpr UINT ENCODER_COUNT = sizeof ENCODERS / sizeof ENCODERS[0];

constexpr std::uint32_t VERSION = 1;
constexpr std::uintptr_t TOKEN = 0xB17C0DEC;  // all runs share one

constinit std::atomic<std::uint32_t> runs = 0;

}  // namespace

Gdiplus::Status GdiplusStartup(std::uintptr_t* token, const GdiplusStartupInput* input,
                               GdiplusStartupOutput* /*output*/) {
    if (token == nullptr || input == nullptr) {
        return Gdiplus::InvalidParameter;
    }
    if (input->GdiplusVersion != VERSION) {
        return Gdiplus::UnsupportedGdiplusVersion;
    }
    ++runs;
    *token = TOKEN;
    return Gdiplus::Ok;
}

void GdiplusShutdown(std::uintptr_t token) {
    std::uint32_t before = runs;
    while (token == TOKEN && before > 0 && !runs.compare_exchange_weak(before, before - 1)) {
    }
}

Gdiplus::Status GdipGetImageEncodersSize(UINT* count, UINT* size) {
    if (runs == 0) {
        return Gdiplus::GdiplusNotInitialized;
    }
    if (count == nullptr || size == nullptr) {
        return Gdiplus::InvalidParameter;
    }
    *count = ENCODER_COUNT;
    *size = sizeof ENCODERS;
    return Gdiplus::Ok;
}

Gdiplus::Status GdipGetImageEncoders(UINT count, UINT size, ImageCodecInfo* encoders) {
    if (runs == 0) {
        return Gdiplus::GdiplusNotInitialized;
    }
    if (encoders == nullptr || count != ENCODER_COUNT) {
        return Gdiplus::InvalidParameter;
    }
    if (size < sizeof ENCODERS) {
        return Gdiplus::InsufficientBuffer;
    }
    std::memcpy(encoders, ENCODERS, sizeof ENCODERS);
    return Gdiplus::Ok;
}

Gdiplus::Status GdipCreateBitmapFromHBITMAP(HBITMAP bitmap, void* palette, GpBitmap** image) {
    if (runs == 0) {
        return Gdiplus::GdiplusNotInitialized;
    }
    if (image == nullptr || palette != nullptr || object_of<Bitmap>(bitmap) == nullptr) {
        return Gdiplus::InvalidParameter;
    }
    *image = new (std::nothrow) GpImage{bitmap};
    return *image != nullptr ? Gdiplus::Ok : Gdiplus::OutOfMemory;
}

Gdiplus::Status GdipSaveImageToFile(GpImage* image, const wchar_t* name, const CLSID* encoder,
                                    const EncoderParameters* parameters) {
    if (runs == 0) {
        return Gdiplus::GdiplusNotInitialized;
    }
    if (image == nullptr || name == nullptr || encoder == nullptr || parameters != nullptr ||
        *encoder != BMP_ENCODER) {
        return Gdiplus::InvalidParameter;
    }
    const auto* const bitmap = object_of<Bitmap>(image->bitmap);
    if (bitmap == nullptr) {
        return Gdiplus::InvalidParameter;
    }
    return or_out_of_memory(Gdiplus::OutOfMemory, [&] {
        return write_bmp_file(bitmap->surface, name) ? Gdiplus::Ok : Gdiplus::Win32Error;
    });
}

Gdiplus::Status GdipDisposeImage(GpImage* image) {
    if (runs == 0) {
        return Gdiplus::GdiplusNotInitialized;
    }
    if (image == nullptr) {
        return Gdiplus::InvalidParameter;
    }
    delete image;
    return Gdiplus::Ok;
}
