#include "src/platform/codec.h"

#include <gtest/gtest.h>
#include <sys/resource.h>
#include <unistd.h>

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>

#include "tests/platform/drawing_support.h"
#include "tests/support/failing_new.h"

namespace {

using drawing::Canvas;
using drawing::Picture;

/// A run of the codec, its one encoder, and a folder for files.
class CodecTest : public testing::Test {
protected:
    void SetUp() override {
        const GdiplusStartupInput input = {1, nullptr, 0, 0};
        ASSERT_EQ(GdiplusStartup(&m_token, &input, nullptr), Gdiplus::Ok);
        m_folder = std::filesystem::temp_directory_path() / ("basalt_codec_" + std::to_string(::getpid()));
        std::filesystem::create_directory(m_folder);
        UINT count = 0;
        UINT size = 0;
        ASSERT_EQ(GdipGetImageEncodersSize(&count, &size), Gdiplus::Ok);
        ASSERT_EQ(count, 1U);
        ASSERT_EQ(size, sizeof m_encoder);
        EXPECT_EQ(GdipGetImageEncoders(count, size - 1, &m_encoder), Gdiplus::InsufficientBuffer);
        ASSERT_EQ(GdipGetImageEncoders(count, size, &m_encoder), Gdiplus::Ok);
        EXPECT_EQ(m_encoder.FormatID, ImageFormatBMP);
    }
    void TearDown() override {
        GdiplusShutdown(m_token);
        std::filesystem::remove_all(m_folder);
    }

    Gdiplus::Status save(HBITMAP bitmap, const std::wstring& name) const {
        GpBitmap* image = nullptr;
        EXPECT_EQ(GdipCreateBitmapFromHBITMAP(bitmap, nullptr, &image), Gdiplus::Ok);
        const Gdiplus::Status status = GdipSaveImageToFile(image, name.c_str(), &m_encoder.Clsid, nullptr);
        EXPECT_EQ(GdipDisposeImage(image), Gdiplus::Ok);
        return status;
    }
    std::wstring file(const wchar_t* name) const { return m_folder.wstring() + L"\\" + name; }

    std::uintptr_t m_token = 0;
    std::filesystem::path m_folder;
    ImageCodecInfo m_encoder = {};
};

/// A BMP file's fields, by their places in it.
class BmpFile {
public:
    explicit BmpFile(const std::filesystem::path& path) {
        std::ifstream stream(path, std::ios::binary);
        m_bytes.assign(std::istreambuf_iterator<char>(stream), {});
    }

    std::size_t size() const { return m_bytes.size(); }
    std::uint32_t field(std::size_t at, int bytes) const {
        std::uint32_t value = 0;
        for (int i = 0; i < bytes; ++i) {
            value |= std::uint32_t{m_bytes.at(at + static_cast<std::size_t>(i))} << 8 * i;
        }
        return value;
    }
    Picture picture() const {
        const auto width = static_cast<int>(field(18, 4));
        const auto height = static_cast<int>(field(22, 4));
        const std::vector<unsigned char> rows(m_bytes.begin() + field(10, 4), m_bytes.end());
        const Picture upside_down =
            drawing::unpacked(rows, width, height, static_cast<int>(field(28, 2)), 32);
        Picture picture(width, height);
        for (int i = 0; i < width * height; ++i) {
            picture.at(i % width, i / width) = upside_down.at(i % width, height - 1 - i / width);
        }
        return picture;
    }

private:
    std::vector<unsigned char> m_bytes;
};

TEST_F(CodecTest, WritesFilesThatHoldThePicture) {
    std::mt19937 random(51);
    SCOPED_TRACE("seed 51");
    const std::wstring name = file(L"p\u00EEcture.png");
    const std::filesystem::path path = m_folder /
                                       "p\xC3\xAE"
                                       "cture.png";
    for (const int depth : drawing::DEPTHS) {
        for (const int width : {700, 33, 2, 1}) {
            SCOPED_TRACE(testing::Message() << depth << " bits, width " << width);
            Picture picture = drawing::random_picture(width, 3, depth, random);
            const Canvas canvas(picture, depth);
            ASSERT_EQ(save(canvas.bitmap(), name), Gdiplus::Ok);
            const BmpFile bmp(path);
            const std::uint32_t colours = depth <= 8 ? 1U << depth : 0;
            const auto image = static_cast<std::uint32_t>((width * depth + 31) / 32 * 4 * 3);
            EXPECT_EQ(bmp.field(0, 2), 0x4D42U);
            EXPECT_EQ(bmp.size(), 54 + colours * 4 + image) << "an older, longer file is cut";
            EXPECT_EQ(bmp.field(2, 4), bmp.size());
            EXPECT_EQ(bmp.field(6, 4), 0U);
            EXPECT_EQ(bmp.field(10, 4), 54 + colours * 4);
            EXPECT_EQ(bmp.field(14, 4), 40U);
            EXPECT_EQ(bmp.field(26, 2), 1U);
            EXPECT_EQ(bmp.field(30, 4), 0U);
            for (std::uint32_t& value : picture.values) {
                value &= 0xFFFFFF;  // the unused byte is dropped
            }
            EXPECT_EQ(bmp.picture(), picture);
            for (std::uint32_t i = 0; i < colours; ++i) {
                const Canvas entry(Picture(1, 1, i), depth);
                EXPECT_EQ(drawing::swapped(bmp.field(54 + 4 * i, 4)), GetPixel(entry, 0, 0));
            }
        }
    }
}

TEST_F(CodecTest, LeavesNoFileWhereNoneCanBeWritten) {
    const Canvas canvas(600, 300, 24);
    EXPECT_EQ(save(canvas.bitmap(), file(L"missing\\picture.bmp")), Gdiplus::Win32Error);
    EXPECT_EQ(GetLastError(), ERROR_FILE_NOT_FOUND);
    EXPECT_EQ(save(canvas.bitmap(), m_folder.wstring()), Gdiplus::Win32Error);
    EXPECT_EQ(save(canvas.bitmap(), L""), Gdiplus::Win32Error);
    if (std::filesystem::exists("/dev/full")) {
        EXPECT_EQ(save(canvas.bitmap(), L"/dev/full"), Gdiplus::Win32Error);
        EXPECT_EQ(GetLastError(), ERROR_DISK_FULL);
        EXPECT_TRUE(std::filesystem::exists("/dev/full")) << "a device is not deleted";
    }
    EXPECT_TRUE(std::filesystem::is_empty(m_folder));
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
    EXPECT_TRUE(std::filesystem::is_empty(m_folder));
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
    EXPECT_TRUE(std::filesystem::is_empty(m_folder));
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
    EXPECT_EQ(GdipDisposeImage(image), Gdiplus::Ok);
    EXPECT_TRUE(std::filesystem::is_empty(m_folder));
}

TEST(Codec, AnswersOnlyWhileItRuns) {
    UINT count = 0;
    UINT size = 0;
    EXPECT_EQ(GdipGetImageEncodersSize(&count, &size), Gdiplus::GdiplusNotInitialized);
    std::uintptr_t tokens[2] = {};
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
