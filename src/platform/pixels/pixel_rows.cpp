#include "src/platform/pixels/pixel_rows.h"

#include <algorithm>
#include <cstring>

namespace basalt::platform {

namespace {

std::size_t at(int x) {
    return static_cast<std::size_t>(x);
}

// Pixels of less than a byte.
template <int DEPTH>
struct Packed {
    static constexpr int PER_BYTE = 8 / DEPTH;
    static constexpr unsigned MASK = (1U << DEPTH) - 1;

    static unsigned shift(int x) { return static_cast<unsigned>((PER_BYTE - 1 - x % PER_BYTE) * DEPTH); }
    static std::uint32_t read(const std::byte* row, int x) {
        return std::to_integer<std::uint32_t>(row[at(x / PER_BYTE)] >> shift(x)) & MASK;
    }
    static void write(std::byte* row, int x, std::uint32_t value) {
        std::byte& byte = row[at(x / PER_BYTE)];
        byte = (byte & ~(std::byte{MASK} << shift(x))) | (static_cast<std::byte>(value & MASK) << shift(x));
    }
    static void fill(std::byte* row, int x, int count, std::uint32_t value) {
        for (; count > 0 && x % PER_BYTE != 0; ++x, --count) {
            write(row, x, value);
        }
        const unsigned repeated = (value & MASK) * (0xFFU / MASK);
        std::memset(row + at(x / PER_BYTE), static_cast<int>(repeated), at(count / PER_BYTE));
        x += count / PER_BYTE * PER_BYTE;
        for (count %= PER_BYTE; count > 0; ++x, --count) {
            write(row, x, value);
        }
    }
};

// Pixels of 1 to 4 whole bytes.
template <int BYTES>
struct Whole {
    static std::uint32_t read(const std::byte* row, int x) {
        std::uint32_t value = 0;
        std::memcpy(&value, row + at(x) * BYTES, BYTES);
        return value;
    }
    static void write(std::byte* row, int x, std::uint32_t value) {
        std::memcpy(row + at(x) * BYTES, &value, BYTES);
    }
    static void fill(std::byte* row, int x, int count, std::uint32_t value) {
        for (int i = 0; i < count; ++i) {
            write(row, x + i, value);
        }
    }
};

// Calls work with the form for a depth.
template <typename Work>
auto with_form(int depth, const Work& work) {
    switch (depth) {
        case 1:
            return work(Packed<1>());
        case 4:
            return work(Packed<4>());
        case 8:
            return work(Whole<1>());
        case 16:
            return work(Whole<2>());
        case 24:
            return work(Whole<3>());
        default:
            return work(Whole<4>());
    }
}

}  // namespace

std::uint32_t read_pixel(int depth, const std::byte* row, int x) {
    return with_form(depth, [=](auto form) { return form.read(row, x); });
}

void read_pixels(int depth, const std::byte* row, int x, std::span<std::uint32_t> values) {
    with_form(depth, [&](auto form) {
        int column = x;
        for (std::uint32_t& value : values) {
            value = form.read(row, column++);
        }
    });
}

void write_pixels(int depth, std::byte* row, int x, std::span<const std::uint32_t> values) {
    with_form(depth, [&](auto form) {
        int column = x;
        for (const std::uint32_t value : values) {
            form.write(row, column++, value);
        }
    });
}

void fill_pixels(int depth, std::byte* row, int x, int count, std::uint32_t value) {
    if (depth == 32) {
        std::fill_n(reinterpret_cast<std::uint32_t*>(row) + x, count, value);
        return;
    }
    with_form(depth, [=](auto form) { form.fill(row, x, count, value); });
}

void copy_pixels(int depth, std::byte* to, int to_x, const std::byte* from, int from_x, int count) {
    if (depth >= 8) {
        const std::size_t bytes = at(depth / 8);
        std::memmove(to + at(to_x) * bytes, from + at(from_x) * bytes, at(count) * bytes);
        return;
    }
    in_pieces(count, to == from && to_x > from_x, [&](int offset, int size) {
        std::uint32_t values[PIECE];
        const std::span<std::uint32_t> piece(values, at(size));
        read_pixels(depth, from, from_x + offset, piece);
        write_pixels(depth, to, to_x + offset, piece);
    });
}

}  // namespace basalt::platform
