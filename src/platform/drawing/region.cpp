#include "basalt/platform/region.h"

#include <algorithm>
#include <cstring>
#include <limits>
#include <new>
#include <utility>

#include "basalt/platform/error.h"
#include "src/platform/drawing/handles.h"
#include "src/platform/pixels/bands.h"
#include "src/platform/raster_extras.h"

namespace {

using basalt::platform::Bands;
using basalt::platform::GraphicsKind;
using basalt::platform::GraphicsObject;
using basalt::platform::Keep;
using basalt::platform::object_of;

struct DrawingRegion : GraphicsObject {
    static constexpr GraphicsKind KIND = GraphicsKind::REGION;
    explicit DrawingRegion(Bands its_bands) : GraphicsObject(KIND), bands(std::move(its_bands)) {}
    ~DrawingRegion() override { lent.Detach(); }

    int complexity() const {
        const std::size_t count = bands.rectangles().size();
        return count == 0 ? NULLREGION : count == 1 ? SIMPLEREGION : COMPLEXREGION;
    }

    Bands bands;
    CRgn lent;  // what CRgn::FromHandle lends
};

int refuse(DWORD error) {
    SetLastError(error);
    return RGN_ERROR;
}

Bands combined(const Bands& a, const Bands& b, int mode) {
    switch (mode) {
        case RGN_AND:
            return basalt::platform::combined(a, b, Keep::AND);
        case RGN_OR:
            return basalt::platform::combined(a, b, Keep::OR);
        case RGN_XOR:
            return basalt::platform::combined(a, b, Keep::XOR);
        case RGN_DIFF:
            return basalt::platform::combined(a, b, Keep::DIFF);
        default:
            return a;
    }
}

}  // namespace

HRGN basalt::platform::create_region(std::vector<RECT> rectangles) {
    std::unique_ptr<DrawingRegion> region(new (std::nothrow) DrawingRegion(Bands(std::move(rectangles))));
    return static_cast<HRGN>(keep_graphics_object(std::move(region)));
}

HRGN CreateRectRgn(int left, int top, int right, int bottom) {
    const auto [first_column, end_column] = std::minmax(left, right);
    const auto [first_row, end_row] = std::minmax(top, bottom);
    try {
        std::vector<RECT> rectangles;
        if (left != right && top != bottom) {
            rectangles.push_back({first_column, first_row, end_column, end_row});
        }
        return basalt::platform::create_region(std::move(rectangles));
    } catch (const std::bad_alloc&) {
        SetLastError(ERROR_NOT_ENOUGH_MEMORY);
        return nullptr;
    }
}

int CombineRgn(HRGN destination, HRGN a, HRGN b, int mode) {
    auto* const result = object_of<DrawingRegion>(destination);
    const auto* const first = result != nullptr ? object_of<DrawingRegion>(a) : nullptr;
    const auto* const second = first == nullptr || mode == RGN_COPY ? first : object_of<DrawingRegion>(b);
    if (second == nullptr) {
        return RGN_ERROR;
    }
    if (mode < RGN_AND || mode > RGN_COPY) {
        return refuse(ERROR_INVALID_PARAMETER);
    }
    try {
        result->bands = combined(first->bands, second->bands, mode);
    } catch (const std::bad_alloc&) {
        return refuse(ERROR_NOT_ENOUGH_MEMORY);
    }
    return result->complexity();
}

int OffsetRgn(HRGN region, int x, int y) {
    auto* const found = object_of<DrawingRegion>(region);
    if (found == nullptr) {
        return RGN_ERROR;
    }
    return found->bands.shift(x, y) ? found->complexity() : refuse(ERROR_INVALID_PARAMETER);
}

BOOL PtInRegion(HRGN region, int x, int y) {
    const auto* const found = object_of<DrawingRegion>(region);
    return found != nullptr && found->bands.contains(x, y) ? 1 : 0;
}

int GetRgnBox(HRGN region, RECT* box) {
    const auto* const found = object_of<DrawingRegion>(region);
    if (found == nullptr) {
        return RGN_ERROR;
    }
    if (box == nullptr) {
        return refuse(ERROR_INVALID_PARAMETER);
    }
    *box = found->bands.box();
    return found->complexity();
}

DWORD GetRegionData(HRGN region, DWORD size, RGNDATA* data) {
    const auto* const found = object_of<DrawingRegion>(region);
    if (found == nullptr) {
        return 0;
    }
    const std::vector<RECT>& rectangles = found->bands.rectangles();
    const std::size_t bytes = rectangles.size() * sizeof(RECT);
    const std::size_t needed = sizeof(RGNDATAHEADER) + bytes;
    if (needed > std::numeric_limits<DWORD>::max() || (data != nullptr && size < needed)) {
        SetLastError(ERROR_INSUFFICIENT_BUFFER);
        return 0;
    }
    if (data != nullptr) {
        const RGNDATAHEADER header = {sizeof(RGNDATAHEADER), RDH_RECTANGLES,
                                      static_cast<DWORD>(rectangles.size()), static_cast<DWORD>(bytes),
                                      found->bands.box()};
        // The rectangles lie behind the record's end, so they are reached from the record's own address.
        auto* const to = reinterpret_cast<std::byte*>(data);
        std::memcpy(to, &header, sizeof header);
        if (bytes > 0) {
            std::memcpy(to + sizeof header, rectangles.data(), bytes);
        }
    }
    return static_cast<DWORD>(needed);
}

BOOL EqualRgn(HRGN a, HRGN b) {
    const auto* const first = object_of<DrawingRegion>(a);
    const auto* const second = first != nullptr ? object_of<DrawingRegion>(b) : nullptr;
    return second != nullptr && first->bands == second->bands ? 1 : 0;
}

CRgn* CRgn::FromHandle(HRGN region) {
    auto* const object = object_of<DrawingRegion>(region);
    if (object == nullptr) {
        return nullptr;
    }
    object->lent.m_hObject = region;
    return &object->lent;
}
