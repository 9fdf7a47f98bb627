// Drawing calls drawn at random, on a few contexts, bitmaps and regions: after each, every pixel is what the
// picture model says, and everything can be deleted in the end.
#include <array>
#include <cstddef>
#include <cstdint>
#include <random>

#include "fuzz/input.h"
#include "tests/support/drawing.h"

namespace {

using basalt::fuzz::Input;
using basalt::fuzz::require;
using namespace drawing;

constexpr int SIDE = 16;  // of the regions
const XFORM TRANSFORMS[] = {
    {1, 0, 0, 1, 0, 0},    turn_about(30, 12, 9),  turn_about(123.4, 5, 5),
    turn_about(90, 10, 8), {2, 0, 0, 2, -3, 1},    {-1, 0, 0, 1, 20, 0},
    {1, 0, 0, 1, 3, -4},   {0.25F, 0, 0, 4, 1, 1}, {1, 0.3F, -0.7F, 1.2F, 5.25F, -3.5F}};

// A few are wider than what copies take at a time.
Picture drawn_picture(Input& in) {
    std::minstd_rand random(1 + in.byte());
    const int kind = in.byte(), width = kind % 16 == 15 ? 520 : 1 + kind % 40, height = 1 + in.byte() % 20;
    return random_picture(width, height, DEPTHS[in.byte() % 6], random);
}

// A context with its bitmap, and the model of both.
struct Surface {
    Picture picture;
    Canvas canvas{picture};
    Settings settings = {};

    int depth() const { return picture.depth; }
    // Whether the transform is a shift by whole pixels, and the shift.
    bool is_shift() const { return settings.world.eM11 == 1 && settings.world.eM12 == 0; }
    int dx() const { return static_cast<int>(settings.world.eDx); }
    int dy() const { return static_cast<int>(settings.world.eDy); }
    RECT moved(const RECT& r) const { return {r.left + dx(), r.top + dy(), r.right + dx(), r.bottom + dy()}; }
};

struct World {
    Input& in;
    std::array<Surface, 3> surfaces{Surface{drawn_picture(in)}, Surface{drawn_picture(in)},
                                    Surface{drawn_picture(in)}};
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
        const std::size_t kind = in.byte();
        return kind % 2 == 0 ? in.word()
                             : colour_of(s.depth(), s.picture.pixels[kind % s.picture.pixels.size()]);
    }

    void pixel(Surface& s) {
        const int x = coordinate(), y = coordinate();
        const COLORREF drawn = colour(s);
        const bool is_there = s.is_shift() && s.picture.has(x + s.dx(), y + s.dy());
        std::uint32_t none = 0;
        std::uint32_t& stored = is_there ? s.picture.at(x + s.dx(), y + s.dy()) : none;
        require(GetPixel(s.canvas, x, y) == (is_there ? colour_of(s.depth(), stored) : CLR_INVALID));
        stored = value_of(s.depth(), drawn);
        require(SetPixel(s.canvas, x, y, drawn) == (is_there ? colour_of(s.depth(), stored) : CLR_INVALID));
    }

    void fills(Surface& s) {
        const RECT r = rectangle(), box = ordered(s.moved(r));
        const COLORREF drawn = colour(s);
        const CBrush brush(drawn);
        const std::uint32_t value = value_of(s.depth(), drawn);
        const bool is_rounded = in.byte() % 2 == 0;
        const int width = coordinate(), height = coordinate();
        HGDIOBJ const before = SelectObject(s.canvas, brush);
        require((is_rounded ? RoundRect(s.canvas, r.left, r.top, r.right, r.bottom, width, height)
                            : FillRect(s.canvas, &r, brush)) == (s.is_shift() ? 1 : 0));
        SelectObject(s.canvas, before);
        on(s.picture, is_rounded ? box : s.moved(r), [&](int x, int y, std::uint32_t& pixel) {
            const bool is_in = !is_rounded || is_in_rounded(box, std::abs(width), std::abs(height), x, y);
            pixel = is_in && s.is_shift() ? value : pixel;
        });
    }

    void gradients(Surface& s) {
        const auto corner = [&] {
            const auto channel = [&] { return static_cast<WORD>(in.byte() << 8 | in.byte()); };
            return TRIVERTEX{coordinate(), coordinate(), channel(), channel(), channel(), 0};
        };
        TRIVERTEX ends[2] = {corner(), corner()};
        const GRADIENT_RECT mesh = {0, 1};
        const bool across = in.byte() % 2 == 0;
        require(GradientFill(s.canvas, ends, 2, &mesh, 1, across ? 0 : 1) == (s.is_shift() ? 1 : 0));
        if (s.is_shift()) {
            ends[0].x += s.dx(), ends[0].y += s.dy(), ends[1].x += s.dx(), ends[1].y += s.dy();
            gradient(s.picture, ends[0], ends[1], across);
        }
    }

    void copies(Surface& to) {
        const Surface& from = surface();
        constexpr DWORD OPERATIONS[] = {SRCCOPY, NOTSRCCOPY, SRCAND, SRCPAINT, SRCINVERT};
        const RECT r = rectangle();
        const Stretch b = {r.left, r.top, r.right, r.bottom, coordinate(), coordinate()};
        const DWORD rop = OPERATIONS[in.byte() % 5];
        const XFORM& w = from.settings.world;
        require(BitBlt(to.canvas, b.x, b.y, b.width, b.height, from.canvas, b.source_x, b.source_y, rop) ==
                (w.eM12 == 0 && w.eM21 == 0));
        const Picture result = to.canvas.picture();
        // A source's own transform is left to the tests.
        if (w.eDx == 0 && w.eM11 == 1 && w.eM12 == 0) {
            require(result == copied(to.picture, b, from.picture, rop, to.settings, from.settings.background,
                                     &result, 1e-6));
        }
        to.picture = w.eM12 == 0 && w.eM21 == 0 ? result : to.picture;
    }

    void keyed_copies(Surface& to) {
        const Surface& from = surface();
        const RECT r = rectangle(), source = rectangle();
        const COLORREF key = colour(from);
        const bool is_drawn = r.right >= 0 && r.bottom >= 0 && source.right >= 0 && source.bottom >= 0 &&
                              to.is_shift() && from.is_shift();
        require(TransparentBlt(to.canvas, r.left, r.top, r.right, r.bottom, from.canvas, source.left,
                               source.top, source.right, source.bottom, key) == (is_drawn ? 1 : 0));
        if (is_drawn) {
            const RECT place = to.moved(r), part = from.moved(source);
            const Stretch s = {place.left, place.top, r.right,      r.bottom,
                               part.left,  part.top,  source.right, source.bottom};
            to.picture = keyed(to.picture, s, from.picture, key, to.settings, from.settings.background);
        }
    }

    // Rows in any depth and either order.
    void rows(Surface& s) {
        const int width = s.picture.width, height = s.picture.height, depth = DEPTHS[in.byte() % 6];
        const bool is_top_first = in.byte() % 2 == 0;
        Picture expected(width, height, depth);
        on(expected, {0, 0, width, height}, [&](int x, int y, std::uint32_t& value) {
            const std::uint32_t stored = s.picture.at(x, is_top_first ? y : height - 1 - y);
            value = depth == s.picture.depth ? stored : value_of(depth, colour_of(s.picture.depth, stored));
        });
        const Bytes all = packed(expected, 32);
        const auto size = static_cast<UINT>(all.size()) / static_cast<UINT>(height);
        const UINT first = in.byte() % 24U, count = in.byte() % 24U;
        const UINT there =
            first < static_cast<UINT>(height) ? std::min(count, static_cast<UINT>(height) - first) : 0;
        DibHeader dib(width, is_top_first ? -height : height, depth);
        Bytes bytes(std::max(there * size, 1U));
        require(GetDIBits(s.canvas, s.canvas.bitmap(), first, count, bytes.data(), dib.info(), 0) ==
                static_cast<int>(there));
        require(there == 0 || (std::equal(bytes.begin(), bytes.end(), all.begin() + first * size) &&
                               dib.header.biSizeImage == bytes.size()));
    }

    void settings(Surface& s) {
        s.settings = {in.word(), in.word(), TRANSFORMS[in.byte() % 9U]};
        SetTextColor(s.canvas, s.settings.text);
        SetBkColor(s.canvas, s.settings.background);
        SetGraphicsMode(s.canvas, GM_ADVANCED);
        require(SetWorldTransform(s.canvas, &s.settings.world) != 0);
    }

    void combine(Surface&) {
        for (int more = in.byte() % 8; more >= 0; --more) {
            const std::size_t a = in.byte() % 3, b = in.byte() % 3, into = in.byte() % 3;
            const int mode = in.byte() % 5;
            if (in.byte() % 2 == 0) {
                const RECT r = {in.byte() % SIDE, in.byte() % SIDE, in.byte() % SIDE, in.byte() % SIDE};
                require(regions[b].SetRectRgn(&r) != 0);
                sets[b] = Picture(SIDE, SIDE, 1);
                on(sets[b], ordered(r), [](int, int, std::uint32_t& value) { value = 1; });
            }
            require(EqualRgn(regions[a], regions[b]) == (sets[a] == sets[b]));
            require(regions[into].CombineRgn(&regions[a], &regions[b], RGN_AND + mode) != RGN_ERROR);
            for (std::size_t i = 0; i < sets[into].pixels.size(); ++i) {
                const std::uint32_t x = sets[a].pixels[i], y = sets[b].pixels[i];
                const std::uint32_t results[] = {x & y, x | y, x ^ y, x & ~y, x};
                sets[into].pixels[i] = results[mode];
            }
            require(holds(regions[into], sets[into]));
        }
    }

    void step(Surface& s) {
        constexpr void (World::*STEPS[])(Surface&) = {&World::pixel,  &World::fills,    &World::gradients,
                                                      &World::copies, &World::copies,   &World::keyed_copies,
                                                      &World::rows,   &World::settings, &World::combine};
        (this->*STEPS[in.byte() % 9])(s);
    }
};

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    Input input(data, size);
    World world(input);
    for (int steps = 0; !input.is_over() && steps < 200; ++steps) {
        Surface& s = world.surface();
        world.step(s);
        require(s.canvas.picture() == s.picture);
    }
    return 0;
}
