// Handles, contexts, selection, wrappers, and what bitmaps there are.
#include <gtest/gtest.h>

#include <climits>
#include <vector>

#include "tests/support/drawing.h"

namespace {

using namespace drawing;

BITMAP description(HGDIOBJ bitmap) {
    BITMAP record = {};
    EXPECT_EQ(GetObject(bitmap, sizeof record, &record), static_cast<int>(sizeof record));
    return record;
}

TEST(Context, starts_as_one_monochrome_pixel_or_as_the_screen_with_none) {
    CDC dc;
    ASSERT_TRUE(dc.CreateCompatibleDC(nullptr));
    EXPECT_EQ(dc.SetTextColor(1), 0U);
    EXPECT_EQ(dc.SetBkColor(1), 0xFFFFFFU);
    EXPECT_EQ(*dc.SelectStockObject(NULL_BRUSH), GetStockObject(WHITE_BRUSH));
    EXPECT_EQ(SelectObject(dc, GetStockObject(NULL_PEN)), GetStockObject(BLACK_PEN));
    EXPECT_EQ(dc.SetPixel(0, 0, 0xC0C0C0), 0xFFFFFFU);
    EXPECT_EQ(dc.GetPixel(1, 0), CLR_INVALID);
    CBitmap bitmap;  // compatible with a new context is monochrome: the trap that every caller meets once
    ASSERT_TRUE(bitmap.CreateCompatibleBitmap(&dc, 20, 3));
    EXPECT_EQ(description(bitmap).bmBitsPixel, 1);

    HDC const screen = GetDC(nullptr), memory = CreateCompatibleDC(screen);
    CBitmap deep;
    deep.Attach(CreateCompatibleBitmap(screen, 3, 2));
    EXPECT_EQ(description(deep).bmBitsPixel, 32);
    EXPECT_EQ(GetPixel(screen, 0, 0), CLR_INVALID);
    EXPECT_NE(BitBlt(screen, 0, 0, 9, 9, screen, 0, 0, SRCCOPY), 0);
    EXPECT_EQ(SelectObject(screen, deep), nullptr);
    auto* const window = reinterpret_cast<HWND>(screen);
    EXPECT_EQ(DeleteDC(screen) + ReleaseDC(nullptr, memory) + ReleaseDC(window, screen), 0);
    EXPECT_EQ(GetDC(window), nullptr);
    EXPECT_EQ(ReleaseDC(nullptr, screen) + 2 * ReleaseDC(nullptr, screen), 1);
    EXPECT_NE(DeleteDC(memory), 0);
}

TEST(Selection, holds_a_bitmap_in_one_context_and_objects_from_deletion) {
    CDC a, b;
    a.CreateCompatibleDC(nullptr);
    b.CreateCompatibleDC(&a);
    CBitmap first, second;
    first.CreateBitmap(4, 4, 1, 24, nullptr);
    second.CreateBitmap(4, 4, 1, 8, nullptr);
    CBrush brush(0x123456);
    CBitmap* const stock = a.SelectObject(&first);
    EXPECT_EQ(b.SelectObject(&first), nullptr);
    EXPECT_EQ(GetLastError(), ERROR_BUSY);
    EXPECT_EQ(*a.SelectObject(&brush), GetStockObject(WHITE_BRUSH));
    EXPECT_EQ(*b.SelectObject(&brush), GetStockObject(WHITE_BRUSH));
    EXPECT_EQ(*a.SelectStockObject(WHITE_BRUSH), brush.GetSafeHandle());
    EXPECT_EQ(DeleteObject(first) + DeleteObject(brush), 0);
    CBitmap* const lent = a.SelectObject(&second);
    EXPECT_EQ(lent->GetSafeHandle(), first.GetSafeHandle());
    EXPECT_NE(b.SelectObject(lent), nullptr);
    // The stock bitmap serves every context, each with a pixel of its own and without rows.
    EXPECT_EQ(*b.SelectObject(stock), first.GetSafeHandle());
    EXPECT_EQ(*a.SelectObject(stock), second.GetSafeHandle());
    a.SetPixel(0, 0, 0xFFFFFF);
    EXPECT_EQ(b.GetPixel(0, 0), 0U);
    DibHeader dib(0, 0, 0);
    EXPECT_EQ(GetDIBits(a, *stock, 0, 0, nullptr, dib.info(), DIB_RGB_COLORS), 0);
    EXPECT_EQ(description(*stock).bmWidth, 1);
    EXPECT_TRUE(stock->DeleteObject() && a.SelectObject(&first)->GetSafeHandle() != nullptr)
        << "stock objects stay";
    EXPECT_TRUE(b.DeleteDC() && a.DeleteDC());
    EXPECT_TRUE(first.DeleteObject() && second.DeleteObject() && brush.DeleteObject())
        << "free with their contexts";
    EXPECT_FALSE(first.DeleteObject());
}

TEST(Wrapper, owns_one_handle_and_is_lent) {
    CBitmap bitmap;
    CRgn region;
    CBrush brush(0xFF);
    CDC dc;
    EXPECT_FALSE(bitmap.Attach(nullptr));
    EXPECT_TRUE(bitmap.CreateBitmap(2, 2, 1, 8, nullptr) && region.CreateRectRgn(0, 0, 1, 1) &&
                dc.CreateCompatibleDC(nullptr));
    EXPECT_FALSE(bitmap.CreateBitmap(2, 2, 1, 8, nullptr) || region.CreateRectRgn(0, 0, 1, 1) ||
                 brush.CreateSolidBrush(0) || dc.CreateCompatibleDC(nullptr) || dc.Attach(dc));
    EXPECT_EQ(CBitmap::FromHandle(bitmap)->GetSafeHandle(), bitmap.m_hObject);
    EXPECT_EQ(CRgn::FromHandle(region)->GetSafeHandle(), region.m_hObject);
    EXPECT_EQ(CBrush::FromHandle(brush)->GetSafeHandle(), brush.m_hObject);
    EXPECT_TRUE(CDC::FromHandle(dc)->DeleteDC()) << "a lent one may delete its object";
    EXPECT_TRUE(CBrush::FromHandle(brush)->DeleteObject());
    EXPECT_FALSE(dc.DeleteDC() || brush.DeleteObject());
    EXPECT_TRUE(CDC::FromHandle(nullptr) == nullptr && CRgn::FromHandle(nullptr) == nullptr);
    EXPECT_TRUE(CBitmap::FromHandle(nullptr) == nullptr && CBrush::FromHandle(nullptr) == nullptr);
}

TEST(Handle, of_another_kind_or_a_deleted_object_is_refused_by_every_call) {
    Canvas canvas(Picture(2, 2, 32));
    CRgn region;
    region.CreateRectRgn(0, 0, 1, 1);
    CBrush brush(0xFFFFFF);
    HBRUSH const deleted = CreateSolidBrush(0);
    DeleteObject(deleted);
    const CBrush successor(0);  // in the same slot, most likely
    RECT box = {0, 0, 1, 1};
    const TRIVERTEX corners[2] = {};
    const GRADIENT_RECT mesh = {0, 1};
    DibHeader dib(2, 2, 32);
    std::uint32_t bits[4];
    POINT point = {};
    const HGDIOBJ handles[] = {nullptr,
                               deleted,
                               canvas.bitmap().m_hObject,
                               region.m_hObject,
                               brush.m_hObject,
                               GetStockObject(WHITE_PEN),
                               reinterpret_cast<void*>(~std::uintptr_t{0}),
                               &box};
    for (std::size_t i = 0; i < 8; ++i) {
        SCOPED_TRACE(i);
        auto* const dc = static_cast<HDC>(handles[i]);
        auto* const rgn = static_cast<HRGN>(handles[i]);
        auto* const bitmap = static_cast<HBITMAP>(handles[i]);
        const long dc_calls[] = {
            i != 0 && CreateCompatibleDC(dc) != nullptr,
            DeleteDC(dc),
            CreateCompatibleBitmap(dc, 1, 1) != nullptr,
            SelectObject(dc, brush) != nullptr,
            GetPixel(dc, 0, 0) != CLR_INVALID,
            SetPixel(dc, 0, 0, 0) != CLR_INVALID,
            SetBkColor(dc, 0) != CLR_INVALID,
            SetTextColor(dc, 0) != CLR_INVALID,
            SetMapMode(dc, MM_TEXT),
            GetMapMode(dc),
            SetGraphicsMode(dc, GM_ADVANCED),
            DPtoLP(dc, &point, 1),
            ModifyWorldTransform(dc, nullptr, MWT_IDENTITY),
            FillRect(dc, &box, brush),
            RoundRect(dc, 0, 0, 1, 1, 1, 1),
            GradientFill(dc, corners, 2, &mesh, 1, 0),
            BitBlt(dc, 0, 0, 1, 1, canvas, 0, 0, SRCCOPY),
            BitBlt(canvas, 0, 0, 1, 1, dc, 0, 0, SRCCOPY),
            TransparentBlt(canvas, 0, 0, 1, 1, dc, 0, 0, 1, 1, 0),
            GetDIBits(dc, canvas.bitmap(), 0, 2, bits, dib.info(), DIB_RGB_COLORS),
            i != 2 && GetDIBits(canvas, bitmap, 0, 2, bits, dib.info(), DIB_RGB_COLORS) != 0,
            i != 2 && GetObject(bitmap, sizeof(BITMAP), nullptr) != 0,
            i != 4 && FillRect(canvas, &box, static_cast<HBRUSH>(handles[i])) != 0};
        for (std::size_t call = 0; call < std::size(dc_calls); ++call) {
            EXPECT_EQ(dc_calls[call], 0) << call;
        }
        EXPECT_EQ(GetLastError(), i == 4 ? ERROR_INVALID_HANDLE : GetLastError());
        EXPECT_TRUE(i == 3 || (CombineRgn(region, region, rgn, RGN_OR) == RGN_ERROR &&
                               GetRgnBox(rgn, &box) == RGN_ERROR &&
                               CombineRgn(rgn, region, region, RGN_OR) + OffsetRgn(rgn, 1, 1) == 0 &&
                               EqualRgn(region, rgn) + PtInRegion(rgn, 0, 0) == 0 &&
                               GetRegionData(rgn, 0, nullptr) == 0));
    }
    EXPECT_TRUE(SelectObject(canvas, region) == nullptr && SelectObject(canvas, canvas) == nullptr);
    EXPECT_EQ(DeleteObject(HDC(canvas)), 0);
    EXPECT_EQ(canvas.picture(), Picture(2, 2, 32)) << "nothing was drawn";
}

TEST(Handle, table_fills_up_and_recovers) {
    std::vector<HBRUSH> brushes;
    for (HBRUSH brush = nullptr; (brush = CreateSolidBrush(0)) != nullptr && brushes.size() <= 65536;) {
        brushes.push_back(brush);
    }
    EXPECT_TRUE(brushes.size() > 60000 && brushes.size() <= 65536);
    EXPECT_TRUE(CreateCompatibleDC(nullptr) == nullptr && CreateRectRgn(0, 0, 1, 1) == nullptr);
    EXPECT_EQ(CreateBitmap(1, 1, 1, 1, nullptr), nullptr);
    for (HBRUSH const brush : brushes) {
        EXPECT_NE(DeleteObject(brush), 0);
    }
    EXPECT_NE(DeleteObject(CreateSolidBrush(0)), 0);
}

TEST(Bitmap, of_no_size_is_one_monochrome_pixel_and_of_no_meaning_is_refused) {
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
    EXPECT_TRUE(CreateCompatibleBitmap(screen, INT_MAX, INT_MAX) == nullptr &&
                CreateCompatibleBitmap(screen, -1, 1) == nullptr);
    ReleaseDC(nullptr, screen);
    for (const int depth : DEPTHS) {
        for (const int width : {1, 2, 3, 17, 600}) {
            Canvas canvas(Picture(width, 3, depth));
            const BITMAP r = description(canvas.bitmap());
            EXPECT_TRUE(r.bmType == 0 && r.bmWidth == width && r.bmHeight == 3 && r.bmPlanes == 1 &&
                        r.bmBits == nullptr && r.bmBitsPixel == depth &&
                        r.bmWidthBytes == row_bytes(width, depth, 16))
                << depth << ' ' << width;
            BITMAP record;
            EXPECT_EQ(GetObject(canvas.bitmap(), 31, &record), 0);
            EXPECT_EQ(GetObject(canvas.bitmap(), 0, nullptr), static_cast<int>(sizeof record));
        }
    }
    EXPECT_TRUE(GetStockObject(9) == nullptr && GetStockObject(-1) == nullptr);
}

TEST(Rectangles, have_the_arithmetic_of_sets) {
    const CRect a(0, 0, 10, 6), b(CPoint(4, 2), CSize(10, 10));
    EXPECT_EQ(a & b, CRect(4, 2, 10, 6));
    EXPECT_EQ(a | b, CRect(0, 0, 14, 12));
    EXPECT_EQ(a & (b + CPoint(10, 0)), CRect());
    EXPECT_EQ(a | CRect(5, 5, 5, 9), a);
    CRect c(9, 8, 3, 2);
    c.NormalizeRect();
    EXPECT_EQ(c, CRect(3, 2, 9, 8));
    c.DeflateRect(1, 2);
    EXPECT_TRUE(c == CRect(4, 4, 8, 6) && c.CenterPoint() == CPoint(6, 5) && c.PtInRect({4, 4}) &&
                !c.PtInRect({8, 4}));
    c.MoveToXY(0, 0);
    EXPECT_TRUE(c.BottomRight() - c.TopLeft() == c.Size() && c.Size() == CSize(4, 2) && !c.IsRectEmpty());
    EXPECT_EQ(CPoint(1, 2) + CSize(3, 4) - CPoint(1, 1), CSize(3, 5));
}

}  // namespace
