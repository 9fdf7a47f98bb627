#include "basalt/memory/buffer.h"

#include <cstdlib>
#include <exception>
#include <limits>
#include <vector>

namespace vex_lib {
namespace {

constexpr std::uint64_t LARGEST_BUFFER = std::numeric_limits<std::uint32_t>::max();

}  // namespace

vlVmBuffer::vlVmBuffer(unsigned long initialSize, unsigned long reserve, unsigned long step)
    : m_step(static_cast<std::uint32_t>(step)),
      m_reserve(static_cast<std::uint32_t>(reserve)),
      m_step_fits(step <= LARGEST_BUFFER) {
    Alloc(0, initialSize);
}

vlVmBuffer::~vlVmBuffer() {
    Free(m_data);
}

// Rounds a size to grow to up by the step; false when the result exceeds 32 bits.
bool vlVmBuffer::round_up(std::uint64_t& size) const {
    if (!m_step_fits || size > LARGEST_BUFFER) {
        return false;
    }
    if (m_step != 0) {
        size = (size / m_step + 1) * m_step;
    }
    return size <= LARGEST_BUFFER;
}

void* vlVmBuffer::Alloc(std::uint64_t, std::uint64_t size) {
    // malloc(0) may return a block; an empty buffer has none.
    if (!round_up(size) || size == 0) {
        return nullptr;
    }
    m_data = std::malloc(size);
    if (m_data != nullptr) {
        m_size = static_cast<std::uint32_t>(size);
    }
    return m_data;
}

void vlVmBuffer::Free(void*) {
    std::free(m_data);
    m_data = nullptr;
    m_size = 0;
}

void* vlVmBuffer::ReSize(std::uint64_t newSize) {
    if (newSize > m_size && !round_up(newSize)) {
        return nullptr;
    }
    if (newSize == m_size) {
        return m_data;
    }
    if (newSize == 0) {
        Free(m_data);
        return nullptr;
    }
    void* const block = std::realloc(m_data, newSize);
    if (block != nullptr) {
        m_data = block;
        m_size = static_cast<std::uint32_t>(newSize);
    }
    return block;
}

void* vlVmBuffer::GetData() const {
    return m_data;
}

void vlVmBuffer::Test() {
    struct Record {
        double a, b, c, d, e, f;
    };
    try {
        std::vector<Record> kept;
        for (int pass = 0; pass < 5; ++pass) {
            std::vector<Record> grown;
            for (int i = 0; i < 10'000; ++i) {
                // NOLINTNEXTLINE(performance-inefficient-vector-operation): growth is the subject
                grown.push_back({1.0, 2.0, 3.0, 1.1, 2.1, 3.1});
            }
            kept = grown;
        }
    } catch (const std::exception&) {
        // Out of memory: the exercise ends early.
    }
}

}  // namespace vex_lib
