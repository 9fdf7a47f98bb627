// Heaps and the block allocator by their models' steps; maps, buffers and page sources by rows; the sparse
// array.
#include <chrono>
#include <cstring>
#include <random>
#include <tuple>
#include <vector>

#include "basalt/sparse_cells.h"
#include "src/platform/file.h"
#include "tests/faults/trial.h"
#include "tests/sparse/visit_recorder.h"
#include "tests/support/memory_model.h"
#include "tests/support/sparse_inspector.h"

namespace basalt::faults {

namespace {

using namespace vex_lib;
using vex_util::CMemoryMap;
using vex_util::Sparse2DArray;
using namespace vex_util::testing;

using Pages = vlSharedMemoryAllocator;
using Mapped = vlMMapFileAllocator;
constexpr unsigned long PAGE = 4096, COMMIT = 0x1000, RESERVE = 0x2000, DECOMMIT = 0x4000, RELEASE = 0x8000;

// Steps with failing calls between some without.
template <class Model, class... Arguments>
void walk(const char* operation, unsigned bits, int steps_before, int steps, Arguments... arguments) {
    check(operation, [=](Trial& trial) {
        std::mt19937 random(static_cast<unsigned>(steps));
        std::vector<std::uint8_t> bytes(1000);
        std::ranges::generate(bytes, [&] { return static_cast<std::uint8_t>(random() | bits); });
        test::Input input(bytes.data(), bytes.size());
        Model model(arguments...);
        test::drive(model, input, steps_before);
        test::failures_are_paused = true;
        trial.attempt([&] { test::drive(model, input, steps, [&] { return trial.strikes(); }); });
        test::failures_are_paused = false;
        test::drive(model, input, std::min(steps, 8));
        for (const std::string& name : Trial::folder().names()) {
            // A segment's file that could not be opened again stays, empty.
            const bool is_left = trial.was_ever_struck() && std::filesystem::is_empty(Trial::folder() / name);
            is_left ? std::filesystem::remove(Trial::folder() / name) : false;
        }
    });
}

std::size_t count_files() {
    test::failures_are_paused = true;
    const std::size_t count = Trial::folder().names().size();
    test::failures_are_paused = false;
    return count;
}

bool fills(void* block, std::size_t size) {
    return block != nullptr && std::memset(block, 'x', size) == block;
}

struct ManyRegionsRow {
    vlWinHeapAllocator heap{0};
    void* block = nullptr;
    ManyRegionsRow() {
        for (int i = 0; i < 32; ++i) {  // as many as the record holds
            heap.Alloc(2 << 20);
        }
    }
    bool act() noexcept { return (block = heap.Alloc(2 << 20)) != nullptr; }
    bool holds(bool done) const { return !done || fills(block, 2 << 20); }
};

struct CreateRow {
    CMemoryMap map;
    bool act() noexcept { return map.Create(2 * PAGE); }
    bool holds(bool done) const { return done ? fills(map, 2 * PAGE) : static_cast<void*>(map) == nullptr; }
};

struct DestroyRow {
    CMemoryMap map{3 * PAGE};
    bool act() noexcept { return map.Destroy(); }
    bool holds(bool) { return static_cast<void*>(map) == nullptr && map.Create(PAGE) && fills(map, PAGE); }
};

struct CleanUpRow {
    CMemoryMap living{PAGE};
    CleanUpRow() { Trial::folder().write("~0000000.mem"), Trial::folder().write("~x.mem"); }
    bool act() noexcept { return CMemoryMap::CleanUp(), count_files() == 1; }
    bool holds(bool) const { return fills(living, PAGE); }
};

struct AbandonedRow {
    std::wstring folder{Trial::path("")};
    AbandonedRow() {
        Trial::folder().write("vma1.tmp");
        const auto now = std::filesystem::file_time_type::clock::now();
        std::filesystem::last_write_time(Trial::folder() / "vma1.tmp", now - std::chrono::hours(1));
    }
    bool act() noexcept {
        return platform::delete_abandoned_files(folder.c_str(), L"vma"), count_files() == 0;
    }
    bool holds(bool) const { return true; }
};

struct ResizeRow {
    vlVmBuffer buffer{100, 0, 64};
    ResizeRow() { std::strcpy(static_cast<char*>(buffer.GetData()), "kept"); }
    bool act() noexcept { return buffer.ReSize(1 << 20) != nullptr; }
    bool holds(bool done) const {
        auto* const data = static_cast<char*>(buffer.GetData());
        return std::strcmp(data, "kept") == 0 && (!done || fills(data + 5, (1 << 20) - 5));
    }
};

// Each step is repeated until it succeeds.
struct PagesRow {
    char* base = nullptr;
    int step = 0;
    bool next() noexcept {
        switch (step) {
            case 0:
                base = static_cast<char*>(Pages::Alloc(nullptr, 3 * PAGE, RESERVE, nullptr));
                return base != nullptr;
            case 1:
                return Pages::Alloc(base + PAGE, PAGE, COMMIT, nullptr) == base + PAGE &&
                       fills(base + PAGE, PAGE);
            case 2:
                return Pages::Free(base + PAGE, PAGE, DECOMMIT, 0) != 0;
            case 3:
                return Pages::Alloc(base, 3 * PAGE, COMMIT, nullptr) == base && base[PAGE] == 0;
            default:
                return fills(base, 3 * PAGE) && Pages::Free(base, 0, RELEASE, 0) != 0;
        }
    }
    bool act() noexcept {
        while (step < 5 && next()) {
            ++step;
        }
        return step == 5;
    }
    bool holds(bool done) const { return done || step != 2 || base[PAGE] == 'x'; }
};

struct MappedRow {
    void* view = nullptr;
    unsigned long handle = 0;
    bool act() noexcept {
        view = view != nullptr ? view : Mapped::Alloc(nullptr, PAGE, RESERVE, &handle);
        return fills(view, PAGE) && Mapped::Free(view, 0, RELEASE, handle) != 0;
    }
    bool holds(bool done) const { return done || (view != nullptr ? fills(view, PAGE) : handle == 0); }
};

struct Filled : Sparse2DArray {
    explicit Filled(int blocks) : Sparse2DArray(8, 4, 3) {
        for (int i = 0; i < blocks; ++i) {
            insert_value(*this, 4 * (i % 7), 4 * (i / 7), static_cast<std::uint64_t>(i));
        }
        select(*this, 0, 0, 12, 12);
        Remove(4, 0);
    }
};

auto state_of(Sparse2DArray& array) {
    check_invariants(array);
    return std::tuple(visits(array, true), visits(array, false), array.IsSelectionDirty());
}

}  // namespace

void check_memory() {
    walk<test::HeapModel>("heap", 0, 0, 60, 0UL);
    walk<test::HeapModel>("heap with a maximum", 0, 0, 60, 300'000UL);
    walk<test::BlockModel>("vlVmAllocator, a new file a block", 128, 16, 2, PAGE, PAGE);
    walk<test::BlockModel>("vlVmAllocator, several blocks a file", 0, 0, 20, 5 * PAGE, PAGE);
    run<ManyRegionsRow>("heap with many regions");
    run<CreateRow>("CMemoryMap::Create");
    run<DestroyRow>("CMemoryMap::Destroy");
    run<CleanUpRow>("CMemoryMap::CleanUp");
    run<AbandonedRow>("abandoned files");
    run<ResizeRow>("vlVmBuffer::ReSize");
    run<PagesRow>("vlSharedMemoryAllocator");
    run<MappedRow>("vlMMapFileAllocator");
    check("vlVmBuffer::Test", [](Trial& trial) { trial.attempt([] { vlVmBuffer::Test(); }); });
}

void check_sparse() {
    const auto check_call = [](const char* operation, int blocks, const auto& call) {
        check(operation, [&](Trial& t) {
            Filled array(blocks);
            const auto before = state_of(array);
            const bool threw = t.throws([&] { call(array); });
            t.expect(!threw || (t.struck() && state_of(array) == before), "a failed call changes nothing");
            call(array);
            state_of(array);
        });
    };
    const std::vector<std::uint64_t> row(150, 9);
    for (const int blocks : {1, 3, 8, 16, 64, 73}) {  // full chunks, block table, leaves, root
        check_call("Sparse2DArray::Insert", blocks, [](auto& a) { insert_value(a, 999, 999, 1); });
    }
    check_call("SparseCells::insert_row", 73,
               [&](auto& a) { SparseCells::insert_row(a, -9, 1, row.data(), 8, row.size()); });
    check_call("Sparse2DArray::Select", 73, [](auto& a) { select(a, -100, -100, 100, 100); });
    check_call("Sparse2DArray, copy", 90, [](auto& a) { const Sparse2DArray copy(a); });
    check("Sparse2DArray::operator=", [](Trial& t) {
        Filled source(73), target(5);
        const bool threw = t.throws([&] { target = source; });
        t.expect(!threw || t.struck(), "throws only for a failure");
        t.expect(visits(target, true) == (threw ? Visits{} : visits(source, true)), "assigned or empty");
        target = source;
        t.expect(visits(target, true) == visits(source, true), "assigned afterwards");
    });
    check("Sparse2DArray::RemoveAll", [](Trial& t) {
        Filled array(73);
        t.attempt([&] { array.RemoveAll(); });
        t.expect(!t.struck() && visits(array, true).empty() && array.Insert(1, 1, &t), "empty, and usable");
    });
}

}  // namespace basalt::faults
