#include "src/platform/pixels/bands.h"

#include <algorithm>
#include <cstring>
#include <limits>
#include <span>
#include <utility>

#include "src/platform/raster_extras.h"

namespace basalt::platform {

namespace {

using Runs = std::span<const RECT>;

constexpr std::int64_t NOWHERE = std::numeric_limits<std::int64_t>::max();

// Walks down a set's bands.
class BandWalk {
public:
    explicit BandWalk(const Bands& bands) : m_rest(bands.rectangles()) { advance(); }

    bool is_over() const { return m_band.empty(); }
    bool has(std::int64_t y) const { return !is_over() && m_band[0].top <= y; }
    // The first row below y in which the runs change.
    std::int64_t next_change(std::int64_t y) const {
        return is_over() ? NOWHERE : has(y) ? m_band[0].bottom : m_band[0].top;
    }
    Runs runs(std::int64_t y) const { return has(y) ? m_band : Runs(); }
    // Leaves the band that ends at y.
    void pass(std::int64_t y) {
        if (has(y) && m_band[0].bottom == y) {
            advance();
        }
    }

private:
    void advance() {
        std::size_t count = 0;
        while (count < m_rest.size() && m_rest[count].top == m_rest[0].top) {
            ++count;
        }
        m_band = m_rest.first(count);
        m_rest = m_rest.subspan(count);
    }

    Runs m_rest;
    Runs m_band;
};

// The left and right ends of runs, in order.
class EdgeWalk {
public:
    explicit EdgeWalk(Runs runs) : m_runs(runs) {}
    std::int64_t next() const {
        if (m_at / 2 == m_runs.size()) {
            return NOWHERE;
        }
        return m_at % 2 == 0 ? m_runs[m_at / 2].left : m_runs[m_at / 2].right;
    }
    // Passes an edge at x; whether there was one.
    bool pass(std::int64_t x) {
        const bool is_here = next() == x;
        m_at += is_here ? 1 : 0;
        return is_here;
    }

private:
    Runs m_runs;
    std::size_t m_at = 0;
};

void add_runs(Runs a, Runs b, unsigned keep, BandBuilder& result) {
    if (a.empty() || b.empty()) {
        if ((keep >> (b.empty() ? 2 : 1) & 1) != 0) {
            for (const RECT& run : b.empty() ? a : b) {
                result.add(run.left, run.right);
            }
        }
        return;
    }
    EdgeWalk a_edges(a);
    EdgeWalk b_edges(b);
    unsigned inside = 0;  // as a bit number of `keep`
    LONG left = 0;
    for (;;) {
        const std::int64_t x = std::min(a_edges.next(), b_edges.next());
        if (x == NOWHERE) {
            return;
        }
        const bool was_kept = (keep >> inside & 1) != 0;
        inside ^= (a_edges.pass(x) ? 2U : 0U) | (b_edges.pass(x) ? 1U : 0U);
        if (was_kept == ((keep >> inside & 1) != 0)) {
            continue;
        }
        if (was_kept) {
            result.add(left, static_cast<LONG>(x));
        } else {
            left = static_cast<LONG>(x);
        }
    }
}

}  // namespace

void BandBuilder::end() {
    const std::size_t count = m_rectangles.size() - m_first;
    if (count == 0) {
        return;
    }
    const auto above = m_rectangles.begin() + static_cast<std::ptrdiff_t>(m_above);
    const auto first = m_rectangles.begin() + static_cast<std::ptrdiff_t>(m_first);
    if (m_first - m_above == count && above->bottom == m_top &&
        std::equal(above, first, first,
                   [](const RECT& a, const RECT& b) { return a.left == b.left && a.right == b.right; })) {
        std::for_each(above, first, [this](RECT& run) { run.bottom = m_bottom; });
        m_rectangles.erase(first, m_rectangles.end());
    } else {
        m_above = m_first;
    }
}

Bands::Bands(std::vector<RECT> rectangles) : m_rectangles(std::move(rectangles)) {
    if (!m_rectangles.empty()) {
        m_box = {m_rectangles[0].left, m_rectangles[0].top, m_rectangles[0].right,
                 m_rectangles.back().bottom};
        for (const RECT& r : m_rectangles) {
            m_box.left = std::min(m_box.left, r.left);
            m_box.right = std::max(m_box.right, r.right);
        }
    }
}

bool Bands::contains(LONG x, LONG y) const {
    const auto is_before = [x, y](const RECT& r) { return r.bottom <= y || (r.top <= y && r.right <= x); };
    const auto found = std::partition_point(m_rectangles.begin(), m_rectangles.end(), is_before);
    return found != m_rectangles.end() && found->top <= y && found->left <= x;
}

bool Bands::operator==(const Bands& other) const {
    return std::equal(m_rectangles.begin(), m_rectangles.end(), other.m_rectangles.begin(),
                      other.m_rectangles.end(),
                      [](const RECT& a, const RECT& b) { return std::memcmp(&a, &b, sizeof a) == 0; });
}

bool Bands::shift(LONG x, LONG y) {
    const auto move = [x, y](RECT& r) {
        return !__builtin_add_overflow(r.left, x, &r.left) && !__builtin_add_overflow(r.right, x, &r.right) &&
               !__builtin_add_overflow(r.top, y, &r.top) && !__builtin_add_overflow(r.bottom, y, &r.bottom);
    };
    RECT box = m_box;
    if (m_rectangles.empty() || !move(box)) {
        return m_rectangles.empty();
    }
    m_box = box;
    std::for_each(m_rectangles.begin(), m_rectangles.end(), move);
    return true;
}

Bands combined(const Bands& a, const Bands& b, Keep keep) {
    BandBuilder result;
    BandWalk a_bands(a);
    BandWalk b_bands(b);
    std::int64_t y = std::min(a.box().top, b.box().top);
    while (!a_bands.is_over() || !b_bands.is_over()) {
        const std::int64_t next = std::min(a_bands.next_change(y), b_bands.next_change(y));
        result.begin(static_cast<LONG>(y), static_cast<LONG>(next));
        add_runs(a_bands.runs(y), b_bands.runs(y), static_cast<unsigned>(keep), result);
        result.end();
        a_bands.pass(next);
        b_bands.pass(next);
        y = next;
    }
    return Bands(result.take());
}

}  // namespace basalt::platform
