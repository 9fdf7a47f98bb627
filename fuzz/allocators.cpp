// Memory: sequences of calls on heaps, the block allocator, the buffer, mapped blocks and page sources. What
// a block holds stays until it is freed, no two overlap, and what is no block is refused.
#include <algorithm>
#include <cstdint>
#include <cstring>
#include <memory>
#include <string_view>
#include <vector>

#include "basalt/memory.h"
#include "basalt/platform/error.h"
#include "fuzz/input.h"
#include "tests/support/heap_inspection.h"

namespace {

using basalt::fuzz::Input;
using basalt::fuzz::require;
using namespace vex_lib;

// A stretch of memory with a pattern of its own at both ends: nobody else may write there.
class Marked {
public:
    Marked(void* block, std::size_t size) : m_block(static_cast<unsigned char*>(block)), m_size(size) {
        require(reinterpret_cast<std::uintptr_t>(block) % 16 == 0);
        mark();
    }
    void mark() {
        m_seed = ++s_seeds;
        for_ends([this](std::size_t i) { m_block[i] = byte(i); });
    }
    // As far as it has been kept; more than the front only where all of it was.
    void check(std::size_t kept) const {
        for_ends([this, kept](std::size_t i) { require(i >= kept || m_block[i] == byte(i)); });
    }
    void check() const { check(m_size); }
    void move(void* block, std::size_t size) {
        const std::size_t kept = std::min(m_size, size);
        m_block = static_cast<unsigned char*>(block);
        check(kept);
        m_size = size;
        mark();
    }
    unsigned char* block() const { return m_block; }
    std::size_t size() const { return m_size; }

private:
    template <class Work>
    void for_ends(Work work) const {
        constexpr std::size_t END = 64;
        for (std::size_t i = 0; i < std::min(END, m_size); ++i) {
            work(i);
            work(m_size - 1 - i);
        }
    }
    unsigned char byte(std::size_t i) const { return static_cast<unsigned char>(m_seed * 7 + i); }

    unsigned char* m_block;
    std::size_t m_size;
    unsigned m_seed = 0;
    static inline unsigned s_seeds = 0;
};

// Small mostly, now and then beyond what regions share.
std::size_t any_size(Input& input) {
    const std::size_t size = input.byte();
    const unsigned shift = input.byte() % 16;
    return size << (shift < 14 ? shift % 8 : shift);
}

class HeapRun {
public:
    explicit HeapRun(unsigned long limit) : m_heap(std::make_unique<vlWinHeapAllocator>(limit)) {}
    ~HeapRun() {
        for (const Marked& one : m_blocks) {
            one.check();
        }
    }
    HeapRun(const HeapRun&) = delete;
    HeapRun& operator=(const HeapRun&) = delete;

    void step(Input& input) {
        const unsigned choice = input.byte() % 16;
        if (choice == 0) {
            m_heap->Compact();
        } else if (choice == 1) {  // inside a block, and nowhere near one
            m_heap->Free(m_blocks.empty() ? &m_heap : static_cast<void*>(any(input).block() + 16));
        } else if (choice < 6 && !m_blocks.empty()) {
            Marked& one = any(input);
            one.check();
            m_heap->Free(one.block());
            if (input.byte() % 8 == 0) {
                m_heap->Free(one.block());
            }
            std::swap(one, m_blocks.back());
            m_blocks.pop_back();
        } else if (choice < 9 && !m_blocks.empty()) {
            Marked& one = any(input);
            const std::size_t size = any_size(input);
            void* const block = m_heap->ReAlloc(one.block(), size);
            block != nullptr ? one.move(block, size) : one.check();
        } else {
            const std::size_t size = any_size(input);
            if (void* const block = m_heap->Alloc(size)) {
                m_blocks.emplace_back(block, size);
            }
        }
    }
    void inspect() const {
        const basalt::platform::HeapReport report = basalt::platform::inspect_heap(m_heap->Handle());
        require(report.fault == nullptr && report.live_blocks == m_blocks.size());
    }

private:
    Marked& any(Input& input) { return m_blocks[input.byte() % m_blocks.size()]; }

    std::unique_ptr<vlWinHeapAllocator> m_heap;
    std::vector<Marked> m_blocks;
};

// Blocks keep what is in them even while they are free.
void run_block_allocator(Input& input) {
    const unsigned long size = 16UL * (1 + input.byte() % 32);
    const unsigned long segment = size * (1 + input.byte() % 20) + input.byte();
    vlVmAllocator allocator(segment, size);
    std::vector<Marked> taken;
    std::vector<Marked> freed;
    for (int i = 0; i < 100 && !input.is_over(); ++i) {
        const unsigned choice = input.byte();
        if (choice % 16 == 0) {
            allocator.Free(freed.empty() ? nullptr : freed.back().block());
            allocator.Free(taken.empty() ? nullptr : taken.back().block() + 1);
            require(allocator.Alloc(size + 1) == nullptr);
        } else if (choice < 110 && !taken.empty()) {
            std::swap(taken[choice % taken.size()], taken.back());
            taken.back().check();
            allocator.Free(taken.back().block());
            freed.push_back(taken.back());
            taken.pop_back();
        } else if (void* const block = allocator.Alloc(size)) {
            const auto before = std::find_if(freed.begin(), freed.end(),
                                             [=](const Marked& one) { return one.block() == block; });
            if (before != freed.end()) {
                before->check();
                freed.erase(before);
            } else {
                const char* const bytes = static_cast<char*>(block);
                require(std::all_of(bytes, bytes + size, [](char byte) { return byte == 0; }));
            }
            taken.emplace_back(block, size);
        }
    }
    for (const Marked& one : taken) {
        one.check();
    }
}

void run_buffer(Input& input) {
    const std::uint64_t step = input.byte() % 4 == 0 ? 0 : any_size(input);
    const auto rounded = [step](std::uint64_t size) { return step == 0 ? size : (size / step + 1) * step; };
    std::uint64_t room = rounded(any_size(input));
    vlVmBuffer buffer(room == 0 ? 0 : room - 1, 0, step);
    room = rounded(room == 0 ? 0 : room - 1);
    require((buffer.GetData() != nullptr) == (room != 0));
    std::unique_ptr<Marked> contents;
    for (int i = 0; i < 30 && !input.is_over(); ++i) {
        const std::uint64_t size = any_size(input);
        const std::uint64_t next = size > room ? rounded(size) : size;
        void* const block = buffer.ReSize(size);
        require(block == buffer.GetData() && (block != nullptr) == (next != 0));
        room = next;
        if (room == 0) {
            contents.reset();
        } else if (contents) {
            contents->move(block, room);
        } else {
            contents = std::make_unique<Marked>(block, room);
        }
        require(buffer.ReSize(std::uint64_t{1} << 32) == nullptr && buffer.GetData() == block);
    }
}

void run_pages(Input& input) {
    constexpr unsigned long COMMIT = 0x1000, RESERVE = 0x2000, DECOMMIT = 0x4000, RELEASE = 0x8000;
    constexpr std::size_t PAGE = 4096, PAGES = 24;
    vex_util::CMemoryMap map(any_size(input));
    require(static_cast<void*>(map) != nullptr);
    auto* const base =
        static_cast<unsigned char*>(vlSharedMemoryAllocator::Alloc(nullptr, PAGES * PAGE, RESERVE, nullptr));
    require(base != nullptr);
    int held[PAGES] = {};  // by page: -1 without memory, else what its first byte is
    std::fill(std::begin(held), std::end(held), -1);
    for (int i = 0; i < 40 && !input.is_over(); ++i) {
        const std::size_t first = input.byte() % PAGES;
        const std::size_t count = 1 + input.byte() % (PAGES - first);
        if (input.byte() % 3 == 0) {
            require(vlSharedMemoryAllocator::Free(base + first * PAGE, count * PAGE, DECOMMIT, 0) != 0);
            std::fill_n(held + first, count, -1);
            continue;
        }
        require(vlSharedMemoryAllocator::Alloc(base + first * PAGE, count * PAGE, COMMIT, nullptr) ==
                base + first * PAGE);
        for (std::size_t page = first; page < first + count; ++page) {
            require(base[page * PAGE] == std::max(held[page], 0));
            base[page * PAGE] = static_cast<unsigned char>(held[page] = input.byte());
        }
    }
    require(vlSharedMemoryAllocator::Alloc(base, (PAGES + 16) * PAGE, COMMIT, nullptr) == nullptr);
    require(vlSharedMemoryAllocator::Free(base, 0, RELEASE, 0) != 0);
    require(vlSharedMemoryAllocator::Free(base, 0, RELEASE, 0) == 0);
}

void run_heaps(Input& input) {
    HeapRun free_heap(0);
    HeapRun limited(1 + input.word() % 500'000);
    for (int i = 0; i < 200 && !input.is_over(); ++i) {
        (input.byte() % 2 == 0 ? free_heap : limited).step(input);
    }
    free_heap.inspect();
    limited.inspect();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    basalt::platform::SetDebugOutputHandler([](const wchar_t*) {});
    Input input(data, size);
    switch (input.byte() % 8) {
        case 0:
            run_block_allocator(input);
            break;
        case 1:
            run_buffer(input);
            break;
        case 2:
            run_pages(input);
            break;
        default:
            run_heaps(input);
            break;
    }
    return 0;
}
