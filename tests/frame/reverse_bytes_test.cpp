#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

#include "basalt/frame.h"

namespace {

// Every count around the widths of the words, at every alignment, and nothing outside the range.
TEST(ReverseBytes, agrees_with_the_byte_loop) {
    constexpr std::size_t MARGIN = 8;
    _reversebytes(nullptr, 0);
    for (std::uint32_t count = 0; count <= 100; ++count) {
        for (std::size_t offset = 0; offset < 8; ++offset) {
            std::vector<unsigned char> bytes(count + offset + MARGIN);
            for (std::size_t i = 0; i < bytes.size(); ++i) {
                bytes[i] = static_cast<unsigned char>(i * 37 + 11);
            }
            std::vector<unsigned char> expected = bytes;
            const auto begin = expected.begin() + static_cast<std::ptrdiff_t>(offset);
            std::reverse(begin, begin + count);
            _reversebytes(bytes.data() + offset, count);
            ASSERT_EQ(bytes, expected) << count << " bytes at " << offset;
        }
    }
}

}  // namespace
