// The block allocator's rules written down as lists, to hold the real one against.
#ifndef BASALT_TESTS_MEMORY_PLAIN_BLOCK_ALLOCATOR_H
#define BASALT_TESTS_MEMORY_PLAIN_BLOCK_ALLOCATOR_H

#include <algorithm>
#include <cstdint>
#include <optional>
#include <vector>

namespace basalt::test {

// Hands out the number of a segment and an offset in it. Lists are vectors with their head at the back.
class PlainBlockAllocator {
public:
    struct Place {
        std::size_t segment;
        std::uint64_t offset;
        friend bool operator==(const Place&, const Place&) = default;
    };

    PlainBlockAllocator(std::uint64_t segment_size, std::uint64_t block_size)
        : m_segment_size(segment_size), m_block_size(block_size) {}

    Place alloc() {
        if (m_partial.empty()) {
            if (!m_empty.empty()) {
                m_partial.push_back(m_empty.back());
                m_empty.pop_back();
            } else {
                m_partial.push_back(m_segments.size());
                m_segments.emplace_back();
            }
        }
        const std::size_t number = m_partial.back();
        Segment& segment = m_segments[number];
        std::uint64_t entry;
        if (!segment.free.empty()) {
            entry = segment.free.back();
            segment.free.pop_back();
        } else {
            entry = segment.next_offset;
            segment.next_offset += m_block_size;
        }
        segment.used.push_back(entry);
        if (segment.free.empty() && segment.next_offset + m_block_size > m_segment_size) {
            m_partial.pop_back();
            m_full.push_back(number);
        }
        return {number, entry};
    }

    // Whether there was such a block.
    bool free(Place place) {
        const bool is_partial = unlinked_or_there(m_partial, place.segment, false);
        const bool is_full = unlinked_or_there(m_full, place.segment, false);
        if (!is_partial && !is_full) {
            return false;
        }
        Segment& segment = m_segments[place.segment];
        if (!unlinked_or_there(segment.used, place.offset, true)) {
            return false;
        }
        segment.free.push_back(place.offset);
        if (is_partial && segment.used.empty()) {
            unlinked_or_there(m_partial, place.segment, true);
            m_empty.push_back(place.segment);
        } else if (is_full) {
            unlinked_or_there(m_full, place.segment, true);
            m_partial.push_back(place.segment);
        }
        return true;
    }

    std::size_t segments() const { return m_segments.size(); }

private:
    struct Segment {
        std::vector<std::uint64_t> used, free;
        std::uint64_t next_offset = 0;
    };

    // Whether a list holds a value, which is taken out if so asked.
    template <class Value>
    static bool unlinked_or_there(std::vector<Value>& list, Value value, bool unlink) {
        const auto found = std::find(list.rbegin(), list.rend(), value);
        if (found == list.rend()) {
            return false;
        }
        if (unlink) {
            list.erase(std::next(found).base());
        }
        return true;
    }

    std::uint64_t m_segment_size, m_block_size;
    std::vector<Segment> m_segments;
    std::vector<std::size_t> m_empty, m_partial, m_full;
};

}  // namespace basalt::test

#endif
