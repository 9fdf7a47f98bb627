// Heaps and the block allocator against plain models: what a block holds stays until it is freed, no two
// overlap, and what is no block is refused. Each model takes its steps from an input, for the fuzzer, and
// with failing calls for the fault walk.
#ifndef BASALT_TESTS_SUPPORT_MEMORY_MODEL_H
#define BASALT_TESTS_SUPPORT_MEMORY_MODEL_H

#include <algorithm>
#include <cstdint>
#include <functional>
#include <utility>
#include <vector>

#include "basalt/memory.h"
#include "basalt/platform/error.h"
#include "fuzz/input.h"
#include "src/platform/heap.h"
#include "tests/support/failing_new.h"
#include "tests/support/heap_inspection.h"

namespace basalt::test {

using fuzz::Input;
using fuzz::require;
using MayFail = std::function<bool()>;  // whether a call of the library was made to fail

// A call of the library: only these are made to fail, not the model's own.
template <class Call>
auto in_library(Call call) {
    const bool were_paused = std::exchange(failures_are_paused, false);
    auto result = call();
    failures_are_paused = were_paused;
    return result;
}

// A block with a pattern of its own at both ends.
class Marked {
public:
    Marked(void* block, std::size_t size) { move(block, size); }
    // The first `kept` bytes at most.
    void check(std::size_t kept = SIZE_MAX) const {
        for_ends([this, kept](std::size_t i) { require(i >= kept || m_block[i] == byte(i)); });
    }
    void move(void* block, std::size_t size) {
        m_block = static_cast<unsigned char*>(block);
        check(size);
        m_size = size, m_seed = ++s_seeds;
        for_ends([this](std::size_t i) { m_block[i] = byte(i); });
    }
    unsigned char* block() const { return m_block; }

private:
    template <class Work>
    void for_ends(Work work) const {
        for (std::size_t i = 0; i < std::min(std::size_t{64}, m_size); ++i) {
            work(i), work(m_size - 1 - i);
        }
    }
    unsigned char byte(std::size_t i) const { return static_cast<unsigned char>(m_seed * 7 + i); }

    unsigned char* m_block = nullptr;
    std::size_t m_size = 0;
    unsigned m_seed = 0;
    static inline unsigned s_seeds = 0;
};

// Small mostly, now and then more than regions share.
inline std::size_t any_size(Input& input) {
    const std::size_t size = input.byte();
    const unsigned shift = input.byte() % 16;
    return size << (shift < 14 ? shift % 8 : shift);
}

// Steps while there is input, then a check of the whole state.
template <class Model>
void drive(
    Model&& model, Input& input, int steps, const MayFail& may_fail = [] { return false; }) {
    for (int i = 0; i < steps && !input.is_over(); ++i) {
        model.step(input, may_fail);
    }
    model.inspect();
}

class HeapModel {
public:
    explicit HeapModel(unsigned long limit) : m_limit(limit) {}
    ~HeapModel() {
        std::ranges::for_each(m_blocks, [](const Marked& block) { block.check(); });
        HeapDestroy(m_heap);
    }
    HeapModel(const HeapModel&) = delete;
    HeapModel& operator=(const HeapModel&) = delete;

    void step(Input& input, const MayFail& may_fail) {
        if (m_heap == nullptr) {
            m_heap = in_library([&] { return HeapCreate(0, 0, m_limit); });
            require(m_heap != nullptr || may_fail());
            return;
        }
        const unsigned choice = m_blocks.empty() ? 15 : input.byte() % 16;
        Marked* const any = m_blocks.empty() ? nullptr : &m_blocks[input.byte() % m_blocks.size()];
        if (choice == 0) {
            in_library([&] { return HeapCompact(m_heap, 0); });
        } else if (choice == 1) {  // inside a block, and nowhere near one
            require(HeapFree(m_heap, 0, any->block() + 16) == 0 && HeapFree(m_heap, 0, this) == 0);
        } else if (choice < 6) {
            any->check();
            if (in_library([&] { return HeapFree(m_heap, 0, any->block()); }) == 0) {
                return any->check(), require(may_fail());  // it could not be unmapped
            }
            require(input.byte() % 8 != 0 || HeapFree(m_heap, 0, any->block()) == 0);
            std::swap(*any, m_blocks.back());
            m_blocks.pop_back();
        } else {
            const std::size_t size = any_size(input);
            Marked* const moved = choice < 9 ? any : nullptr;
            void* const block = in_library([&] {
                return moved ? HeapReAlloc(m_heap, 0, moved->block(), size) : HeapAlloc(m_heap, 0, size);
            });
            require(reinterpret_cast<std::uintptr_t>(block) % 16 == 0);
            require(block != nullptr || may_fail() || m_limit != 0);
            if (moved != nullptr) {
                block != nullptr ? moved->move(block, size) : moved->check();
            } else if (block != nullptr) {
                m_blocks.emplace_back(block, size);
            }
        }
    }
    void inspect() const {
        if (m_heap != nullptr) {
            const platform::HeapReport report = platform::inspect_heap(m_heap);
            require(report.fault == nullptr && report.live_blocks == m_blocks.size());
        }
    }

private:
    unsigned long m_limit;
    HANDLE m_heap = nullptr;
    std::vector<Marked> m_blocks;
};

// The addresses too: the allocator's lists of segments and blocks, written down as vectors, newest at the
// back.
class BlockModel {
public:
    BlockModel(unsigned long segment_size, unsigned long block_size)
        : m_segment_size(segment_size), m_size(block_size), m_allocator(segment_size, block_size) {}

    void step(Input& input, const MayFail& may_fail) {
        const unsigned choice = input.byte();
        if (choice < 16 && !m_segments.empty()) {
            free_other(m_segments[input.byte() % m_segments.size()].base +
                       input.byte() % (m_segment_size + 2) - 1);
        } else if (choice < 110 && !m_live.empty()) {
            std::swap(m_live[choice % m_live.size()], m_live.back());
            m_live.back().check();
            free(m_live.back().block());
        } else {
            alloc(may_fail);
        }
    }
    void inspect() const {
        std::ranges::for_each(m_live, [](const Marked& block) { block.check(); });
    }

private:
    struct Segment {
        unsigned char* base;
        std::vector<unsigned char*> free = {};
        int used = 0;
        unsigned long next = 0;  // offset of the first block never allocated
    };

    void alloc(const MayFail& may_fail) {
        void* const taken = in_library([&] { return m_allocator.Alloc(m_size); });
        auto* const block = static_cast<unsigned char*>(taken);
        if (block == nullptr) {
            return require(may_fail());
        }
        if (m_partial.empty() && m_empty.empty()) {
            m_empty.push_back(m_segments.size());
            m_segments.push_back({block});
            require(reinterpret_cast<std::uintptr_t>(block) % 4096 == 0);
        }
        if (m_partial.empty()) {
            m_partial.push_back(m_empty.back());
            m_empty.pop_back();
        }
        Segment& segment = m_segments[m_partial.back()];
        ++segment.used;
        if (!segment.free.empty()) {
            require(block == segment.free.back());
            segment.free.pop_back();
        } else {
            require(block == segment.base + std::exchange(segment.next, segment.next + m_size));
            require(std::all_of(block, block + m_size, [](unsigned char byte) { return byte == 0; }));
        }
        if (segment.free.empty() && segment.next + m_size > m_segment_size) {
            m_partial.pop_back();
        }
        m_live.emplace_back(block, m_size);
    }
    void free(unsigned char* block) {
        m_allocator.Free(block);
        std::erase_if(m_live, [=](const Marked& one) { return one.block() == block; });
        std::size_t number = 0;
        while (block < m_segments[number].base || block >= m_segments[number].base + m_segment_size) {
            ++number;
        }
        m_segments[number].free.push_back(block);
        const bool falls_empty = --m_segments[number].used == 0;
        if (std::ranges::count(m_partial, number) == 0) {
            m_partial.push_back(number);
        } else if (falls_empty) {
            std::erase(m_partial, number);
            m_empty.push_back(number);
        }
    }
    // An address in or just outside a view; ignored unless a live block begins there.
    void free_other(unsigned char* address) {
        const auto is_it = [=](const Marked& one) { return one.block() == address; };
        std::ranges::any_of(m_live, is_it) ? free(address) : m_allocator.Free(address);
        m_allocator.Free(nullptr);
        require(m_allocator.Alloc(m_size + 1) == nullptr);
    }

    unsigned long m_segment_size, m_size;
    vex_lib::vlVmAllocator m_allocator;
    std::vector<Segment> m_segments;
    std::vector<std::size_t> m_empty, m_partial;  // a segment in neither is full
    std::vector<Marked> m_live;
};

}  // namespace basalt::test

#endif
