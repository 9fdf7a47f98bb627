#include "src/platform/codec.h"

#include <gtest/gtest.h>
#include <sys/resource.h>

#include <filesystem>

#include "basalt/platform/bitmap.h"
#include "basalt/platform/error.h"
#include "tests/support/scratch_folder.h"

namespace {

using namespace Gdiplus;

TEST(Codec, runs_from_the_first_start_to_the_last_end) {
    GdiplusStartupInput input = {2, nullptr, 0, 0};
    std::uintptr_t tokens[2] = {};
    UINT count = 0, size = 0;
    EXPECT_EQ(GdiplusStartup(&tokens[0], &input, nullptr), UnsupportedGdiplusVersion);
    input.GdiplusVersion = 1;
    EXPECT_TRUE(GdiplusStartup(nullptr, &input, nullptr) == InvalidParameter &&
                GdiplusStartup(tokens, nullptr, nullptr) == InvalidParameter);
    for (int run = 0; run < 2; ++run) {
        EXPECT_EQ(GdipGetImageEncodersSize(&count, &size), GdiplusNotInitialized);
        EXPECT_TRUE(GdiplusStartup(&tokens[0], &input, nullptr) == Ok &&
                    GdiplusStartup(&tokens[1], &input, nullptr) == Ok);
        EXPECT_NE(tokens[0], 0U);
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
    std::uintptr_t token = 0;
    UINT count = 0, size = 0;
    ImageCodecInfo encoder = {};
    GdiplusStartup(&token, &input, nullptr);
    EXPECT_TRUE(GdipGetImageEncodersSize(&count, nullptr) == InvalidParameter &&
                GdipGetImageEncodersSize(&count, &size) == Ok);
    EXPECT_TRUE(count == 1 && size == sizeof encoder &&
                GdipGetImageEncoders(1, size - 1, &encoder) == InsufficientBuffer);
    EXPECT_TRUE(GdipGetImageEncoders(2, size, &encoder) == InvalidParameter &&
                GdipGetImageEncoders(1, size, &encoder) == Ok);
    EXPECT_TRUE(encoder.FormatID == ImageFormatBMP &&
                encoder.Clsid ==
                    (CLSID{0x557CF400, 0x1A04, 0x11D3, {0x9A, 0x73, 0, 0, 0xF8, 0x1E, 0xF3, 0x2E}}));
    CBitmap bitmap;
    GpBitmap* image = nullptr;
    bitmap.CreateBitmap(600, 300, 1, 24, nullptr);
    EXPECT_TRUE(GdipCreateBitmapFromHBITMAP(nullptr, nullptr, &image) == InvalidParameter &&
                GdipCreateBitmapFromHBITMAP(bitmap, nullptr, nullptr) == InvalidParameter);
    ASSERT_EQ(GdipCreateBitmapFromHBITMAP(bitmap, nullptr, &image), Ok);
    const basalt::test::ScratchFolder folder;
    const auto save = [&](const std::wstring& name) {
        return GdipSaveImageToFile(image, name.c_str(), &encoder.Clsid, nullptr);
    };
    const struct {
        std::wstring name;
        DWORD error;
    } refused[] = {{folder.wide(L"missing\\picture.bmp"), ERROR_FILE_NOT_FOUND},
                   {folder.wide(L""), ERROR_ACCESS_DENIED},
                   {L"", ERROR_FILE_NOT_FOUND},
                   {folder.wide(L"\xD800.bmp"), ERROR_INVALID_NAME},
                   {L"/dev/full", ERROR_DISK_FULL}};
    for (const auto& [name, error] : refused) {
        EXPECT_EQ(save(name), Win32Error);
        EXPECT_EQ(GetLastError(), error);
    }
    EXPECT_TRUE(std::filesystem::exists("/dev/full")) << "a device is not deleted";
    rlimit before = {};
    getrlimit(RLIMIT_FSIZE, &before);
    const rlimit limit = {100000, before.rlim_max};
    setrlimit(RLIMIT_FSIZE, &limit);  // its signal would end the process
    EXPECT_TRUE(save(folder.wide(L"picture.bmp")) == Win32Error && GetLastError() == ERROR_FILE_TOO_LARGE);
    setrlimit(RLIMIT_FSIZE, &before);
    EXPECT_TRUE(folder.names().empty());
    EXPECT_TRUE(save(folder.wide(L"picture.bmp")) == Ok && folder.names().size() == 1);
    const std::wstring name = folder.wide(L"no.bmp");
    EXPECT_EQ(GdipSaveImageToFile(image, name.c_str(), &ImageFormatBMP, nullptr), InvalidParameter);
    EXPECT_EQ(GdipSaveImageToFile(image, nullptr, &encoder.Clsid, nullptr), InvalidParameter);
    EXPECT_EQ(GdipSaveImageToFile(nullptr, name.c_str(), &encoder.Clsid, nullptr), InvalidParameter);
    EXPECT_EQ(GdipSaveImageToFile(image, name.c_str(), nullptr, nullptr), InvalidParameter);
    bitmap.DeleteObject();
    EXPECT_EQ(save(name), InvalidParameter) << "its bitmap is gone";
    EXPECT_TRUE(GdipDisposeImage(nullptr) == InvalidParameter && GdipDisposeImage(image) == Ok);
    GdiplusShutdown(token);
}

}  // namespace
