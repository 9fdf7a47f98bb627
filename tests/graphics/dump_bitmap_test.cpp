#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <random>
#include <string>
#include <vector>

#include "src/platform/codec.h"
#include "tests/graphics/test_surface.h"
#include "tests/support/scratch_folder.h"
#include "tests/support/threads.h"

namespace {

using namespace basalt::test;
using vex_util::mfc::DumpBitmap;
namespace fs = std::filesystem;

constexpr int DEPTHS[] = {1, 4, 8, 16, 24, 32};

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

void dump(TestSurface& surface, const fs::path& path) {
    DumpBitmap(surface.bitmap(), CString(path.c_str()));
}

std::vector<unsigned char> bytes_of(const fs::path& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

// A reader of its own, by the published layout.
class BmpFile {
public:
    explicit BmpFile(const fs::path& path) : m_bytes(bytes_of(path)) {
        EXPECT_GE(m_bytes.size(), 54U);
        m_bytes.resize(std::max<std::size_t>(m_bytes.size(), 54));
        EXPECT_EQ(m_bytes[0], 'B');
        EXPECT_EQ(m_bytes[1], 'M');
        EXPECT_EQ(number(2, 4), m_bytes.size());
        EXPECT_EQ(number(6, 4), 0U);
        EXPECT_EQ(number(14, 4), 40U);
        EXPECT_EQ(number(26, 2), 1U);
        EXPECT_EQ(number(30, 4), 0U);
        EXPECT_EQ(number(34, 4), row_bytes() * static_cast<std::size_t>(height()));
        EXPECT_EQ(number(38, 8), 0U) << "no resolution is known";
        EXPECT_EQ(number(46, 4), depth() > 8 ? 0U : 1U << depth());
        EXPECT_EQ(number(50, 4), 0U) << "all colours matter";
    }
    int width() const { return static_cast<int>(number(18, 4)); }
    int height() const { return static_cast<int>(number(22, 4)); }
    int depth() const { return static_cast<int>(number(28, 2)); }
    std::size_t row_bytes() const { return static_cast<std::size_t>((width() * depth() + 31) / 32 * 4); }

    Picture picture() const {
        const std::size_t entries = depth() > 8 ? 0 : std::size_t{1} << depth();
        const std::size_t start = number(10, 4);
        EXPECT_EQ(start, 54 + 4 * entries);
        EXPECT_EQ(m_bytes.size(), start + row_bytes() * static_cast<std::size_t>(height()));
        Picture picture(width(), height());
        for (int y = 0; y < height(); ++y) {
            for (int x = 0; x < width(); ++x) {
                picture.at(x, y) =
                    colour(start + static_cast<std::size_t>(height() - 1 - y) * row_bytes(), x);
            }
        }
        return picture;
    }
    unsigned long number(std::size_t at, int bytes) const {
        unsigned long value = 0;
        for (int i = bytes - 1; i >= 0; --i) {
            value = value << 8 | m_bytes.at(at + static_cast<std::size_t>(i));
        }
        return value;
    }

private:
    COLORREF blue_green_red(std::size_t at) const {
        return RGB(m_bytes.at(at + 2), m_bytes.at(at + 1), m_bytes.at(at));
    }
    COLORREF colour(std::size_t row, int x) const {
        const auto bit = static_cast<std::size_t>(x) * static_cast<std::size_t>(depth());
        if (depth() >= 24) {
            return blue_green_red(row + bit / 8);
        }
        if (depth() == 16) {
            const auto word = static_cast<int>(number(row + bit / 8, 2));
            const auto widened = [word](int shift) {
                const int five = word >> shift & 0x1F;
                return five << 3 | five >> 2;
            };
            return RGB(widened(10), widened(5), widened(0));
        }
        const unsigned shift = 8U - static_cast<unsigned>(depth()) - bit % 8;
        const unsigned number = m_bytes.at(row + bit / 8) >> shift & ((1U << depth()) - 1);
        return blue_green_red(54 + 4 * std::size_t{number});
    }

    std::vector<unsigned char> m_bytes;
};

// Any colour, brought to what the depth has.
Picture random_stored(std::mt19937& random, TestSurface& surface, int width, int height) {
    std::vector<COLORREF> colours(50);
    for (COLORREF& colour : colours) {
        colour = random() & 0xFFFFFF;
    }
    surface.put(random_picture(random, width, height, colours));
    return surface.picture();
}

TEST_F(DumpBitmapTest, IsReadBackAtEveryDepth) {
    std::mt19937 random(111);
    SCOPED_TRACE("seed 111");
    for (const int depth : DEPTHS) {
        for (const int width : {700, 64, 33, 17, 8, 5, 3, 2, 1}) {
            SCOPED_TRACE(testing::Message() << depth << " bits, width " << width);
            TestSurface surface(width, 6, depth);
            const Picture stored = random_stored(random, surface, width, 6);
            // BMP whatever the name ends in, and in place of an older, longer file.
            dump(surface, file("\xC3\xAE.png"));
            const BmpFile read(file("\xC3\xAE.png"));
            EXPECT_EQ(read.depth(), depth);
            expect_same(read.picture(), stored);
        }
    }
}

TEST_F(DumpBitmapTest, DropsTheUnusedByteAndThePadding) {
    std::vector<std::uint32_t> words(6, 0xAB123456);
    CBitmap bitmap;
    bitmap.CreateBitmap(3, 2, 1, 32, words.data());
    DumpBitmap(bitmap, CString(file("a.bmp").c_str()));
    EXPECT_EQ(BmpFile(file("a.bmp")).number(54, 4), 0x00123456U);
    std::vector<unsigned char> ones(4 * 2, 0xFF);
    CBitmap narrow;
    narrow.CreateBitmap(3, 2, 1, 1, ones.data());
    DumpBitmap(narrow, CString(file("b.bmp").c_str()));
    const BmpFile read(file("b.bmp"));
    EXPECT_EQ(read.number(54 + 8 + 1, 3), 0U) << "bytes that nobody wrote";
    expect_same(read.picture(), Picture(3, 2, 0xFFFFFF));
}

TEST_F(DumpBitmapTest, LeavesNoFileForWhatIsNoBitmap) {
    DumpBitmap(nullptr, CString(file("a.bmp").c_str()));
    HBRUSH const brush = CreateSolidBrush(0);
    DumpBitmap(reinterpret_cast<HBITMAP>(brush), CString(file("a.bmp").c_str()));
    DeleteObject(brush);
    HBITMAP const deleted = CreateBitmap(2, 2, 1, 32, nullptr);
    DeleteObject(deleted);
    DumpBitmap(deleted, CString(file("a.bmp").c_str()));
    EXPECT_FALSE(fs::exists(file("a.bmp")));

    TestSurface surface(2, 2);
    dump(surface, file("no such folder/a.bmp"));
    dump(surface, file(""));
    EXPECT_FALSE(fs::exists(file("no such folder")));
}

TEST_F(DumpBitmapTest, DoesNotWaitForAPipeThatNobodyReads) {
    const fs::path pipe = file("pipe");
    ASSERT_EQ(mkfifo(pipe.c_str(), 0600), 0);
    TestSurface surface(4, 4, 32);
    alarm(20);
    dump(surface, pipe);
    alarm(0);
    EXPECT_TRUE(fs::is_fifo(pipe)) << "it is not ours to delete";
}

TEST_F(DumpBitmapTest, ReportsNothingWithoutMemory) {
    TestSurface surface(Picture(20, 20, 0x112233));
    CBitmap& bitmap = surface.bitmap();
    const CString name(file("a.bmp").c_str());
    with_failing_allocations([&] { DumpBitmap(bitmap, name); }, [](bool) {});  // nor does it throw
    expect_same(BmpFile(file("a.bmp")).picture(), Picture(20, 20, 0x112233));
}

TEST_F(DumpBitmapTest, SharesARunOfTheCodecAmongThreads) {
    basalt::test::run_threads(4, [&](int i) {
        TestSurface surface(Picture(8 + i, 8, static_cast<COLORREF>(i)));
        for (int round = 0; round < 50; ++round) {
            const fs::path path = file(std::to_string(i) + ".bmp");
            fs::remove(path);
            dump(surface, path);
            expect_same(BmpFile(path).picture(), Picture(8 + i, 8, static_cast<COLORREF>(i)));
        }
    });
}

}  // namespace
