// Allocators, the buffer, mapped blocks and page sources.
#include <cstring>
#include <memory>
#include <vector>

#include "basalt/memory.h"
#include "tests/faults/more_system_calls.h"
#include "tests/faults/trial.h"

namespace basalt::faults {

namespace {

using namespace vex_lib;
using vex_util::CMemoryMap;

constexpr std::size_t LARGE = std::size_t{2} << 20;  // mapped alone in a heap
constexpr unsigned long PAGE = 4096;
constexpr unsigned long COMMIT = 0x1000, RESERVE = 0x2000, DECOMMIT = 0x4000, RELEASE = 0x8000;

// Writes all of a block, which is to be there.
bool fills(void* block, std::size_t size) {
    return block != nullptr && std::memset(block, 'x', size) == block;
}

void check_heaps() {
    check("vlWinHeapAllocator", [](Trial& t) {
        std::unique_ptr<vlWinHeapAllocator> heap;
        t.throws([&] { heap = std::make_unique<vlWinHeapAllocator>(0); });
        t.expect(heap == nullptr || heap->Handle() != nullptr || heap->Alloc(8) == nullptr,
                 "a heap without a handle gives nothing");
        t.expect(fills(vlWinHeapAllocator(0).Alloc(100), 100), "another heap");
    });
    check("vlWinHeapAllocator::~vlWinHeapAllocator", [](Trial& t) {
        auto heap = std::make_unique<vlWinHeapAllocator>(0);
        t.expect(fills(heap->Alloc(100), 100) && fills(heap->Alloc(LARGE), LARGE), "blocks");
        t.attempt([&] { heap.reset(); });
    });
    for (const std::size_t last_size : {std::size_t{100}, LARGE}) {
        check("vlWinHeapAllocator::Alloc, more regions than the record holds", [=](Trial& t) {
            vlWinHeapAllocator heap(0);
            std::vector<void*> blocks(40);
            for (void*& block : blocks) {
                block = heap.Alloc(LARGE);
                t.expect(block != nullptr, "as many as it holds");
            }
            void* last = nullptr;
            t.attempt([&] { last = heap.Alloc(last_size); });
            t.expect(t.struck() || last != nullptr, "null only for a failure");
            t.expect(fills(heap.Alloc(last_size), last_size), "a block afterwards");
            for (void* const block : blocks) {
                heap.Free(block);
            }
            heap.Free(last);
        });
    }
    for (const auto& [name, size] : {std::pair("vlWinHeapAllocator::Alloc, a new region", std::size_t{100}),
                                     std::pair("vlWinHeapAllocator::Alloc, mapped alone", LARGE)}) {
        check(name, [size = size](Trial& t) {
            vlWinHeapAllocator heap(0);
            void* const block = t.attempt([&] { return heap.Alloc(size); });
            t.expect(t.struck() || block != nullptr, "null only for a failure");
            t.expect(block == nullptr || fills(block, size), "a block");
            t.expect(fills(heap.Alloc(size), size), "a block afterwards");
        });
        check("vlWinHeapAllocator::ReAlloc", [size = size](Trial& t) {
            vlWinHeapAllocator heap(0);
            auto* const old = static_cast<char*>(heap.Alloc(size));
            old[size - 1] = 7;
            auto* const moved = static_cast<char*>(t.attempt([&] { return heap.ReAlloc(old, 3 * LARGE); }));
            t.expect((moved != nullptr ? moved : old)[size - 1] == 7, "contents are kept either way");
            t.expect(heap.ReAlloc(moved != nullptr ? moved : old, 5 * LARGE) != nullptr, "larger afterwards");
        });
        check("vlWinHeapAllocator::Free, Compact", [size = size](Trial& t) {
            vlWinHeapAllocator heap(0);
            void* const block = heap.Alloc(size);
            void* const other = heap.Alloc(size);
            t.attempt([&] { heap.Free(block), heap.Free(other), heap.Compact(); });
            t.expect(fills(heap.Alloc(size), size), "a block afterwards");
        });
    }
    check("vlSharedMemoryHeap::Alloc, Free", [](Trial& t) {
        void* const block = t.attempt([] { return vlSharedMemoryHeap::Alloc(LARGE); });
        t.expect(block == nullptr ? t.struck() : fills(block, LARGE), "a block, or null for a failure");
        t.attempt([=] { vlSharedMemoryHeap::Free(block); });
        vlSharedMemoryHeap::Free(t.struck() ? block : nullptr);  // it stays where it cannot be unmapped
    });
    struct OnSharedHeap : vlSharedMemoryHeap {
        char bytes[3 << 20];
    };
    check("new of a class on the shared heap", [](Trial& t) {
        OnSharedHeap* const object = t.attempt([] { return new OnSharedHeap; });
        t.expect(object != nullptr || t.struck(), "null only for a failure");
        delete object;
    });
}

void check_blocks_on_files() {
    check("vlVmAllocator::Alloc", [](Trial& t) {
        constexpr int BEFORE = 16;  // with as many files the index is full
        vlVmAllocator allocator(PAGE, PAGE);
        for (int i = 0; i < BEFORE; ++i) {
            t.expect(fills(allocator.Alloc(PAGE), PAGE), "blocks before");
        }
        const long kept = files_made_to_stay();
        void* const block = t.attempt([&] { return allocator.Alloc(PAGE); });
        t.expect(block == nullptr ? t.struck() : fills(block, PAGE), "a block, or null for a failure");
        for (const std::string& name : t.folder().names()) {
            // Where the file just made could not be opened again, it stays, empty.
            if (block == nullptr && std::filesystem::file_size(t.folder() / name) == 0) {
                std::filesystem::remove(t.folder() / name);
                break;
            }
        }
        t.expect(
            t.folder().names().size() == BEFORE + (block != nullptr ? 1U : 0U) || files_made_to_stay() > kept,
            "a file for a block");
        t.expect(fills(allocator.Alloc(PAGE), PAGE), "a block afterwards");
    });
    check("vlVmAllocator::~vlVmAllocator", [](Trial& t) {
        auto allocator = std::make_unique<vlVmAllocator>(PAGE, PAGE);
        t.expect(allocator->Alloc(PAGE) != nullptr && allocator->Alloc(PAGE) != nullptr, "blocks");
        t.attempt([&] { allocator.reset(); });
    });
    check("CMemoryMap::Create", [](Trial& t) {
        CMemoryMap map;
        const bool made = t.attempt([&] { return map.Create(2 * PAGE); });
        t.expect(made == (static_cast<void*>(map) != nullptr), "the answer is that of the block");
        t.expect(made ? fills(map, 2 * PAGE) : t.struck(), "a block");
        t.expect(map.Create(PAGE) && fills(map, PAGE), "a block afterwards");
    });
    check("CMemoryMap::Destroy", [](Trial& t) {
        CMemoryMap map(3 * PAGE);
        t.expect(t.attempt([&] { return map.Destroy(); }) && static_cast<void*>(map) == nullptr, "gone");
        t.expect(map.Create(PAGE) && fills(map, PAGE), "a block afterwards");
    });
    check("CMemoryMap::CleanUp", [](Trial& t) {
        const CMemoryMap living(PAGE);
        for (const char* const name : {"~0000000.mem", "~1.mem", "~x.mem"}) {
            t.folder().write(name);
        }
        t.attempt([] { CMemoryMap::CleanUp(); });
        t.expect(fills(living, PAGE), "a living block stays");
        CMemoryMap::CleanUp();
        t.expect(t.folder().names().size() == 1, "the rest goes afterwards, the living one's file stays");
    });
    check("vlVmBuffer", [](Trial& t) {
        std::unique_ptr<vlVmBuffer> buffer;
        t.throws([&] { buffer = std::make_unique<vlVmBuffer>(1000, 0, 64); });
        t.expect(buffer == nullptr || buffer->GetData() == nullptr || fills(buffer->GetData(), 1024), "room");
        t.expect(buffer == nullptr || fills(buffer->ReSize(2000), 2048), "room afterwards");
    });
    check("vlVmBuffer::ReSize", [](Trial& t) {
        vlVmBuffer buffer(1000, 0, 0);
        t.expect(fills(buffer.GetData(), 1000), "room");
        auto* const block = static_cast<char*>(t.attempt([&] { return buffer.ReSize(500'000); }));
        t.expect(block != nullptr ? buffer.GetData() == block : t.struck(), "null only for a failure");
        t.expect(static_cast<char*>(buffer.GetData())[999] == 'x', "contents are kept either way");
        t.expect(fills(buffer.ReSize(600'000), 600'000), "room afterwards");
    });
    check("vlVmBuffer::Test", [](Trial& t) { t.attempt([] { vlVmBuffer::Test(); }); });
}

void check_page_sources() {
    check("vlSharedMemoryAllocator::Alloc, Free", [](Trial& t) {
        constexpr unsigned long SIZE = 40UL << 20;  // in two pieces
        void* const range =
            t.attempt([] { return vlSharedMemoryAllocator::Alloc(nullptr, SIZE, RESERVE, nullptr); });
        if (range == nullptr) {
            t.expect(t.struck(), "null only for a failure");
            return;
        }
        void* const pages =
            t.attempt([=] { return vlSharedMemoryAllocator::Alloc(range, SIZE, COMMIT, nullptr); });
        t.expect(pages == nullptr ? t.struck() : fills(pages, 1), "pages, or null for a failure");
        t.attempt([=] { vlSharedMemoryAllocator::Free(range, PAGE, DECOMMIT, 0); });
        t.expect(fills(vlSharedMemoryAllocator::Alloc(range, SIZE, COMMIT, nullptr), 1), "pages afterwards");
        const int released = t.attempt([=] { return vlSharedMemoryAllocator::Free(range, 0, RELEASE, 0); });
        t.expect(released != 0 || t.struck(), "0 only for a failure");
        t.expect((vlSharedMemoryAllocator::Free(range, 0, RELEASE, 0) != 0) == (released == 0),
                 "a range that stayed can be released afterwards");
    });
    check("vlMMapFileAllocator::Alloc", [](Trial& t) {
        unsigned long handle = 1;
        void* const view =
            t.attempt([&] { return vlMMapFileAllocator::Alloc(nullptr, PAGE, RESERVE, &handle); });
        t.expect((view == nullptr) == (handle == 0), "no handle without a view");
        t.expect(view == nullptr ? t.struck() : fills(view, PAGE), "a view, or null for a failure");
        vlMMapFileAllocator::Free(view, 0, RELEASE, handle);
    });
    check("vlMMapFileAllocator::Free", [](Trial& t) {
        unsigned long handle = 0;
        void* const view = vlMMapFileAllocator::Alloc(nullptr, PAGE, RESERVE, &handle);
        const int freed = t.attempt([=] { return vlMMapFileAllocator::Free(view, 0, RELEASE, handle); });
        t.expect(freed != 0 || (t.struck() && fills(view, PAGE)), "0 only for a failure, and the view stays");
        t.expect(freed != 0 || vlMMapFileAllocator::Free(view, 0, RELEASE, handle) != 0, "freed afterwards");
    });
}

}  // namespace

void check_memory() {
    check_heaps();
    check_blocks_on_files();
    check_page_sources();
}

}  // namespace basalt::faults
