// Drawing calls drawn at random, on a few contexts, bitmaps and regions: after each, every pixel is what the
// picture model says, and everything can be deleted in the end.
#include <array>
#include <cstddef>
#include <cstdint>

#include "fuzz/input.h"
#include "tests/support/drawing.h"

namespace {

using basalt::fuzz::Input;
using basalt::fuzz::require;
using namespace drawing;

constexpr int SIDE = 30;  // of the regions
const XFORM TRANSFORMS[] = {
    {1, 0, 0, 1, 0, 0},    turn_about(30, 12, 9),  turn_about(123.4, 5, 5),
    turn_about(90, 10, 8), {2, 0, 0, 2, -3, 1},    {-1, 0, 0, 1, 20, 0},
    {1, 0, 0, 1, 3, -4},   {0.25F, 0, 0, 4, 1, 1}, {1, 0.3F, -0.7F, 1.2F, 5.25F, -3.5F}};

// A context with its bitmap, and the model of both.
struct Surface {
    Picture picture;
    Canvas canvas;
    Settings settings;

    explicit Surface(Input& in)
        : picture(
              random_picture(1 + in.byte() % 40, 1 + in.byte() % 20, DEPTHS[in.byte() % 6],
                             [word = in.word()]() mutable { return word = word * 1664525 + 1013904223; })),
          canvas(picture) {}
};

struct World {
    Input& in;
    std::array<Surface, 3> surfaces{Surface(in), Surface(in), Surface(in)};
    std::array<Picture, 3> sets{Picture(SIDE, SIDE, 1), Picture(SIDE, SIDE, 1), Picture(SIDE, SIDE, 1)};
    std::array<CRgn, 3> regions;

    explicit World(Input& its_input) : in(its_input) {
        for (CRgn& region : regions) {
            region.CreateRectRgn(0, 0, 0, 0);
        }
    }

    Surface& surface() { return surfaces[in.byte() % 3U]; }
    // Near 0 mostly, never so far that a shift leaves 32 bits.
    int coordinate() { return std::clamp(in.coordinate(), -2147483000, 2147483000); }
    RECT rectangle() { return {coordinate(), coordinate(), coordinate(), coordinate()}; }
    COLORREF colour(const Surface& s) {
        const int kind = in.byte();
        return kind % 2 == 0
                   ? in.word()
                   : colour_of(s.picture.depth,
                               s.picture.pixels[static_cast<std::size_t>(kind) % s.picture.pixels.size()]);
    }
    bool is_shift(const Surface& s) const { return s.settings.world.eM11 == 1 && s.settings.world.eM12 == 0; }

    // Runs a call that draws on rectangles: refused under a transform, else as `paint` does it without.
    template <class Call, class Paint>
    void draw(Surface& s, const Call& call, const Paint& paint) {
        require(call() == (is_shift(s) ? 1 : 0));
        if (is_shift(s)) {
            paint(static_cast<int>(s.settings.world.eDx), static_cast<int>(s.settings.world.eDy));
        }
    }
    static RECT moved(const RECT& r, int dx, int dy) {
        return {r.left + dx, r.top + dy, r.right + dx, r.bottom + dy};
    }

    void pixel(Surface& s) {
        const int x = coordinate(), y = coordinate();
        const COLORREF drawn = colour(s);
        const std::int64_t px = x + static_cast<std::int64_t>(s.settings.world.eDx);
        const std::int64_t py = y + static_cast<std::int64_t>(s.settings.world.eDy);
        const bool is_there = is_shift(s) && s.picture.has(px, py);
        require(GetPixel(s.canvas, x, y) ==
                (is_there ? colour_of(s.picture.depth, s.picture.at(px, py)) : CLR_INVALID));
        const std::uint32_t value = value_of(s.picture.depth, drawn);
        require(SetPixel(s.canvas, x, y, drawn) ==
                (is_there ? colour_of(s.picture.depth, value) : CLR_INVALID));
        if (is_there) {
            s.picture.at(px, py) = value;
        }
    }

    void fills(Surface& s) {
        const RECT r = rectangle();
        const COLORREF drawn = colour(s);
        const CBrush brush(drawn);
        const std::uint32_t value = value_of(s.picture.depth, drawn);
        const auto fill = [&](int, int, std::uint32_t& pixel) { pixel = value; };
        if (in.byte() % 2 == 0) {
            draw(
                s, [&] { return FillRect(s.canvas, &r, brush); },
                [&](int dx, int dy) { on(s.picture, moved(r, dx, dy), fill); });
            return;
        }
        const int width = coordinate(), height = coordinate();
        HGDIOBJ const before = SelectObject(s.canvas, brush);
        draw(
            s, [&] { return RoundRect(s.canvas, r.left, r.top, r.right, r.bottom, width, height); },
            [&](int dx, int dy) {
                const RECT box = ordered(moved(r, dx, dy));
                on(s.picture, box, [&](int x, int y, std::uint32_t& pixel) {
                    pixel = is_in_rounded(box, std::abs(width), std::abs(height), x, y) ? value : pixel;
                });
            });
        SelectObject(s.canvas, before);
    }

    void gradients(Surface& s) {
        TRIVERTEX ends[2];
        for (TRIVERTEX& end : ends) {
            const auto channel = [&] { return static_cast<WORD>(in.byte() << 8 | in.byte()); };
            end = {coordinate(), coordinate(), channel(), channel(), channel(), 0};
        }
        const GRADIENT_RECT mesh = {0, 1};
        const bool across = in.byte() % 2 == 0;
        draw(
            s, [&] { return GradientFill(s.canvas, ends, 2, &mesh, 1, across ? 0 : 1); },
            [&](int dx, int dy) {
                TRIVERTEX a = ends[0], b = ends[1];
                a.x += dx, a.y += dy, b.x += dx, b.y += dy;
                gradient(s.picture, a, b, across);
            });
    }

    void copies(Surface& to, Surface& from) {
        constexpr DWORD OPERATIONS[] = {SRCCOPY, NOTSRCCOPY, SRCAND, SRCPAINT, SRCINVERT};
        const RECT r = rectangle();
        const Block b = {r.left, r.top, r.right, r.bottom, coordinate(), coordinate()};
        const DWORD rop = OPERATIONS[in.byte() % 5];
        const XFORM& w = from.settings.world;
        const bool is_moved = w.eDx != 0 || w.eM11 != 1 || w.eM12 != 0;
        const bool done =
            BitBlt(to.canvas, b.x, b.y, b.width, b.height, from.canvas, b.source_x, b.source_y, rop);
        require(done == (w.eM12 == 0 && w.eM21 == 0));
        if (!done) {
            return;
        }
        const Picture result = to.canvas.picture();
        if (!is_moved) {  // a model of one transform at a time
            Picture expected = to.picture;
            std::vector<std::pair<int, int>> open;
            expected = copied(to.picture, b, from.picture, rop, to.settings, from.settings.background, 1e-6,
                              [&](int x, int y) { open.emplace_back(x, y); });
            for (const auto& [x, y] : open) {
                expected.at(x, y) = result.at(x, y);
            }
            require(result == expected);
        }
        to.picture = result;
    }

    void keyed_copies(Surface& to, Surface& from) {
        const RECT r = rectangle(), source = rectangle();
        const COLORREF key = colour(from);
        const bool is_sized = r.right >= 0 && r.bottom >= 0 && source.right >= 0 && source.bottom >= 0;
        require(TransparentBlt(to.canvas, r.left, r.top, r.right, r.bottom, from.canvas, source.left,
                               source.top, source.right, source.bottom,
                               key) == (is_sized && is_shift(to) && is_shift(from) ? 1 : 0));
        if (is_sized && is_shift(to) && is_shift(from)) {
            const auto dx = static_cast<int>(to.settings.world.eDx),
                       dy = static_cast<int>(to.settings.world.eDy);
            const auto sx = static_cast<int>(from.settings.world.eDx),
                       sy = static_cast<int>(from.settings.world.eDy);
            const RECT place = moved({r.left, r.top, 0, 0}, dx, dy),
                       part = moved({source.left, source.top, 0, 0}, sx, sy);
            to.picture = keyed(
                to.picture,
                {place.left, place.top, r.right, r.bottom, part.left, part.top, source.right, source.bottom},
                from.picture, key, to.settings, from.settings.background);
        }
    }

    void settings(Surface& s) {
        s.settings.text = in.word();
        s.settings.background = in.word();
        s.settings.world = TRANSFORMS[in.byte() % 9U];
        SetTextColor(s.canvas, s.settings.text);
        SetBkColor(s.canvas, s.settings.background);
        SetGraphicsMode(s.canvas, GM_ADVANCED);
        require(SetWorldTransform(s.canvas, &s.settings.world) != 0);
    }

    void combine() {
        const std::size_t a = in.byte() % 3, b = in.byte() % 3, into = in.byte() % 3;
        const int mode = RGN_AND + in.byte() % 5;
        if (in.byte() % 2 == 0) {
            const RECT r = rectangle();
            Picture set(SIDE, SIDE, 1);
            on(set, ordered(r), [](int, int, std::uint32_t& value) { value = 1; });
            const RECT part = {std::clamp<LONG>(r.left, 0, SIDE), std::clamp<LONG>(r.top, 0, SIDE),
                               std::clamp<LONG>(r.right, 0, SIDE), std::clamp<LONG>(r.bottom, 0, SIDE)};
            require(regions[b].SetRectRgn(&part) != 0);
            sets[b] = set;
        }
        Picture result(SIDE, SIDE, 1);
        for (std::size_t i = 0; i < result.pixels.size(); ++i) {
            const std::uint32_t x = sets[a].pixels[i], y = sets[b].pixels[i];
            const std::uint32_t results[] = {x & y, x | y, x ^ y, x & ~y, x};
            result.pixels[i] = results[mode - RGN_AND];
        }
        require(regions[into].CombineRgn(&regions[a], &regions[b], mode) != RGN_ERROR);
        sets[into] = result;
        require(holds(regions[into], result));
    }

    void step() {
        Surface& s = surface();
        switch (in.byte() % 8) {
            case 0:
                pixel(s);
                break;
            case 1:
                fills(s);
                break;
            case 2:
                gradients(s);
                break;
            case 3:
            case 4:
                copies(s, surface());
                break;
            case 5:
                keyed_copies(s, surface());
                break;
            case 6:
                settings(s);
                break;
            default:
                combine();
        }
        require(s.canvas.picture() == s.picture);
    }
};

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    Input input(data, size);
    World world(input);
    for (int steps = 0; !input.is_over() && steps < 200; ++steps) {
        world.step();
    }
    return 0;
}
