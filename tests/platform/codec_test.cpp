#include "src/platform/codec.h"

#include <gtest/gtest.h>
#include <sys/resource.h>

#include <filesystem>
#include <string>

#include "tests/support/drawing.h"
#include "tests/support/failing_new.h"
#include "tests/support/scratch_folder.h"

namespace {

using drawing::Canvas;

/// A run of the codec, its one encoder, and a folder for files.
class CodecTest : public testing::Test {
protected:
    void SetUp() override {
        const GdiplusStartupInput input = {1, nullptr, 0, 0};
        ASSERT_EQ(GdiplusStartup(&m_token, &input, nullptr), Gdiplus::Ok);
        UINT count = 0;
        UINT size = 0;
        ASSERT_EQ(GdipGetImageEncodersSize(&count, &size), Gdiplus::Ok);
        ASSERT_EQ(count, 1U);
        ASSERT_EQ(size, sizeof m_encoder);
        EXPECT_EQ(GdipGetImageEncoders(count, size - 1, &m_encoder), Gdiplus::InsufficientBuffer);
        ASSERT_EQ(GdipGetImageEncoders(count, size, &m_encoder), Gdiplus::Ok);
        EXPECT_EQ(m_encoder.FormatID, ImageFormatBMP);
        const CLSID published = {
            0x557CF400, 0x1A04, 0x11D3, {0x9A, 0x73, 0x00, 0x00, 0xF8, 0x1E, 0xF3, 0x2E}};
        EXPECT_EQ(m_encoder.Clsid, published);
    }
    void TearDown() override { GdiplusShutdown(m_token); }

    Gdiplus::Status save(HBITMAP bitmap, const std::wstring& name) const {
        GpBitmap* image = nullptr;
        EXPECT_EQ(GdipCreateBitmapFromHBITMAP(bitmap, nullptr, &image), Gdiplus::Ok);
        const Gdiplus::Status status = GdipSaveImageToFile(image, name.c_str(), &m_encoder.Clsid, nullptr);
        EXPECT_EQ(GdipDisposeImage(image), Gdiplus::Ok);
        return status;
    }
    std::wstring file(const wchar_t* name) const { return m_folder.wide(name); }

    std::uintptr_t m_token = 0;
    const basalt::test::ScratchFolder m_folder;
    ImageCodecInfo m_encoder = {};
};

TEST_F(CodecTest, LeavesNoFileWhereNoneCanBeWritten) {
    const Canvas canvas(600, 300, 24);
    EXPECT_EQ(save(canvas.bitmap(), file(L"missing\\picture.bmp")), Gdiplus::Win32Error);
    EXPECT_EQ(GetLastError(), ERROR_FILE_NOT_FOUND);
    EXPECT_EQ(save(canvas.bitmap(), m_folder.wide(L"")), Gdiplus::Win32Error);
    EXPECT_EQ(save(canvas.bitmap(), L""), Gdiplus::Win32Error);
    EXPECT_EQ(save(canvas.bitmap(), file(L"\xD800.bmp")), Gdiplus::Win32Error);
    EXPECT_EQ(GetLastError(), ERROR_INVALID_NAME);
    if (std::filesystem::exists("/dev/full")) {
        EXPECT_EQ(save(canvas.bitmap(), L"/dev/full"), Gdiplus::Win32Error);
        EXPECT_EQ(GetLastError(), ERROR_DISK_FULL);
        EXPECT_TRUE(std::filesystem::exists("/dev/full")) << "a device is not deleted";
    }
    EXPECT_TRUE(m_folder.names().empty());
}

// The signal of the limit would end the process.
TEST_F(CodecTest, LeavesNoFileBeyondTheLimitOnFileSizes) {
    const Canvas canvas(600, 300, 24);
    rlimit before = {};
    getrlimit(RLIMIT_FSIZE, &before);
    const rlimit limit = {100000, before.rlim_max};
    setrlimit(RLIMIT_FSIZE, &limit);
    const Gdiplus::Status status = save(canvas.bitmap(), file(L"picture.bmp"));
    setrlimit(RLIMIT_FSIZE, &before);
    EXPECT_EQ(status, Gdiplus::Win32Error);
    EXPECT_EQ(GetLastError(), ERROR_FILE_TOO_LARGE);
    EXPECT_TRUE(m_folder.names().empty());
    EXPECT_EQ(save(canvas.bitmap(), file(L"picture.bmp")), Gdiplus::Ok);
}

TEST_F(CodecTest, SaysThatMemoryForTheNameIsMissing) {
    const Canvas canvas(2, 2, 24);
    GpBitmap* image = nullptr;
    ASSERT_EQ(GdipCreateBitmapFromHBITMAP(canvas.bitmap(), nullptr, &image), Gdiplus::Ok);
    const std::wstring name = file(L"p\u00EEcture.bmp");
    Gdiplus::Status status = Gdiplus::Ok;
    {
        const FailAllocation failure(1);
        EXPECT_NO_THROW(status = GdipSaveImageToFile(image, name.c_str(), &m_encoder.Clsid, nullptr));
    }
    EXPECT_EQ(status, Gdiplus::OutOfMemory);
    EXPECT_EQ(GdipDisposeImage(image), Gdiplus::Ok);
    EXPECT_TRUE(m_folder.names().empty());
}

TEST_F(CodecTest, RefusesWhatItCannotWrite) {
    GpBitmap* image = nullptr;
    EXPECT_EQ(GdipCreateBitmapFromHBITMAP(nullptr, nullptr, &image), Gdiplus::InvalidParameter);
    HBITMAP const bitmap = CreateBitmap(1, 1, 1, 32, nullptr);
    EXPECT_EQ(GdipCreateBitmapFromHBITMAP(bitmap, nullptr, nullptr), Gdiplus::InvalidParameter);
    ASSERT_EQ(GdipCreateBitmapFromHBITMAP(bitmap, nullptr, &image), Gdiplus::Ok);
    const std::wstring name = file(L"no.bmp");
    EXPECT_EQ(GdipSaveImageToFile(image, name.c_str(), &ImageFormatBMP, nullptr), Gdiplus::InvalidParameter);
    EXPECT_EQ(GdipSaveImageToFile(image, nullptr, &m_encoder.Clsid, nullptr), Gdiplus::InvalidParameter);
    EXPECT_NE(DeleteObject(bitmap), 0);
    EXPECT_EQ(GdipSaveImageToFile(image, name.c_str(), &m_encoder.Clsid, nullptr), Gdiplus::InvalidParameter);
    EXPECT_EQ(GdipSaveImageToFile(nullptr, name.c_str(), &m_encoder.Clsid, nullptr),
              Gdiplus::InvalidParameter);
    EXPECT_EQ(GdipSaveImageToFile(image, name.c_str(), nullptr, nullptr), Gdiplus::InvalidParameter);
    EXPECT_EQ(GdipDisposeImage(image), Gdiplus::Ok);
    EXPECT_EQ(GdipDisposeImage(nullptr), Gdiplus::InvalidParameter);
    UINT count = 0;
    EXPECT_EQ(GdipGetImageEncodersSize(&count, nullptr), Gdiplus::InvalidParameter);
    EXPECT_EQ(GdipGetImageEncodersSize(nullptr, &count), Gdiplus::InvalidParameter);
    EXPECT_EQ(GdipGetImageEncoders(1, sizeof m_encoder, nullptr), Gdiplus::InvalidParameter);
    EXPECT_EQ(GdipGetImageEncoders(2, sizeof m_encoder, &m_encoder), Gdiplus::InvalidParameter);
    EXPECT_TRUE(m_folder.names().empty());
}

TEST(Codec, AnswersOnlyWhileItRuns) {
    UINT count = 0;
    UINT size = 0;
    EXPECT_EQ(GdipGetImageEncodersSize(&count, &size), Gdiplus::GdiplusNotInitialized);
    GpBitmap* image = nullptr;
    EXPECT_EQ(GdipGetImageEncoders(1, size, nullptr), Gdiplus::GdiplusNotInitialized);
    EXPECT_EQ(GdipCreateBitmapFromHBITMAP(nullptr, nullptr, &image), Gdiplus::GdiplusNotInitialized);
    EXPECT_EQ(GdipSaveImageToFile(image, L"", nullptr, nullptr), Gdiplus::GdiplusNotInitialized);
    EXPECT_EQ(GdipDisposeImage(image), Gdiplus::GdiplusNotInitialized);
    std::uintptr_t tokens[2] = {};
    EXPECT_EQ(GdiplusStartup(&tokens[0], nullptr, nullptr), Gdiplus::InvalidParameter);
    GdiplusStartupInput input = {2, nullptr, 0, 0};
    EXPECT_EQ(GdiplusStartup(&tokens[0], &input, nullptr), Gdiplus::UnsupportedGdiplusVersion);
    input.GdiplusVersion = 1;
    EXPECT_EQ(GdiplusStartup(nullptr, &input, nullptr), Gdiplus::InvalidParameter);
    EXPECT_EQ(GdiplusStartup(&tokens[0], &input, nullptr), Gdiplus::Ok);
    EXPECT_EQ(GdiplusStartup(&tokens[1], &input, nullptr), Gdiplus::Ok);
    EXPECT_NE(tokens[0], 0U);
    GdiplusShutdown(0);
    GdiplusShutdown(tokens[0]);
    EXPECT_EQ(GdipGetImageEncodersSize(&count, &size), Gdiplus::Ok);
    GdiplusShutdown(tokens[1]);
    EXPECT_EQ(GdipGetImageEncodersSize(&count, &size), Gdiplus::GdiplusNotInitialized);
    GdiplusShutdown(tokens[1]);
    EXPECT_EQ(GdiplusStartup(&tokens[0], &input, nullptr), Gdiplus::Ok);
    EXPECT_EQ(GdipGetImageEncodersSize(&count, &size), Gdiplus::Ok) << "the count of runs did not wrap";
    GdiplusShutdown(tokens[0]);
}

}  // namespace
