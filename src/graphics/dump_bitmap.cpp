#include <cstddef>
#include <memory>
#include <new>
#include <optional>

#include "basalt/graphics/bitmap_functions.h"
#include "src/frame/codec_guard.h"
#include "src/platform/codec.h"

namespace basalt::graphics {

namespace {

/// Keeps the codec from being shut down while alive.
class LiveImage {
public:
    LiveImage() { frame::codec_guard.AddImage(); }
    ~LiveImage() { frame::codec_guard.ReleaseImage(); }
    LiveImage(const LiveImage&) = delete;
    LiveImage& operator=(const LiveImage&) = delete;
};

struct DisposeImage {
    void operator()(GpBitmap* image) const { GdipDisposeImage(image); }
};

/// The first encoder of the BMP format.
std::optional<CLSID> bmp_encoder() {
    UINT count = 0;
    UINT bytes = 0;
    if (GdipGetImageEncodersSize(&count, &bytes) != Gdiplus::Ok) {
        return std::nullopt;
    }
    // In whole records, for their alignment; texts may follow the last.
    const std::size_t records = (bytes + sizeof(ImageCodecInfo) - 1) / sizeof(ImageCodecInfo);
    const std::unique_ptr<ImageCodecInfo[]> encoders(new (std::nothrow) ImageCodecInfo[records]);
    if (encoders == nullptr || GdipGetImageEncoders(count, bytes, encoders.get()) != Gdiplus::Ok) {
        return std::nullopt;
    }
    for (UINT i = 0; i < count; ++i) {
        if (encoders[i].FormatID == ImageFormatBMP) {
            return encoders[i].Clsid;
        }
    }
    return std::nullopt;
}

}  // namespace

}  // namespace basalt::graphics

namespace vex_util::mfc {

void DumpBitmap(HBITMAP bitmap, const CString& fileName) {
    using namespace basalt::graphics;
    const LiveImage run;
    if (!basalt::frame::codec_guard.Start()) {
        return;
    }
    const std::optional<CLSID> encoder = bmp_encoder();
    GpBitmap* image = nullptr;
    if (!encoder || GdipCreateBitmapFromHBITMAP(bitmap, nullptr, &image) != Gdiplus::Ok) {
        return;
    }
    const std::unique_ptr<GpBitmap, DisposeImage> owner(image);
    GdipSaveImageToFile(image, fileName, &*encoder, nullptr);
}

}  // namespace vex_util::mfc
