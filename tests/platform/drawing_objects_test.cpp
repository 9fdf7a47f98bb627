// Handles, contexts, selection, bitmaps and their description.
#include <gtest/gtest.h>

#include <climits>
#include <tuple>
#include <vector>

#include "src/platform/drawing/graphics_handles.h"
#include "tests/support/drawing.h"
#include "tests/support/threads.h"

namespace {

using drawing::Canvas;

BITMAP description(HGDIOBJ bitmap) {
    BITMAP record = {};
    EXPECT_EQ(GetObjectW(bitmap, sizeof record, &record), static_cast<int>(sizeof record));
    return record;
}

TEST(Context, StartsAsOneMonochromePixel) {
    CDC dc;
    ASSERT_TRUE(dc.CreateCompatibleDC(nullptr));
    EXPECT_EQ(GetTextColor(dc), 0U);
    EXPECT_EQ(GetBkColor(dc), 0xFFFFFFU);
    EXPECT_EQ(GetMapMode(dc), MM_TEXT);
    EXPECT_EQ(SetGraphicsMode(dc, GM_ADVANCED), GM_COMPATIBLE);
    EXPECT_EQ(SelectObject(dc, GetStockObject(NULL_BRUSH)), GetStockObject(WHITE_BRUSH));
    EXPECT_EQ(SelectObject(dc, GetStockObject(NULL_PEN)), GetStockObject(BLACK_PEN));
    EXPECT_EQ(SetPixel(dc, 0, 0, 0xC0C0C0), 0xFFFFFFU);
    EXPECT_EQ(GetPixel(dc, 0, 0), 0xFFFFFFU);
    EXPECT_EQ(GetPixel(dc, 1, 0), CLR_INVALID);
    EXPECT_EQ(SetPixel(dc, -1, 0, 0), CLR_INVALID);
    // A bitmap compatible with a new context is monochrome: the trap that every caller meets once.
    CBitmap bitmap;
    ASSERT_TRUE(bitmap.CreateCompatibleBitmap(&dc, 20, 3));
    EXPECT_EQ(description(bitmap).bmBitsPixel, 1);
}

TEST(Context, OfTheScreenHasDepthButNoPixels) {
    HDC const screen = GetDC(nullptr);
    HBITMAP const bitmap = CreateCompatibleBitmap(screen, 3, 2);
    EXPECT_EQ(description(bitmap).bmBitsPixel, 32);
    EXPECT_EQ(GetPixel(screen, 0, 0), CLR_INVALID);
    EXPECT_NE(BitBlt(screen, 0, 0, 9, 9, screen, 0, 0, SRCCOPY), 0);
    EXPECT_EQ(SelectObject(screen, bitmap), nullptr);
    EXPECT_EQ(DeleteDC(screen), 0);
    HDC const memory = CreateCompatibleDC(screen);
    EXPECT_EQ(ReleaseDC(nullptr, memory), 0);
    EXPECT_EQ(ReleaseDC(reinterpret_cast<HWND>(screen), screen), 0) << "there are no windows";
    EXPECT_EQ(ReleaseDC(nullptr, screen), 1);
    EXPECT_EQ(ReleaseDC(nullptr, screen), 0);
    EXPECT_NE(DeleteDC(memory), 0);
    EXPECT_NE(DeleteObject(bitmap), 0);
    EXPECT_EQ(GetDC(reinterpret_cast<HWND>(&description)), nullptr);
}

TEST(Selection, HoldsABitmapInOneContextAtATime) {
    CDC a, b;
    a.CreateCompatibleDC(nullptr);
    b.CreateCompatibleDC(nullptr);
    CBitmap first, second;
    first.CreateBitmap(4, 4, 1, 24, nullptr);
    second.CreateBitmap(4, 4, 1, 8, nullptr);
    CBitmap* const stock = a.SelectObject(&first);
    ASSERT_NE(stock, nullptr);
    EXPECT_EQ(b.SelectObject(&first), nullptr);
    EXPECT_EQ(GetLastError(), ERROR_BUSY);
    EXPECT_EQ(DeleteObject(first), 0);
    CBitmap* const lent = a.SelectObject(&second);
    ASSERT_NE(lent, nullptr);
    EXPECT_EQ(lent->GetSafeHandle(), first.GetSafeHandle());
    EXPECT_NE(b.SelectObject(lent), nullptr);
    // The stock bitmap serves every context, each with a pixel of its own.
    EXPECT_EQ(b.SelectObject(stock)->GetSafeHandle(), first.GetSafeHandle());
    EXPECT_EQ(a.SelectObject(stock)->GetSafeHandle(), second.GetSafeHandle());
    SetPixel(a, 0, 0, 0xFFFFFF);
    EXPECT_EQ(GetPixel(b, 0, 0), 0U);
    // Its rows are nobody's to read.
    BITMAPINFO info{};
    info.bmiHeader.biSize = sizeof info.bmiHeader;
    EXPECT_EQ(GetDIBits(a, *stock, 0, 0, nullptr, &info, DIB_RGB_COLORS), 0);
    EXPECT_EQ(GetLastError(), ERROR_INVALID_HANDLE);
    EXPECT_NE(DeleteObject(stock->GetSafeHandle()), 0);
    EXPECT_EQ(description(stock->GetSafeHandle()).bmWidth, 1);
    EXPECT_TRUE(first.DeleteObject());
    EXPECT_FALSE(first.DeleteObject());
}

TEST(Selection, EndsWithItsContextAndLeavesTheObjects) {
    HDC const dc = CreateCompatibleDC(nullptr);
    HBITMAP const bitmap = CreateBitmap(2, 2, 1, 32, nullptr);
    HBRUSH const brush = CreateSolidBrush(0x123456);
    HPEN const pen = CreatePen(PS_SOLID, -1, 0);
    for (HGDIOBJ const object : {HGDIOBJ{bitmap}, HGDIOBJ{brush}, HGDIOBJ{pen}}) {
        EXPECT_NE(SelectObject(dc, object), nullptr);
        EXPECT_EQ(SelectObject(dc, object), object);
        EXPECT_EQ(DeleteObject(object), 0);
    }
    EXPECT_NE(DeleteDC(dc), 0);
    for (HGDIOBJ const object : {HGDIOBJ{bitmap}, HGDIOBJ{brush}, HGDIOBJ{pen}}) {
        EXPECT_NE(DeleteObject(object), 0);
        EXPECT_EQ(DeleteObject(object), 0);
        EXPECT_EQ(GetLastError(), ERROR_INVALID_HANDLE);
    }
}

TEST(Wrapper, OwnsOneHandle) {
    HBITMAP const handle = CreateBitmap(2, 2, 1, 8, nullptr);
    {
        CBitmap owner;
        EXPECT_FALSE(owner.Attach(nullptr));
        EXPECT_TRUE(owner.Attach(handle));
        EXPECT_FALSE(owner.CreateBitmap(1, 1, 1, 1, nullptr));
        CBitmap* const lent = CBitmap::FromHandle(handle);
        EXPECT_EQ(lent, CBitmap::FromHandle(owner));
        BITMAP record = {};
        EXPECT_NE(lent->GetBitmap(&record), 0);
    }
    EXPECT_EQ(CBitmap::FromHandle(handle), nullptr);
    CDC dc;
    dc.CreateCompatibleDC(nullptr);
    CDC* const lent = CDC::FromHandle(dc);
    EXPECT_EQ(lent->GetSafeHdc(), dc.GetSafeHdc());
    EXPECT_TRUE(lent->DeleteDC());
    EXPECT_FALSE(dc.DeleteDC());
    EXPECT_EQ(CDC::FromHandle(nullptr), nullptr);
}

TEST(Wrapper, OfTheStockBitmapIsWholeAgainAfterItsEnd) {
    CDC dc;
    dc.CreateCompatibleDC(nullptr);
    CBitmap bitmap;
    bitmap.CreateBitmap(2, 2, 1, 8, nullptr);
    EXPECT_TRUE(dc.SelectObject(&bitmap)->DeleteObject());  // stock objects stay
    CDC other;
    other.CreateCompatibleDC(nullptr);
    CBitmap second;
    second.CreateBitmap(2, 2, 1, 8, nullptr);
    CBitmap* const before = other.SelectObject(&second);
    ASSERT_NE(before, nullptr);
    EXPECT_NE(other.SelectObject(before), nullptr);
}

TEST(Handle, OfAnotherKindOrADeletedObjectIsRefusedEverywhere) {
    HDC const dc = CreateCompatibleDC(nullptr);
    HBITMAP const bitmap = CreateBitmap(2, 2, 1, 32, nullptr);
    HRGN const region = CreateRectRgn(0, 0, 1, 1);
    HBRUSH const brush = CreateSolidBrush(0);
    HBRUSH const deleted = CreateSolidBrush(0);
    DeleteObject(deleted);
    HBRUSH const successor = CreateSolidBrush(0);  // in the same slot, most likely
    RECT box = {0, 0, 1, 1};
    const TRIVERTEX corners[2] = {{0, 0, 0, 0, 0, 0}, {1, 1, 0, 0, 0, 0}};
    const GRADIENT_RECT mesh = {0, 1};
    drawing::DibHeader dib(2, 2, 32);
    std::uint32_t bits[4];
    POINT point = {};
    for (void* const handle :
         {static_cast<void*>(nullptr), static_cast<void*>(deleted), static_cast<void*>(bitmap),
          static_cast<void*>(region), static_cast<void*>(brush), GetStockObject(WHITE_PEN),
          reinterpret_cast<void*>(~std::uintptr_t{0}), reinterpret_cast<void*>(&box)}) {
        auto* const no_dc = static_cast<HDC>(handle);
        if (handle != nullptr) {
            EXPECT_EQ(CreateCompatibleDC(no_dc), nullptr);
        }
        EXPECT_EQ(DeleteDC(no_dc), 0);
        EXPECT_EQ(CreateCompatibleBitmap(no_dc, 1, 1), nullptr);
        EXPECT_EQ(SelectObject(no_dc, brush), nullptr);
        EXPECT_EQ(GetPixel(no_dc, 0, 0), CLR_INVALID);
        EXPECT_EQ(SetPixel(no_dc, 0, 0, 0), CLR_INVALID);
        EXPECT_EQ(SetBkColor(no_dc, 0), CLR_INVALID);
        EXPECT_EQ(GetTextColor(no_dc), CLR_INVALID);
        EXPECT_EQ(SetMapMode(no_dc, MM_TEXT) + GetMapMode(no_dc) + SetGraphicsMode(no_dc, GM_ADVANCED), 0);
        EXPECT_EQ(DPtoLP(no_dc, &point, 1), 0);
        EXPECT_EQ(ModifyWorldTransform(no_dc, nullptr, MWT_IDENTITY), 0);
        EXPECT_EQ(FillRect(no_dc, &box, brush), 0);
        EXPECT_EQ(RoundRect(no_dc, 0, 0, 1, 1, 1, 1), 0);
        EXPECT_EQ(GradientFill(no_dc, corners, 2, &mesh, 1, 0), 0);
        EXPECT_EQ(BitBlt(no_dc, 0, 0, 1, 1, dc, 0, 0, SRCCOPY), 0);
        EXPECT_EQ(BitBlt(dc, 0, 0, 1, 1, no_dc, 0, 0, SRCCOPY), 0);
        EXPECT_EQ(TransparentBlt(dc, 0, 0, 1, 1, no_dc, 0, 0, 1, 1, 0), 0);
        EXPECT_EQ(GetDIBits(no_dc, bitmap, 0, 2, bits, dib.info(), DIB_RGB_COLORS), 0);
        EXPECT_EQ(GetLastError(), ERROR_INVALID_HANDLE);
        if (handle != bitmap) {
            EXPECT_EQ(GetDIBits(dc, static_cast<HBITMAP>(handle), 0, 2, bits, dib.info(), DIB_RGB_COLORS), 0);
            EXPECT_EQ(GetObjectW(handle, sizeof(BITMAP), nullptr), 0);
        }
        if (handle != brush) {
            EXPECT_EQ(FillRect(dc, &box, static_cast<HBRUSH>(handle)), 0);
        }
        if (handle != region) {
            auto* const no_region = static_cast<HRGN>(handle);
            EXPECT_EQ(CombineRgn(region, region, no_region, RGN_OR), RGN_ERROR);
            EXPECT_EQ(CombineRgn(no_region, region, region, RGN_OR), RGN_ERROR);
            EXPECT_EQ(GetRgnBox(no_region, &box), RGN_ERROR);
            EXPECT_EQ(EqualRgn(region, no_region) + PtInRegion(no_region, 0, 0), 0);
        }
    }
    EXPECT_EQ(SelectObject(dc, region), nullptr);
    EXPECT_EQ(SelectObject(dc, dc), nullptr);
    EXPECT_EQ(DeleteObject(dc), 0);
    EXPECT_EQ(GetPixel(dc, 0, 0), 0U) << "nothing was drawn";
    for (HGDIOBJ const object : {HGDIOBJ{bitmap}, HGDIOBJ{region}, HGDIOBJ{brush}, HGDIOBJ{successor}}) {
        EXPECT_NE(DeleteObject(object), 0);
    }
    EXPECT_NE(DeleteDC(dc), 0);
}

TEST(Handle, TableFillsUpAndRecovers) {
    std::vector<HBRUSH> brushes;
    for (HBRUSH brush = nullptr; (brush = CreateSolidBrush(0)) != nullptr;) {
        brushes.push_back(brush);
        ASSERT_LE(brushes.size(), 65536U);
    }
    EXPECT_GT(brushes.size(), 60000U);
    EXPECT_EQ(CreateCompatibleDC(nullptr), nullptr);
    EXPECT_EQ(CreateRectRgn(0, 0, 1, 1), nullptr);
    EXPECT_EQ(CreateBitmap(1, 1, 1, 1, nullptr), nullptr);
    for (HBRUSH const brush : brushes) {
        EXPECT_NE(DeleteObject(brush), 0);
    }
    HBRUSH const brush = CreateSolidBrush(0);
    EXPECT_NE(DeleteObject(brush), 0);
}

TEST(Handle, ThreadsUseTheirOwnObjectsAtOnce) {
    basalt::test::run_threads(4, [&](int t) {
        for (int i = 0; i < 300; ++i) {
            const auto colour = static_cast<COLORREF>(t * 1000 + i);
            const Canvas canvas(5, 4, 32);
            HBRUSH const brush = CreateSolidBrush(colour);
            const RECT all = {0, 0, 5, 4};
            EXPECT_NE(FillRect(canvas, &all, brush), 0);
            EXPECT_NE(DeleteObject(brush), 0);
            EXPECT_EQ(GetPixel(canvas, 4, 3), colour);
        }
    });
}

TEST(Bitmap, HasRowsPaddedTo16Bits) {
    for (const int depth : drawing::DEPTHS) {
        for (const int width : {1, 2, 3, 16, 17, 33, 600}) {
            const Canvas canvas(width, 3, depth);
            const BITMAP record = description(canvas.bitmap());
            EXPECT_EQ(std::tuple(record.bmType, record.bmWidth, record.bmHeight, record.bmWidthBytes,
                                 record.bmPlanes, record.bmBitsPixel, record.bmBits),
                      std::tuple(0, width, 3, (width * depth + 15) / 16 * 2, 1, depth, nullptr))
                << depth << " bits, width " << width;
        }
    }
}

TEST(Bitmap, OfNoSizeIsOneMonochromePixelAndOfNoMeaningIsRefused) {
    HDC const screen = GetDC(nullptr);
    const std::uint32_t bits = ~0U;
    for (HBITMAP const bitmap : {CreateBitmap(0, 5, 1, 32, &bits), CreateBitmap(5, 0, 1, 8, &bits),
                                 CreateCompatibleBitmap(screen, 0, -7)}) {
        const BITMAP record = description(bitmap);
        EXPECT_EQ(record.bmWidth * record.bmHeight * record.bmBitsPixel, 1);
        EXPECT_NE(DeleteObject(bitmap), 0);
    }
    const int refused[][4] = {{-1, 1, 1, 32},        {1, -1, 1, 32},        {1, 1, 2, 1},
                              {1, 1, 1, 2},          {1, 1, 0, 8},          {1, 1, 1, 0},
                              {65536, 65536, 1, 32}, {32768, 16384, 1, 32}, {INT_MAX, INT_MAX, 1, 32}};
    for (const auto& [width, height, planes, depth] : refused) {
        EXPECT_EQ(CreateBitmap(width, height, static_cast<UINT>(planes), static_cast<UINT>(depth), nullptr),
                  nullptr);
        EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);
    }
    EXPECT_EQ(CreateCompatibleBitmap(screen, INT_MAX, INT_MAX), nullptr);
    EXPECT_EQ(CreateCompatibleBitmap(screen, -1, 1), nullptr);
    ReleaseDC(nullptr, screen);
    BITMAP record = {};
    HBITMAP const bitmap = CreateBitmap(1, 1, 1, 1, nullptr);
    EXPECT_EQ(GetObjectW(bitmap, 31, &record), 0);
    EXPECT_EQ(GetObjectW(bitmap, 0, nullptr), static_cast<int>(sizeof record));
    EXPECT_NE(DeleteObject(bitmap), 0);
    EXPECT_EQ(CreatePen(1, 1, 0), nullptr);
    EXPECT_EQ(GetStockObject(9), nullptr);
    EXPECT_EQ(GetStockObject(-1), nullptr);
}

}  // namespace
