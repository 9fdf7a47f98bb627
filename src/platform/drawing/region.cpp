#include "basalt/platform/region.h"

#include <pixman.h>

#include <algorithm>
#include <cstddef>
#include <limits>
#include <new>
#include <utility>

#include "basalt/platform/error.h"
#include "src/platform/drawing/graphics_handles.h"
#include "src/platform/region_rectangles.h"

namespace {

using basalt::platform::GraphicsKind;
using basalt::platform::GraphicsObject;
using basalt::platform::object_of;

// Bands of rectangles in the one form that a set of pixels has, so that equal sets are equal records.
struct Area {
    Area() { pixman_region32_init(&bands); }
    Area(const Area&) = delete;
    Area& operator=(const Area&) = delete;
    ~Area() { pixman_region32_fini(&bands); }

    pixman_region32_t bands;
};

struct DrawingRegion : GraphicsObject {
    static constexpr GraphicsKind KIND = GraphicsKind::REGION;
    DrawingRegion() : GraphicsObject(KIND) {}
    ~DrawingRegion() override { lent.Detach(); }

    Area area;
    CRgn lent;  // what CRgn::FromHandle lends
};

static_assert(sizeof(RECT) == sizeof(pixman_box32_t) &&
              offsetof(RECT, left) == offsetof(pixman_box32_t, x1) &&
              offsetof(RECT, top) == offsetof(pixman_box32_t, y1) &&
              offsetof(RECT, right) == offsetof(pixman_box32_t, x2) &&
              offsetof(RECT, bottom) == offsetof(pixman_box32_t, y2));

// The library's functions read the regions they are given, but do not say so.
pixman_region32_t* bands_of(const DrawingRegion& region) {
    return const_cast<pixman_region32_t*>(&region.area.bands);
}

int kind_of_area(pixman_region32_t* bands) {
    if (!pixman_region32_not_empty(bands)) {
        return NULLREGION;
    }
    return pixman_region32_n_rects(bands) == 1 ? SIMPLEREGION : COMPLEXREGION;
}

bool combine(pixman_region32_t* result, pixman_region32_t* a, pixman_region32_t* b, int mode) {
    switch (mode) {
        case RGN_AND:
            return pixman_region32_intersect(result, a, b);
        case RGN_OR:
            return pixman_region32_union(result, a, b);
        case RGN_DIFF:
            return pixman_region32_subtract(result, a, b);
        case RGN_COPY:
            return pixman_region32_copy(result, a);
        default:
            break;
    }
    Area rest;
    return pixman_region32_subtract(&rest.bands, b, a) && pixman_region32_subtract(result, a, b) &&
           pixman_region32_union(result, result, &rest.bands);
}

HRGN keep_region(std::unique_ptr<DrawingRegion> region) {
    return static_cast<HRGN>(basalt::platform::keep_graphics_object(std::move(region)));
}

}  // namespace

HRGN basalt::platform::create_region(std::span<const RECT> rectangles) {
    std::unique_ptr<DrawingRegion> region(new (std::nothrow) DrawingRegion);
    // The library writes to standard error about a single rectangle that is reversed.
    const bool holds_none =
        rectangles.empty() || (rectangles.size() == 1 && (rectangles[0].left >= rectangles[0].right ||
                                                          rectangles[0].top >= rectangles[0].bottom));
    if (region != nullptr && !holds_none) {
        if (rectangles.size() > static_cast<std::size_t>(std::numeric_limits<int>::max()) ||
            !pixman_region32_init_rects(&region->area.bands,
                                        reinterpret_cast<const pixman_box32_t*>(rectangles.data()),
                                        static_cast<int>(rectangles.size()))) {
            region = nullptr;
        }
    }
    return keep_region(std::move(region));
}

HRGN CreateRectRgn(int left, int top, int right, int bottom) {
    const RECT rectangle = {std::min(left, right), std::min(top, bottom), std::max(left, right),
                            std::max(top, bottom)};
    return basalt::platform::create_region(std::span(&rectangle, 1));
}

int CombineRgn(HRGN destination, HRGN a, HRGN b, int mode) {
    auto* const result = object_of<DrawingRegion>(destination);
    const auto* const first = result != nullptr ? object_of<DrawingRegion>(a) : nullptr;
    const auto* const second = first == nullptr || mode == RGN_COPY ? first : object_of<DrawingRegion>(b);
    if (second == nullptr) {
        return RGN_ERROR;
    }
    if (mode < RGN_AND || mode > RGN_COPY) {
        SetLastError(ERROR_INVALID_PARAMETER);
        return RGN_ERROR;
    }
    Area combined;
    if (!combine(&combined.bands, bands_of(*first), bands_of(*second), mode)) {
        SetLastError(ERROR_NOT_ENOUGH_MEMORY);
        return RGN_ERROR;
    }
    std::swap(combined.bands, result->area.bands);
    return kind_of_area(&result->area.bands);
}

BOOL PtInRegion(HRGN region, int x, int y) {
    const auto* const found = object_of<DrawingRegion>(region);
    return found != nullptr && pixman_region32_contains_point(bands_of(*found), x, y, nullptr) ? 1 : 0;
}

int GetRgnBox(HRGN region, RECT* box) {
    const auto* const found = object_of<DrawingRegion>(region);
    if (found == nullptr) {
        return RGN_ERROR;
    }
    if (box == nullptr) {
        SetLastError(ERROR_INVALID_PARAMETER);
        return RGN_ERROR;
    }
    pixman_region32_t* const bands = bands_of(*found);
    const int kind = kind_of_area(bands);
    const pixman_box32_t* const extents = pixman_region32_extents(bands);
    *box = kind == NULLREGION ? RECT{0, 0, 0, 0} : RECT{extents->x1, extents->y1, extents->x2, extents->y2};
    return kind;
}

BOOL EqualRgn(HRGN a, HRGN b) {
    const auto* const first = object_of<DrawingRegion>(a);
    const auto* const second = first != nullptr ? object_of<DrawingRegion>(b) : nullptr;
    return second != nullptr && pixman_region32_equal(bands_of(*first), bands_of(*second)) ? 1 : 0;
}

CRgn* CRgn::FromHandle(HRGN region) {
    auto* const object = object_of<DrawingRegion>(region);
    if (object == nullptr) {
        return nullptr;
    }
    object->lent.m_hObject = region;
    return &object->lent;
}
