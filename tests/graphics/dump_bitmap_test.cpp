#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdint>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <random>
#include <string>
#include <vector>

#include "basalt/graphics.h"
#include "src/platform/codec.h"
#include "tests/support/drawing.h"
#include "tests/support/scratch_folder.h"
#include "tests/support/threads.h"
#include "tests/support/with_failing_allocations.h"

namespace {

using basalt::test::ScratchFolder;
using drawing::Canvas;
using drawing::Picture;
using vex_util::mfc::DumpBitmap;
namespace fs = std::filesystem;

class DumpBitmapTest : public testing::Test {
protected:
    void TearDown() override {
        UINT count = 0;
        UINT size = 0;
        EXPECT_EQ(GdipGetImageEncodersSize(&count, &size), Gdiplus::GdiplusNotInitialized)
            << "the codec runs on";
    }
    fs::path file(const std::string& name) const { return m_folder / name; }

private:
    const ScratchFolder m_folder;
};

void dump(Canvas& canvas, const fs::path& path) {
    canvas.deselect();
    DumpBitmap(canvas.bitmap(), CString(path.c_str()));
}

std::vector<unsigned char> bytes_of(const fs::path& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

// The file that shall become of a bitmap, by the published layout; GetDIBits tells its table.
std::vector<unsigned char> expected_file(const Canvas& canvas) {
    Picture picture = drawing::upside_down(canvas.picture());
    for (std::uint32_t& value : picture.pixels) {
        value &= canvas.depth == 32 ? 0xFFFFFF : ~0U;  // without the unused byte
    }
    const std::vector<unsigned char> rows = drawing::packed(picture, canvas.depth, 32);
    drawing::DibHeader dib(canvas.width, canvas.height, canvas.depth);
    EXPECT_NE(::GetDIBits(canvas, canvas.bitmap(), 0, 0, nullptr, dib.info(), DIB_RGB_COLORS), 0);
    dib.header.biSizeImage = static_cast<DWORD>(rows.size());
    dib.header.biClrUsed = canvas.depth > 8 ? 0 : 1U << canvas.depth;
    const std::uint32_t start = 54 + 4 * dib.header.biClrUsed;
    const std::uint32_t file_header[] = {start + dib.header.biSizeImage, 0, start};
    std::vector<unsigned char> bytes(start, 'B');
    bytes[1] = 'M';
    std::memcpy(&bytes[2], file_header, sizeof file_header);
    std::memcpy(&bytes[14], &dib, start - 14);
    bytes.insert(bytes.end(), rows.begin(), rows.end());
    return bytes;
}

TEST_F(DumpBitmapTest, WritesTheStoredValuesAtEveryDepth) {
    std::mt19937 random(111);
    SCOPED_TRACE("seed 111");
    for (const int depth : drawing::DEPTHS) {
        for (const int width : {6000, 700, 64, 33, 17, 8, 5, 3, 2, 1}) {
            SCOPED_TRACE(testing::Message() << depth << " bits, width " << width);
            Canvas canvas(drawing::random_picture(width, 6, depth, random), depth);
            // BMP whatever the name ends in, and in place of an older, longer file.
            dump(canvas, file("\xC3\xAE.png"));
            EXPECT_EQ(bytes_of(file("\xC3\xAE.png")), expected_file(canvas));
        }
    }
}

TEST_F(DumpBitmapTest, DropsThePadding) {
    const std::vector<unsigned char> ones(4 * 2, 0xFF);
    CBitmap narrow;
    narrow.CreateBitmap(3, 2, 1, 1, ones.data());
    DumpBitmap(narrow, CString(file("b.bmp").c_str()));
    const std::vector<unsigned char> bytes = bytes_of(file("b.bmp"));
    ASSERT_EQ(bytes.size(), 54U + 8 + 8);
    for (const std::size_t row : {62U, 66U}) {
        EXPECT_EQ(bytes[row] >> 5, 7);
        EXPECT_EQ(bytes[row + 1] | bytes[row + 2] | bytes[row + 3], 0) << "bytes that nobody wrote";
    }
}

TEST_F(DumpBitmapTest, LeavesNoFileForWhatIsNoBitmap) {
    DumpBitmap(nullptr, CString(file("a.bmp").c_str()));
    HBRUSH const brush = CreateSolidBrush(0);
    DumpBitmap(reinterpret_cast<HBITMAP>(brush), CString(file("a.bmp").c_str()));
    DeleteObject(brush);
    HBITMAP const deleted = CreateBitmap(2, 2, 1, 32, nullptr);
    DeleteObject(deleted);
    DumpBitmap(deleted, CString(file("a.bmp").c_str()));
    Canvas canvas(2, 2, 32);
    dump(canvas, file("no such folder/a.bmp"));
    EXPECT_FALSE(fs::exists(file("a.bmp")) || fs::exists(file("no such folder")));
}

TEST_F(DumpBitmapTest, DoesNotWaitForAPipeThatNobodyReads) {
    const fs::path pipe = file("pipe");
    ASSERT_EQ(mkfifo(pipe.c_str(), 0600), 0);
    Canvas canvas(4, 4, 32);
    alarm(20);
    dump(canvas, pipe);
    alarm(0);
    EXPECT_TRUE(fs::is_fifo(pipe)) << "it is not ours to delete";
}

TEST_F(DumpBitmapTest, ReportsNothingAndLeavesNoPartWithoutMemory) {
    Canvas canvas(Picture(20, 20, 0x112233), 32);
    canvas.deselect();
    const CString name(file("a.bmp").c_str());
    const std::vector<unsigned char> whole = expected_file(canvas);
    with_failing_allocations(
        [&] {
            fs::remove(file("a.bmp"));
            DumpBitmap(canvas.bitmap(), name);
        },
        [&](bool fired) {
            EXPECT_TRUE(fired || fs::exists(file("a.bmp")));
            EXPECT_TRUE(!fs::exists(file("a.bmp")) || bytes_of(file("a.bmp")) == whole);
        });
}

TEST_F(DumpBitmapTest, LeavesNoPartOfAPictureByAnyName) {
    std::ofstream(file("target.bmp")) << "what was there before";
    fs::create_hard_link(file("target.bmp"), file("other name.bmp"));
    fs::create_symlink("target.bmp", file("link.bmp"));
    Canvas canvas(100, 100, 32);
    rlimit limit = {};
    ASSERT_EQ(getrlimit(RLIMIT_FSIZE, &limit), 0);
    const rlimit small = {1000, limit.rlim_max};
    ASSERT_EQ(setrlimit(RLIMIT_FSIZE, &small), 0);
    dump(canvas, file("link.bmp"));
    ASSERT_EQ(setrlimit(RLIMIT_FSIZE, &limit), 0);
    EXPECT_TRUE(fs::is_symlink(file("link.bmp"))) << "it is not ours to delete";
    EXPECT_FALSE(fs::exists(file("target.bmp")));
    EXPECT_EQ(fs::file_size(file("other name.bmp")), 0U);
    dump(canvas, file("link.bmp"));
    EXPECT_EQ(bytes_of(file("target.bmp")), expected_file(canvas));
}

TEST_F(DumpBitmapTest, SharesARunOfTheCodecAmongThreads) {
    basalt::test::run_threads(4, [&](int i) {
        Canvas canvas(Picture(8 + i, 8, static_cast<COLORREF>(i)), 32);
        for (int round = 0; round < 50; ++round) {
            const fs::path path = file(std::to_string(i) + ".bmp");
            fs::remove(path);
            dump(canvas, path);
            EXPECT_EQ(bytes_of(path), expected_file(canvas));
        }
    });
}

}  // namespace
