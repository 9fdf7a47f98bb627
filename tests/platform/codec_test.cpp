#include "src/platform/codec.h"

#include <gtest/gtest.h>
#include <sys/resource.h>

#include <filesystem>

#include "basalt/platform/bitmap.h"
#include "basalt/platform/error.h"
#include "tests/support/scratch_folder.h"

namespace {

using namespace Gdiplus;

template <class... Statuses>
bool refused(Statuses... statuses) {
    return (... && (statuses == InvalidParameter));
}

TEST(Codec, runs_from_the_first_start_to_the_last_end) {
    GdiplusStartupInput input = {2, nullptr, 0, 0};
    std::uintptr_t tokens[2] = {};
    UINT count = 0, size = 0;
    EXPECT_EQ(GdiplusStartup(&tokens[0], &input, nullptr), UnsupportedGdiplusVersion);
    input.GdiplusVersion = 1;
    EXPECT_TRUE(refused(GdiplusStartup(nullptr, &input, nullptr), GdiplusStartup(tokens, nullptr, nullptr)));
    for (int run = 0; run < 2; ++run) {
        EXPECT_EQ(GdipGetImageEncodersSize(&count, &size), GdiplusNotInitialized);
        EXPECT_EQ(GdiplusStartup(&tokens[0], &input, nullptr), Ok);
        EXPECT_TRUE(GdiplusStartup(&tokens[1], &input, nullptr) == Ok && tokens[0] != 0);
        GdiplusShutdown(0);
        GdiplusShutdown(tokens[0]);
        EXPECT_EQ(GdipGetImageEncodersSize(&count, &size), Ok);
        GdiplusShutdown(tokens[1]);
        GdiplusShutdown(tokens[1]);  // one more; the count of runs does not wrap
    }
    GpBitmap* image = nullptr;
    ImageCodecInfo encoder;
    for (const Status status : {GdipGetImageEncoders(1, sizeof encoder, &encoder), GdipDisposeImage(image),
                                GdipCreateBitmapFromHBITMAP(nullptr, nullptr, &image),
                                GdipSaveImageToFile(image, L"", nullptr, nullptr)}) {
        EXPECT_EQ(status, GdiplusNotInitialized);
    }
}

TEST(Codec, writes_a_bitmap_by_its_one_encoder_or_leaves_no_file) {
    const GdiplusStartupInput input = {1, nullptr, 0, 0};
    constexpr CLSID BMP = {0x557CF400, 0x1A04, 0x11D3, {0x9A, 0x73, 0, 0, 0xF8, 0x1E, 0xF3, 0x2E}};
    std::uintptr_t token = 0;
    UINT count = 0, size = 0;
    ImageCodecInfo encoder = {};
    GpBitmap* image = nullptr;
    CBitmap bitmap;
    bitmap.CreateBitmap(600, 300, 1, 24, nullptr);
    EXPECT_EQ(GdiplusStartup(&token, &input, nullptr), Ok);
    EXPECT_TRUE(GdipGetImageEncodersSize(&count, &size) == Ok && count == 1 && size == sizeof encoder);
    EXPECT_EQ(GdipGetImageEncoders(1, size - 1, &encoder), InsufficientBuffer);
    EXPECT_EQ(GdipGetImageEncoders(1, size, &encoder), Ok);
    EXPECT_TRUE(encoder.FormatID == ImageFormatBMP && encoder.Clsid == BMP);
    ASSERT_EQ(GdipCreateBitmapFromHBITMAP(bitmap, nullptr, &image), Ok);
    const basalt::test::ScratchFolder folder;
    const std::wstring name = folder.wide(L"picture.bmp");
    const auto error = [&](const std::wstring& into) {  // as far as the codec has one
        const Status status = GdipSaveImageToFile(image, into.c_str(), &encoder.Clsid, nullptr);
        return status == Win32Error ? GetLastError() : static_cast<DWORD>(status) << 16;
    };
    EXPECT_EQ(error(folder.wide(L"missing\\picture.bmp")), ERROR_FILE_NOT_FOUND);
    EXPECT_EQ(error(folder.wide(L"")), ERROR_ACCESS_DENIED);
    EXPECT_EQ(error(L""), ERROR_FILE_NOT_FOUND);
    EXPECT_EQ(error(folder.wide(L"\xD800.bmp")), ERROR_INVALID_NAME);
    EXPECT_EQ(error(L"/dev/full"), ERROR_DISK_FULL);
    EXPECT_TRUE(std::filesystem::exists("/dev/full")) << "a device is not deleted";
    rlimit before = {};
    getrlimit(RLIMIT_FSIZE, &before);
    const rlimit limit = {100000, before.rlim_max};
    setrlimit(RLIMIT_FSIZE, &limit);  // its signal would end the process
    EXPECT_EQ(error(name), ERROR_FILE_TOO_LARGE);
    setrlimit(RLIMIT_FSIZE, &before);
    EXPECT_TRUE(folder.names().empty());
    EXPECT_TRUE(refused(GdipGetImageEncodersSize(&count, nullptr), GdipGetImageEncoders(2, size, &encoder),
                        GdipCreateBitmapFromHBITMAP(nullptr, nullptr, &image),
                        GdipCreateBitmapFromHBITMAP(bitmap, nullptr, nullptr),
                        GdipCreateBitmapFromHBITMAP(bitmap, &count, &image), GdipDisposeImage(nullptr),
                        GdipSaveImageToFile(image, name.c_str(), &ImageFormatBMP, nullptr),
                        GdipSaveImageToFile(image, nullptr, &BMP, nullptr),
                        GdipSaveImageToFile(nullptr, name.c_str(), &BMP, nullptr),
                        GdipSaveImageToFile(image, name.c_str(), nullptr, nullptr)));
    EXPECT_TRUE(error(name) == Ok && folder.names().size() == 1);
    bitmap.DeleteObject();
    EXPECT_EQ(error(name), DWORD(InvalidParameter) << 16) << "its bitmap is gone";
    EXPECT_EQ(GdipDisposeImage(image), Ok);
    GdiplusShutdown(token);
}

}  // namespace
