// The block allocator's addresses against its rules written down as lists.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <map>
#include <random>
#include <set>
#include <string>
#include <vector>

#include "basalt/memory.h"
#include "tests/support/scratch_folder.h"

namespace {

using basalt::test::ScratchFolder;
using vex_lib::vlVmAllocator;

// Hands out the number of a segment and an offset in it. Lists are vectors with their head at the back.
class PlainBlockAllocator {
public:
    struct Place {
        std::size_t segment;
        std::uint64_t offset;
    };

    PlainBlockAllocator(std::uint64_t segment_size, std::uint64_t block_size)
        : m_segment_size(segment_size), m_block_size(block_size) {}

    Place alloc() {
        if (m_partial.empty() && !m_empty.empty()) {
            m_partial.push_back(m_empty.back());
            m_empty.pop_back();
        } else if (m_partial.empty()) {
            m_partial.push_back(m_segments.size());
            m_segments.emplace_back();
        }
        const std::size_t number = m_partial.back();
        Segment& segment = m_segments[number];
        std::uint64_t entry = segment.next_offset;
        if (!segment.free.empty()) {
            entry = segment.free.back();
            segment.free.pop_back();
        } else {
            segment.next_offset += m_block_size;
        }
        segment.used.insert(entry);
        if (segment.free.empty() && segment.next_offset + m_block_size > m_segment_size) {
            m_partial.pop_back();
            m_full.push_back(number);
        }
        return {number, entry};
    }

    // Whether there was such a block.
    bool free(Place place) {
        const bool is_full = std::count(m_full.begin(), m_full.end(), place.segment) != 0;
        if (!is_full && std::count(m_partial.begin(), m_partial.end(), place.segment) == 0) {
            return false;
        }
        Segment& segment = m_segments[place.segment];
        if (segment.used.erase(place.offset) == 0) {
            return false;
        }
        segment.free.push_back(place.offset);
        if (is_full) {
            std::erase(m_full, place.segment);
            m_partial.push_back(place.segment);
        } else if (segment.used.empty()) {
            std::erase(m_partial, place.segment);
            m_empty.push_back(place.segment);
        }
        return true;
    }

private:
    struct Segment {
        std::set<std::uint64_t> used;
        std::vector<std::uint64_t> free;
        std::uint64_t next_offset = 0;
    };

    std::uint64_t m_segment_size, m_block_size;
    std::vector<Segment> m_segments;
    std::vector<std::size_t> m_empty, m_partial, m_full;
};

constexpr std::uintptr_t PAGE = 4096;

std::uintptr_t number_of(const void* address) {
    return reinterpret_cast<std::uintptr_t>(address);
}

// Drives an allocator and the plain rules alike, and compares every address.
class Pair {
public:
    Pair(unsigned long segment_size, unsigned long block_size)
        : m_segment_size(segment_size),
          m_block_size(block_size),
          m_allocator(segment_size, block_size),
          m_plain(segment_size, block_size) {}

    void alloc() {
        auto* const block = static_cast<char*>(m_allocator.Alloc(m_block_size));
        ASSERT_NE(block, nullptr);
        const PlainBlockAllocator::Place place = m_plain.alloc();
        if (place.segment == m_bases.size()) {
            ASSERT_EQ(place.offset, 0U);
            ASSERT_EQ(number_of(block) % PAGE, 0U);
            m_bases.push_back(block);
            const bool is_new = m_segments.emplace(number_of(block), place.segment).second;
            ASSERT_TRUE(is_new);
        }
        ASSERT_EQ(block, m_bases[place.segment] + place.offset);
        // Over the whole block, so that any overlap, with bookkeeping too, shows when it is freed.
        std::memset(block, stamp_of(block), m_block_size);
        m_live.push_back(block);
    }

    void free_live(std::size_t index) {
        char* const block = m_live[index];
        for (std::size_t i = 0; i < m_block_size; ++i) {
            ASSERT_EQ(static_cast<unsigned char>(block[i]), stamp_of(block));
        }
        ASSERT_TRUE(free_at(block));
        m_live.erase(m_live.begin() + static_cast<std::ptrdiff_t>(index));
        m_freed = block;
    }

    // What is no block in use, as a rule: in no view, just outside of one (where another may begin), inside a
    // block, freed already.
    void free_nonsense(std::size_t choice) {
        char* const base = m_bases[choice / 8 % m_bases.size()];
        char* const addresses[] = {nullptr,
                                   reinterpret_cast<char*>(&choice),
                                   base - 1,
                                   base + m_segment_size,
                                   base + choice / 64 % m_segment_size,
                                   m_freed,
                                   m_freed,
                                   m_freed};
        char* const address = addresses[choice % 8];
        if (free_at(address)) {
            std::erase(m_live, address);
        }
    }

    std::size_t live() const { return m_live.size(); }
    std::size_t segments() const { return m_bases.size(); }

private:
    static unsigned char stamp_of(const char* block) {
        return static_cast<unsigned char>(number_of(block) * 31 >> 3);
    }

    // Whether it was a block in use, going by the rules.
    bool free_at(char* address) {
        m_allocator.Free(address);
        const auto after = m_segments.upper_bound(number_of(address));
        if (after == m_segments.begin()) {
            return false;
        }
        const auto& [base, segment] = *std::prev(after);
        return m_plain.free({segment, number_of(address) - base});
    }

    unsigned long m_segment_size, m_block_size;
    vlVmAllocator m_allocator;
    PlainBlockAllocator m_plain;
    std::vector<char*> m_bases;
    std::map<std::uintptr_t, std::size_t> m_segments;  // by base
    std::vector<char*> m_live;
    char* m_freed = nullptr;
};

struct Sizes {
    unsigned long segment, block;
    std::size_t most_live;
    int steps;
};

class VmAllocatorOrder : public testing::TestWithParam<Sizes> {};

TEST_P(VmAllocatorOrder, is_that_of_the_lists) {
    const Sizes& sizes = GetParam();
    const ScratchFolder folder;
    const unsigned seed = std::random_device()();
    SCOPED_TRACE(testing::Message() << "seed " << seed);
    std::mt19937 random(seed);
    Pair pair(sizes.segment, sizes.block);
    bool grows = true;
    for (int step = 0; step < sizes.steps && !testing::Test::HasFatalFailure(); ++step) {
        if (pair.live() == 0 || pair.live() >= sizes.most_live) {
            grows = pair.live() == 0;
        }
        const std::size_t draw = random();
        if (draw % 50 == 0 && pair.segments() != 0) {
            pair.free_nonsense(random());
        } else if ((draw % 4 != 0) == grows) {
            pair.alloc();
        } else if (pair.live() != 0) {
            const std::size_t newest = pair.live() - 1;
            const std::size_t choices[] = {0, newest, newest, random() % pair.live()};
            pair.free_live(choices[random() % 4]);
        }
    }
}

INSTANTIATE_TEST_SUITE_P(Sizes, VmAllocatorOrder,
                         testing::Values(Sizes{100, 30, 200, 20'000},          // does not divide
                                         Sizes{4096, 4096, 60, 5'000},         // one block a file
                                         Sizes{8191, 4096, 40, 5'000},         // the same, with a rest
                                         Sizes{1, 1, 40, 5'000},               // the smallest
                                         Sizes{3 * 4096, 4096, 100, 20'000},   // several
                                         Sizes{33 * 100, 100, 400, 40'000},    // a second word of bits
                                         Sizes{1 << 20, 65537, 100, 2'000},    // blocks beyond a page
                                         Sizes{70'000, 4, 40'000, 120'000}));  // a second chunk of state

}  // namespace
