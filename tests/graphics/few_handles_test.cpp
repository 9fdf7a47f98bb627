// What the functions do with few of the platform's handles left, and that they give all of them back.
#include <gtest/gtest.h>

#include <memory>
#include <vector>

#include "tests/graphics/test_surface.h"

namespace {

using namespace basalt::test;
using vex_util::mfc::GetDIBits;
using vex_util::mfc::RegionFromBitmap;
using vex_util::mfc::RotateBitmap;

constexpr COLORREF MASK_KEY = 0xC08040;
constexpr int MASK_COPY_NEEDS = 10;  // five surfaces
constexpr int ROTATION_NEEDS = 4;    // a context, a surface, a brush

// Takes every handle there is.
class TakenHandles {
public:
    TakenHandles() { take(); }
    ~TakenHandles() { give_back(m_brushes.size()); }
    TakenHandles(const TakenHandles&) = delete;
    TakenHandles& operator=(const TakenHandles&) = delete;

    // How many were left.
    std::size_t take() {
        const std::size_t before = m_brushes.size();
        while (HBRUSH const brush = CreateSolidBrush(0)) {
            m_brushes.push_back(brush);
        }
        return m_brushes.size() - before;
    }
    void give_back(std::size_t count) {
        for (; count > 0; --count) {
            DeleteObject(m_brushes.back());
            m_brushes.pop_back();
        }
    }

private:
    std::vector<HBRUSH> m_brushes;
};

class FewHandles : public testing::Test {
protected:
    FewHandles() : m_dest(Picture(12, 12, 0)), m_source(source_picture()) {}

    static Picture source_picture() {
        Picture picture(12, 12, 0x445566);
        picture.at(3, 4) = MASK_KEY;
        return picture;
    }

    void expect_copied(bool possible) {
        const StoredOsCode os(2);
        const Picture before(12, 12, 0x112233);
        Picture after = source_picture();
        after.at(3, 4) = 0x112233;
        m_dest.put(before);
        _transparentblt(m_dest, 0, 0, 0, 0, m_source, 0, 0, 12, 12, MASK_KEY);
        expect_same(m_dest.picture(), possible ? after : before);
    }
    void expect_rounded_gradient() {
        const StoredOsCode os(NT);
        m_dest.put(Picture(12, 12, 0));
        _gradientfill(m_dest, 0, 0, 12, 12, 6, 0xFFFFFF, 0x336699, 1.0F, 0);
        EXPECT_EQ(GetPixel(m_dest, 0, 0), 0xFFFFFFU);
        EXPECT_EQ(GetPixel(m_dest, 6, 6), 0x336699U);
    }
    void expect_turned(bool possible) {
        const Picture before = source_picture();
        Picture after(12, 12, 0x445566);
        after.at(8, 7) = MASK_KEY;
        m_dest.put(before);
        EXPECT_EQ(RotateBitmap(&m_source.context(), &m_dest.free_bitmap(), 180.0F), possible);
        expect_same(m_dest.picture(), possible ? after : before);
    }
    void expect_read(bool possible) {
        BITMAPINFOHEADER header;
        const std::unique_ptr<unsigned char[]> pixels(GetDIBits(m_dest.free_bitmap(), header));
        EXPECT_EQ(pixels != nullptr, possible);
        EXPECT_EQ(header.biWidth, 12);
        CRgn region;
        EXPECT_EQ(RegionFromBitmap(region, m_dest.free_bitmap(), MASK_KEY), possible);
        EXPECT_EQ(region.GetSafeHandle() != nullptr, possible);
        m_dest.select();
    }

private:
    TestSurface m_dest;
    TestSurface m_source;
};

TEST_F(FewHandles, AreEnoughOrNothingIsHalfDoneAndAllComeBack) {
    TakenHandles taken;
    for (std::size_t left = 0; left <= MASK_COPY_NEEDS; ++left) {
        SCOPED_TRACE(testing::Message() << left << " handles left");
        for (int round = 0; round < 3; ++round) {
            expect_copied(left >= MASK_COPY_NEEDS);
            expect_rounded_gradient();
            expect_turned(left >= ROTATION_NEEDS);
            expect_read(left >= 1);
        }
        EXPECT_EQ(taken.take(), left);
        taken.give_back(left + 1);
    }
}

}  // namespace
