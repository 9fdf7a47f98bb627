/// @file
/// Points, sizes and rectangles with arithmetic. Sums and differences must fit 32 bits.
#ifndef BASALT_PLATFORM_RECTANGLES_H
#define BASALT_PLATFORM_RECTANGLES_H

#include <algorithm>

#include "basalt/platform/graphics_types.h"

/// A width and a height.
class CSize : public SIZE {
public:
    constexpr CSize() : SIZE{0, 0} {}                                  ///< 0 by 0
    constexpr CSize(LONG width, LONG height) : SIZE{width, height} {}  ///< width by height
    constexpr CSize(SIZE size) : SIZE(size) {}                         ///< a copy

    constexpr bool operator==(SIZE b) const { return cx == b.cx && cy == b.cy; }  ///< both are equal
    /// The same for two objects: C++20 finds the one above ambiguous.
    constexpr bool operator==(const CSize& b) const { return *this == static_cast<const SIZE&>(b); }
    constexpr bool operator!=(SIZE b) const { return !(*this == b); }           ///< one differs
    constexpr CSize operator+(SIZE b) const { return {cx + b.cx, cy + b.cy}; }  ///< sum
    constexpr CSize operator-(SIZE b) const { return {cx - b.cx, cy - b.cy}; }  ///< difference
    constexpr CSize operator-() const { return {-cx, -cy}; }                    ///< negated
    constexpr CSize& operator+=(SIZE b) { return *this = *this + b; }           ///< adds
    constexpr CSize& operator-=(SIZE b) { return *this = *this - b; }           ///< subtracts
};

/// A point.
class CPoint : public POINT {
public:
    constexpr CPoint() : POINT{0, 0} {}                                ///< the origin
    constexpr CPoint(LONG its_x, LONG its_y) : POINT{its_x, its_y} {}  ///< (x, y)
    constexpr CPoint(POINT point) : POINT(point) {}                    ///< a copy
    constexpr CPoint(SIZE size) : POINT{size.cx, size.cy} {}  ///< the point at this distance from the origin

    constexpr void Offset(LONG dx, LONG dy) { x += dx, y += dy; }              ///< moves
    constexpr void Offset(SIZE by) { Offset(by.cx, by.cy); }                   ///< moves
    constexpr bool operator==(POINT b) const { return x == b.x && y == b.y; }  ///< the same point
    /// The same for two objects: C++20 finds the one above ambiguous.
    constexpr bool operator==(const CPoint& b) const { return *this == static_cast<const POINT&>(b); }
    constexpr bool operator!=(POINT b) const { return !(*this == b); }            ///< another point
    constexpr CPoint operator+(SIZE by) const { return {x + by.cx, y + by.cy}; }  ///< the point moved
    constexpr CPoint operator-(SIZE by) const { return {x - by.cx, y - by.cy}; }  ///< the point moved back
    constexpr CSize operator-(POINT b) const { return {x - b.x, y - b.y}; }  ///< distance from another point
    constexpr CPoint operator-() const { return {-x, -y}; }                  ///< negated
    constexpr CPoint& operator+=(SIZE by) { return *this = *this + by; }     ///< moves
    constexpr CPoint& operator-=(SIZE by) { return *this = *this - by; }     ///< moves back
};

/// A rectangle of pixels; `right` and `bottom` are the first column and row outside.
class CRect : public RECT {
public:
    constexpr CRect() : RECT{0, 0, 0, 0} {}  ///< all zero
    /// A rectangle by its sides.
    constexpr CRect(LONG its_left, LONG its_top, LONG its_right, LONG its_bottom)
        : RECT{its_left, its_top, its_right, its_bottom} {}
    constexpr CRect(const RECT& r) : RECT(r) {}  ///< a copy
    /// A rectangle by its upper left corner and size.
    constexpr CRect(POINT corner, SIZE size)
        : RECT{corner.x, corner.y, corner.x + size.cx, corner.y + size.cy} {}
    /// A rectangle by two opposite corners.
    constexpr CRect(POINT first, POINT last) : RECT{first.x, first.y, last.x, last.y} {}

    operator LPRECT() { return this; }         ///< for calls that change it
    operator LPCRECT() const { return this; }  ///< for calls that read it

    constexpr LONG Width() const { return right - left; }             ///< columns
    constexpr LONG Height() const { return bottom - top; }            ///< rows
    constexpr CSize Size() const { return {Width(), Height()}; }      ///< columns and rows
    constexpr CPoint TopLeft() const { return {left, top}; }          ///< upper left corner
    constexpr CPoint BottomRight() const { return {right, bottom}; }  ///< lower right corner
    /// The middle, rounded towards the upper left.
    constexpr CPoint CenterPoint() const { return {left + Width() / 2, top + Height() / 2}; }
    constexpr BOOL IsRectEmpty() const { return left >= right || top >= bottom; }  ///< has no pixels
    /// Whether all sides are 0.
    constexpr BOOL IsRectNull() const { return left == 0 && top == 0 && right == 0 && bottom == 0; }
    /// Whether a pixel is inside.
    constexpr BOOL PtInRect(POINT p) const {
        return p.x >= left && p.x < right && p.y >= top && p.y < bottom;
    }

    /// Sets all sides.
    constexpr void SetRect(LONG its_left, LONG its_top, LONG its_right, LONG its_bottom) {
        *this = CRect(its_left, its_top, its_right, its_bottom);
    }
    constexpr void SetRectEmpty() { *this = CRect(); }                 ///< sets all sides to 0
    constexpr void CopyRect(LPCRECT r) { *this = CRect(*r); }          ///< copies
    constexpr BOOL EqualRect(LPCRECT r) const { return *this == *r; }  ///< the same sides
    /// Moves by x and y.
    constexpr void OffsetRect(LONG x, LONG y) { *this = CRect(left + x, top + y, right + x, bottom + y); }
    constexpr void OffsetRect(POINT by) { OffsetRect(by.x, by.y); }   ///< moves
    constexpr void OffsetRect(SIZE by) { OffsetRect(by.cx, by.cy); }  ///< moves
    /// Moves the upper left corner there.
    constexpr void MoveToXY(LONG x, LONG y) { OffsetRect(x - left, y - top); }
    /// Moves the sides outwards by x and y.
    constexpr void InflateRect(LONG x, LONG y) { *this = CRect(left - x, top - y, right + x, bottom + y); }
    constexpr void DeflateRect(LONG x, LONG y) { InflateRect(-x, -y); }  ///< moves the sides inwards
    /// Swaps opposite sides that are reversed.
    constexpr void NormalizeRect() {
        *this =
            CRect(std::min(left, right), std::min(top, bottom), std::max(left, right), std::max(top, bottom));
    }
    /// Becomes the part that two rectangles share.
    /// @return nonzero; 0, and all sides are 0, when they share none
    constexpr BOOL IntersectRect(LPCRECT a, LPCRECT b) {
        *this = CRect(std::max(a->left, b->left), std::max(a->top, b->top), std::min(a->right, b->right),
                      std::min(a->bottom, b->bottom));
        return keep_if_not_empty();
    }
    /// Becomes the smallest rectangle around two; an empty one does not count.
    /// @return nonzero; 0, and all sides are 0, when both are empty
    constexpr BOOL UnionRect(LPCRECT a, LPCRECT b) {
        const CRect first(*a);
        const CRect second(*b);
        *this = first.IsRectEmpty()    ? second
                : second.IsRectEmpty() ? first
                                       : CRect(std::min(a->left, b->left), std::min(a->top, b->top),
                                               std::max(a->right, b->right), std::max(a->bottom, b->bottom));
        return keep_if_not_empty();
    }

    /// The same sides.
    constexpr bool operator==(const RECT& r) const {
        return left == r.left && top == r.top && right == r.right && bottom == r.bottom;
    }
    /// The same for two objects: C++20 finds the one above ambiguous.
    constexpr bool operator==(const CRect& r) const { return *this == static_cast<const RECT&>(r); }
    constexpr bool operator!=(const RECT& r) const { return !(*this == r); }           ///< another side
    constexpr CRect& operator+=(POINT by) { return OffsetRect(by), *this; }            ///< moves
    constexpr CRect& operator-=(POINT by) { return OffsetRect(-by.x, -by.y), *this; }  ///< moves back
    /// As IntersectRect.
    constexpr CRect& operator&=(const RECT& r) { return IntersectRect(this, &r), *this; }
    constexpr CRect& operator|=(const RECT& r) { return UnionRect(this, &r), *this; }  ///< as UnionRect
    /// The rectangle moved.
    constexpr CRect operator+(POINT by) const { return CRect(*this) += by; }
    /// The part shared with another.
    constexpr CRect operator&(const RECT& r) const { return CRect(*this) &= r; }
    /// The smallest rectangle around both.
    constexpr CRect operator|(const RECT& r) const { return CRect(*this) |= r; }

private:
    constexpr BOOL keep_if_not_empty() {
        if (IsRectEmpty() != 0) {
            SetRectEmpty();
            return 0;
        }
        return 1;
    }
};

#endif
