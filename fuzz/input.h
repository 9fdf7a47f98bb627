// A fuzzer's input, read piece by piece; beyond its end are zeros.
#ifndef BASALT_FUZZ_INPUT_H
#define BASALT_FUZZ_INPUT_H

#include <algorithm>
#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>

namespace basalt::fuzz {

// Aborts if a condition does not hold, and prints where the caller is.
inline void require(bool holds, const char* file = __builtin_FILE(), int line = __builtin_LINE()) {
    if (!holds) {
        std::fprintf(stderr, "%s:%d: failed\n", file, line);
        std::abort();
    }
}

class Input {
public:
    Input(const std::uint8_t* data, std::size_t size) : m_data(data), m_size(size) {}

    bool is_over() const { return m_size == 0; }
    std::size_t left() const { return m_size; }
    const std::uint8_t* data() const { return m_data; }

    std::uint8_t byte() { return m_size == 0 ? std::uint8_t{0} : (--m_size, *m_data++); }
    std::uint32_t word() { return number<std::uint32_t>(); }
    std::uint64_t double_word() { return number<std::uint64_t>(); }
    // Near 0 mostly, now and then anywhere.
    int coordinate() {
        const int first = byte();
        return first < 240 ? first - 100 : number<int>();
    }
    float factor() {
        const std::uint8_t first = byte();
        return first < 240 ? (static_cast<float>(first) - 100.0F) / 32.0F : number<float>();
    }

private:
    template <class Number>
    Number number() {
        std::uint8_t bytes[sizeof(Number)] = {};
        const std::size_t count = std::min(m_size, sizeof(Number));
        std::copy_n(m_data, count, bytes);
        m_data += count;
        m_size -= count;
        return std::bit_cast<Number>(bytes);
    }

    const std::uint8_t* m_data;
    std::size_t m_size;
};

}  // namespace basalt::fuzz

#endif
