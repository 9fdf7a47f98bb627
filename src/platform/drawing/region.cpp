#include "basalt/platform/region.h"

#include <algorithm>
#include <cstring>
#include <limits>
#include <new>
#include <utility>

#include "src/platform/drawing/objects.h"
#include "src/platform/pixels/bands.h"
#include "src/platform/raster_extras.h"
#include "src/platform/system/failure.h"

namespace {

using namespace basalt::platform;

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

// By mode, from RGN_AND to RGN_DIFF.
constexpr Keep KEPT[] = {Keep::AND, Keep::OR, Keep::XOR, Keep::DIFF};

}  // namespace

HRGN basalt::platform::create_region(std::vector<RECT> rectangles) {
    std::unique_ptr<DrawingRegion> region(new (std::nothrow) DrawingRegion(Bands(std::move(rectangles))));
    return static_cast<HRGN>(keep_graphics_object(std::move(region)));
}

HRGN CreateRectRgn(int left, int top, int right, int bottom) {
    const auto [first_column, end_column] = std::minmax(left, right);
    const auto [first_row, end_row] = std::minmax(top, bottom);
    const RECT rectangle = {first_column, first_row, end_column, end_row};
    const bool is_empty = left == right || top == bottom;
    return or_out_of_memory(HRGN{nullptr},
                            [&] { return create_region(std::vector<RECT>(is_empty ? 0 : 1, rectangle)); });
}

int CombineRgn(HRGN destination, HRGN a, HRGN b, int mode) {
    auto* const result = object_of<DrawingRegion>(destination);
    const auto* const first = result != nullptr ? object_of<DrawingRegion>(a) : nullptr;
    const auto* const second = first == nullptr || mode == RGN_COPY ? first : object_of<DrawingRegion>(b);
    if (second == nullptr) {
        return RGN_ERROR;
    }
    if (mode < RGN_AND || mode > RGN_COPY) {
        return fail_with(ERROR_INVALID_PARAMETER, RGN_ERROR);
    }
    return or_out_of_memory(RGN_ERROR, [&] {
        result->bands =
            mode == RGN_COPY ? first->bands : combined(first->bands, second->bands, KEPT[mode - RGN_AND]);
        return result->complexity();
    });
}

int OffsetRgn(HRGN region, int x, int y) {
    auto* const found = object_of<DrawingRegion>(region);
    if (found == nullptr) {
        return RGN_ERROR;
    }
    return found->bands.shift(x, y) ? found->complexity() : fail_with(ERROR_INVALID_PARAMETER, RGN_ERROR);
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
        return fail_with(ERROR_INVALID_PARAMETER, RGN_ERROR);
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
        return fail_with(ERROR_INSUFFICIENT_BUFFER, DWORD{0});
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
    return object != nullptr ? lend(object->lent, region) : nullptr;
}
