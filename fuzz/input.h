// A fuzzer's input, taken piece by piece; behind its end there are zeros.
#ifndef BASALT_FUZZ_INPUT_H
#define BASALT_FUZZ_INPUT_H

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>

namespace basalt::fuzz {

// Ends the program where it does not hold; says whose call it was.
inline void require(bool holds, const char* file = __builtin_FILE(), int line = __builtin_LINE()) {
    if (!holds) {
        std::fprintf(stderr, "%s:%d: not so\n", file, line);
        std::abort();
    }
}

class Input {
public:
    Input(const std::uint8_t* data, std::size_t size) : m_data(data), m_size(size) {}

    bool is_over() const { return m_size == 0; }
    std::size_t left() const { return m_size; }
    const std::uint8_t* data() const { return m_data; }

    std::uint8_t byte() {
        if (m_size == 0) {
            return 0;
        }
        --m_size;
        return *m_data++;
    }
    std::uint32_t word() {
        const std::uint32_t low = byte();
        const std::uint32_t middle = byte();
        const std::uint32_t high = byte();
        return low | middle << 8 | high << 16 | std::uint32_t{byte()} << 24;
    }
    std::uint64_t double_word() {
        const std::uint64_t low = word();
        return low | std::uint64_t{word()} << 32;
    }
    // Near 0 mostly, now and then anywhere.
    int coordinate() {
        const int first = byte();
        if (first < 240) {
            return first - 100;
        }
        return static_cast<int>(word());
    }
    float factor() {
        const std::uint8_t first = byte();
        if (first < 240) {
            return (static_cast<float>(first) - 100.0F) / 32.0F;
        }
        const std::uint32_t bits = word();
        float value = 0;
        std::memcpy(&value, &bits, sizeof value);
        return value;
    }

private:
    const std::uint8_t* m_data;
    std::size_t m_size;
};

}  // namespace basalt::fuzz

#endif
