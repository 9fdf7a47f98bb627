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
    EXPECT_TRUE(dc.SetTextColor(1) == 0 && dc.SetBkColor(1) == 0xFFFFFF);
    EXPECT_EQ(*dc.SelectStockObject(NULL_BRUSH), GetStockObject(WHITE_BRUSH));
    EXPECT_EQ(SelectObject(dc, GetStockObject(NULL_PEN)), GetStockObject(BLACK_PEN));
    EXPECT_TRUE(dc.SetPixel(0, 0, 0xC0C0C0) == 0xFFFFFF && dc.GetPixel(1, 0) == CLR_INVALID);
    HDC const screen = GetDC(nullptr), memory = CreateCompatibleDC(screen);
    auto* const window = reinterpret_cast<HWND>(screen);
    CBitmap bitmap, deep;
    bitmap.CreateCompatibleBitmap(&dc, 20, 3);
    deep.Attach(CreateCompatibleBitmap(screen, 3, 2));
    EXPECT_TRUE(description(bitmap).bmBitsPixel == 1 && description(deep).bmBitsPixel == 32);
    EXPECT_NE(BitBlt(screen, 0, 0, 9, 9, screen, 0, 0, SRCCOPY), 0);
    EXPECT_TRUE(GetPixel(screen, 0, 0) == CLR_INVALID && SelectObject(screen, deep) == nullptr);
    EXPECT_TRUE(
        refused(DeleteDC(screen), ReleaseDC(nullptr, memory), ReleaseDC(window, screen), GetDC(window)));
    EXPECT_EQ(ReleaseDC(nullptr, screen) + 2 * ReleaseDC(nullptr, screen), 1);
    EXPECT_NE(DeleteDC(memory), 0);
}

TEST(Selection, holds_a_bitmap_in_one_context_and_objects_from_deletion) {
    CDC a, b;
    a.CreateCompatibleDC(nullptr), b.CreateCompatibleDC(&a);
    CBitmap first, second;
    first.CreateBitmap(4, 4, 1, 24, nullptr), second.CreateBitmap(4, 4, 1, 8, nullptr);
    CBrush brush(0x123456);
    CBitmap* const stock = a.SelectObject(&first);
    EXPECT_TRUE(b.SelectObject(&first) == nullptr && GetLastError() == ERROR_BUSY);
    EXPECT_EQ(*a.SelectObject(&brush), GetStockObject(WHITE_BRUSH));
    EXPECT_EQ(*b.SelectObject(&brush), GetStockObject(WHITE_BRUSH));
    EXPECT_EQ(*a.SelectStockObject(WHITE_BRUSH), brush.GetSafeHandle());
    EXPECT_TRUE(refused(DeleteObject(first), DeleteObject(brush)));
    CBitmap* const lent = a.SelectObject(&second);
    EXPECT_TRUE(*lent == first.m_hObject && b.SelectObject(lent) != nullptr);
    // The stock bitmap serves every context, each with a pixel of its own and without rows.
    EXPECT_TRUE(*b.SelectObject(stock) == first.m_hObject && *a.SelectObject(stock) == second.m_hObject);
    a.SetPixel(0, 0, 0xFFFFFF);
    DibHeader dib(0, 0, 0);
    EXPECT_TRUE(refused(b.GetPixel(0, 0), GetDIBits(a, *stock, 0, 0, nullptr, dib.info(), DIB_RGB_COLORS)));
    EXPECT_TRUE(description(*stock).bmWidth == 1 && stock->DeleteObject() &&
                a.SelectObject(&first)->GetSafeHandle());
    EXPECT_TRUE(b.DeleteDC() && a.DeleteDC() && first.DeleteObject() && brush.DeleteObject()) << "free again";
    EXPECT_FALSE(first.DeleteObject());
}

TEST(Wrapper, owns_one_handle_and_is_lent) {
    CBitmap bitmap;
    CRgn region;
    CBrush brush(0xFF);
    CDC dc;
    EXPECT_TRUE(bitmap.CreateBitmap(2, 2, 1, 8, nullptr) && region.CreateRectRgn(0, 0, 1, 1) &&
                dc.CreateCompatibleDC(nullptr));
    EXPECT_TRUE(refused(bitmap.CreateBitmap(2, 2, 1, 8, nullptr), region.CreateRectRgn(0, 0, 1, 1),
                        brush.CreateSolidBrush(0), dc.CreateCompatibleDC(nullptr), dc.Attach(dc),
                        CBitmap().Attach(nullptr), CDC::FromHandle(nullptr), CRgn::FromHandle(nullptr),
                        CBitmap::FromHandle(nullptr), CBrush::FromHandle(nullptr)));
    EXPECT_TRUE(*CBitmap::FromHandle(bitmap) == bitmap.m_hObject &&
                *CRgn::FromHandle(region) == region.m_hObject);
    EXPECT_EQ(*CBrush::FromHandle(brush), brush.m_hObject);
    EXPECT_TRUE(CDC::FromHandle(dc)->DeleteDC() && CBrush::FromHandle(brush)->DeleteObject())
        << "though lent";
    EXPECT_FALSE(dc.DeleteDC() || brush.DeleteObject());
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
    int i = 0;
    for (void* const handle :
         {HGDIOBJ(nullptr), HGDIOBJ(deleted), canvas.bitmap().m_hObject, region.m_hObject, brush.m_hObject,
          GetStockObject(WHITE_PEN), HGDIOBJ(~std::uintptr_t{0}), HGDIOBJ(&box)}) {
        SCOPED_TRACE(i);
        auto* const dc = static_cast<HDC>(handle);
        auto* const rgn = static_cast<HRGN>(handle);
        auto* const bitmap = static_cast<HBITMAP>(handle);
        EXPECT_TRUE(refused(i != 0 && CreateCompatibleDC(dc) != nullptr, DeleteDC(dc),
                            CreateCompatibleBitmap(dc, 1, 1), SelectObject(dc, brush), GetPixel(dc, 0, 0) + 1,
                            SetPixel(dc, 0, 0, 0) + 1, SetBkColor(dc, 0) + 1, SetTextColor(dc, 0) + 1,
                            SetMapMode(dc, MM_TEXT), GetMapMode(dc), SetGraphicsMode(dc, GM_ADVANCED),
                            DPtoLP(dc, &point, 1), ModifyWorldTransform(dc, nullptr, MWT_IDENTITY)));
        EXPECT_TRUE(refused(FillRect(dc, &box, brush), RoundRect(dc, 0, 0, 1, 1, 1, 1),
                            GradientFill(dc, corners, 2, &mesh, 1, 0),
                            BitBlt(dc, 0, 0, 1, 1, canvas, 0, 0, SRCCOPY),
                            BitBlt(canvas, 0, 0, 1, 1, dc, 0, 0, SRCCOPY),
                            TransparentBlt(canvas, 0, 0, 1, 1, dc, 0, 0, 1, 1, 0),
                            GetDIBits(dc, canvas.bitmap(), 0, 2, bits, dib.info(), 0),
                            i != 2 && GetDIBits(canvas, bitmap, 0, 2, bits, dib.info(), 0) != 0,
                            i != 2 && GetObject(bitmap, sizeof(BITMAP), nullptr) != 0,
                            i != 4 && FillRect(canvas, &box, static_cast<HBRUSH>(handle)) != 0));
        EXPECT_TRUE(i != 4 || GetLastError() == ERROR_INVALID_HANDLE);
        EXPECT_TRUE(i == 3 ||
                    refused(CombineRgn(region, region, rgn, RGN_OR), GetRgnBox(rgn, &box),
                            CombineRgn(rgn, region, region, RGN_OR), OffsetRgn(rgn, 1, 1),
                            EqualRgn(region, rgn), PtInRegion(rgn, 0, 0), GetRegionData(rgn, 0, nullptr)));
        ++i;
    }
    EXPECT_TRUE(
        refused(SelectObject(canvas, region), SelectObject(canvas, canvas), DeleteObject(HDC(canvas))));
    EXPECT_EQ(canvas.picture(), Picture(2, 2, 32)) << "nothing was drawn";
}

TEST(Bitmap, of_no_size_is_one_monochrome_pixel_and_of_no_meaning_is_refused) {
    const Canvas canvas(Picture(1, 1, 32));
    const std::uint32_t bits = ~0U;
    for (HBITMAP const bitmap : {CreateBitmap(0, 5, 1, 32, &bits), CreateBitmap(5, 0, 1, 8, &bits),
                                 CreateCompatibleBitmap(canvas, 0, -7)}) {
        const BITMAP record = description(bitmap);
        EXPECT_EQ(record.bmWidth * record.bmHeight * record.bmBitsPixel, 1);
        EXPECT_NE(DeleteObject(bitmap), 0);
    }
    const int senseless[][4] = {{-1, 1, 1, 32},        {1, -1, 1, 32},        {1, 1, 2, 1},
                                {1, 1, 1, 2},          {1, 1, 0, 8},          {1, 1, 1, 0},
                                {65536, 65536, 1, 32}, {32768, 16384, 1, 32}, {INT_MAX, INT_MAX, 1, 32}};
    for (const auto& r : senseless) {
        EXPECT_EQ(CreateBitmap(r[0], r[1], static_cast<UINT>(r[2]), static_cast<UINT>(r[3]), nullptr),
                  nullptr);
        EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);
    }
    EXPECT_TRUE(refused(CreateCompatibleBitmap(canvas, INT_MAX, INT_MAX),
                        CreateCompatibleBitmap(canvas, -1, 1), GetStockObject(9), GetStockObject(-1)));
    for (const int depth : DEPTHS) {
        Canvas wide(Picture(17, 3, depth));
        BITMAP r = description(wide.bitmap());
        EXPECT_TRUE(r.bmType == 0 && r.bmWidth == 17 && r.bmHeight == 3 && r.bmPlanes == 1 &&
                    r.bmBits == nullptr && r.bmBitsPixel == depth &&
                    r.bmWidthBytes == row_bytes(17, depth, 16));
        EXPECT_TRUE(GetObject(wide.bitmap(), 31, &r) == 0 &&
                    GetObject(wide.bitmap(), 0, nullptr) == sizeof r);
    }
}

TEST(Rectangles, have_the_arithmetic_of_sets) {
    const CRect a(0, 0, 10, 6), b(CPoint(4, 2), CSize(10, 10));
    EXPECT_TRUE((a & b) == CRect(4, 2, 10, 6) && (a | b) == CRect(0, 0, 14, 12));
    EXPECT_TRUE((a & (b + CPoint(10, 0))) == CRect() && (a | CRect(5, 5, 5, 9)) == a);
    CRect c(9, 8, 3, 2);
    c.NormalizeRect(), c.DeflateRect(1, 2);
    EXPECT_TRUE(c == CRect(4, 4, 8, 6) && c.CenterPoint() == CPoint(6, 5));
    EXPECT_TRUE(c.PtInRect({4, 4}) && !c.PtInRect({8, 4}));
    c.MoveToXY(0, 0);
    EXPECT_TRUE(c.BottomRight() - c.TopLeft() == c.Size() && c.Size() == CSize(4, 2) && !c.IsRectEmpty());
    EXPECT_EQ(CPoint(1, 2) + CSize(3, 4) - CPoint(1, 1), CSize(3, 5));
}

}  // namespace
