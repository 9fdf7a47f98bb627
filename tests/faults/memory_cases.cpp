// Heaps and the block allocator by their models' steps; the rest by rows.
#include <chrono>
#include <cstring>
#include <memory>
#include <random>

#include "src/platform/file.h"
#include "tests/faults/trial.h"
#include "tests/support/memory_model.h"

namespace basalt::faults {

namespace {

using namespace vex_lib;
using vex_util::CMemoryMap;

using Pages = vlSharedMemoryAllocator;
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

struct OnSharedHeapRow {
    struct Object : vlSharedMemoryHeap {
        char bytes[2 << 20];
    };
    std::unique_ptr<Object> object;
    bool act() noexcept { return object.reset(new Object), object != nullptr; }
    bool holds(bool done) const { return !done || fills(object->bytes, sizeof object->bytes); }
};

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
    AbandonedRow() {
        Trial::folder().write("vma1.tmp");
        const auto now = std::filesystem::file_time_type::clock::now();
        std::filesystem::last_write_time(Trial::folder() / "vma1.tmp", now - std::chrono::hours(1));
    }
    std::wstring folder{Trial::path("")};
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

struct ReserveRow {
    void* base = nullptr;
    bool act() noexcept { return (base = Pages::Alloc(nullptr, PAGE, RESERVE, nullptr)) != nullptr; }
    bool holds(bool done) const { return !done || Pages::Free(base, 0, RELEASE, 0) != 0; }
};

struct ReleaseRow : ReserveRow {
    ReleaseRow() { ReserveRow::act(); }
    bool act() noexcept { return Pages::Free(base, 0, RELEASE, 0) != 0; }
    bool holds(bool) const { return true; }
};

// Drops the second of three pages, and commits all.
struct PagesRow : ReserveRow {
    char* page = nullptr;
    bool is_dropped = false;
    PagesRow() {
        base = Pages::Alloc(nullptr, 3 * PAGE, RESERVE, nullptr);
        page = static_cast<char*>(Pages::Alloc(static_cast<char*>(base) + PAGE, PAGE, COMMIT, nullptr));
        page[0] = 'x';
    }
    ~PagesRow() { Pages::Free(base, 0, RELEASE, 0); }
    bool act() noexcept {
        is_dropped = is_dropped || Pages::Free(page, PAGE, DECOMMIT, 0) != 0;
        return is_dropped && Pages::Alloc(base, 3 * PAGE, COMMIT, nullptr) == base;
    }
    bool holds(bool done) const {
        return done ? *page == 0 && fills(base, 3 * PAGE) : is_dropped || *page == 'x';
    }
};

struct MappedRow {
    void* view = nullptr;
    unsigned long handle = 0;
    bool act() noexcept {
        return (view = vlMMapFileAllocator::Alloc(nullptr, PAGE, RESERVE, &handle)) != nullptr;
    }
    bool free() const noexcept { return vlMMapFileAllocator::Free(view, 0, RELEASE, handle) != 0; }
    bool holds(bool done) const { return done ? fills(view, PAGE) && free() : handle == 0; }
};

struct UnmappedRow : MappedRow {
    UnmappedRow() { MappedRow::act(); }
    bool act() noexcept { return free(); }
    bool holds(bool done) const { return done || fills(view, PAGE); }
};

}  // namespace

void check_memory() {
    walk<test::HeapModel>("heap", 0, 0, 60, 0UL);
    walk<test::HeapModel>("heap with a maximum", 0, 0, 60, 300'000UL);
    walk<test::BlockModel>("vlVmAllocator, a new file a block", 128, 16, 2, PAGE, PAGE);
    walk<test::BlockModel>("vlVmAllocator, several blocks a file", 0, 0, 20, 5 * PAGE, PAGE);
    run<ManyRegionsRow>("heap with many regions");
    run<OnSharedHeapRow>("new of a class on the shared heap");
    run<CreateRow>("CMemoryMap::Create");
    run<DestroyRow>("CMemoryMap::Destroy");
    run<CleanUpRow>("CMemoryMap::CleanUp");
    run<AbandonedRow>("abandoned files");
    run<ResizeRow>("vlVmBuffer::ReSize");
    run<ReserveRow>("vlSharedMemoryAllocator, a reservation");
    run<ReleaseRow>("vlSharedMemoryAllocator, a release");
    run<PagesRow>("vlSharedMemoryAllocator, pages");
    run<MappedRow>("vlMMapFileAllocator::Alloc");
    run<UnmappedRow>("vlMMapFileAllocator::Free");
    check("vlVmBuffer::Test", [](Trial& trial) { trial.attempt([] { vlVmBuffer::Test(); }); });
}

}  // namespace basalt::faults
