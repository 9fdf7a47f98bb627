#include "src/platform/heap/free_lists.h"

#include <algorithm>

namespace basalt::platform {

Block* FreeLists::find_among_equals(std::size_t size, std::size_t attempts) const {
    const Place place = place_of(size);
    if (place.level >= LEVELS) {
        return nullptr;
    }
    for (Block* block = first(place); block != nullptr && attempts != 0; block = next_of(block), --attempts) {
        if (size_of(head_of(block)) >= size) {
            return block;
        }
    }
    return nullptr;
}

std::size_t FreeLists::largest() const {
    if (m_levels == 0) {
        return 0;
    }
    const unsigned level = static_cast<unsigned>(std::bit_width(m_levels)) - 1;
    const unsigned list = static_cast<unsigned>(std::bit_width(unsigned{m_lists[level]})) - 1;
    std::size_t size = 0;
    for (Block* block = first({level, list}); block != nullptr; block = next_of(block)) {
        size = std::max(size, size_of(head_of(block)));
    }
    return size;
}

bool FreeLists::bitmaps_agree() const {
    for (unsigned level = 0; level < LEVELS; ++level) {
        for (unsigned list = 0; list < LISTS; ++list) {
            if (((m_lists[level] >> list) & 1U) != (first({level, list}) != nullptr)) {
                return false;
            }
        }
        if (((m_levels >> level) & 1U) != (m_lists[level] != 0)) {
            return false;
        }
    }
    return true;
}

}  // namespace basalt::platform
