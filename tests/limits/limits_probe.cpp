// Works through the memory family where the system is short of something and says whether each answer was the
// documented one. Run by scripts/check_limits.sh, one shortage at a time, with TMPDIR naming an empty folder.
#include <cstddef>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <iterator>
#include <memory>
#include <string_view>
#include <vector>

#include "basalt/memory.h"
#include "basalt/platform/error.h"

namespace {

using vex_lib::vlMMapFileAllocator;
using vex_lib::vlSharedMemoryAllocator;
using vex_lib::vlVmAllocator;
using vex_util::CMemoryMap;

constexpr unsigned long KIB = 1024;
constexpr unsigned long MIB = 1024 * KIB;
constexpr unsigned long COMMIT = 0x1000, RESERVE = 0x2000, RELEASE = 0x8000;

int failures = 0;

void expect(bool holds, const char* what) {
    if (!holds) {
        std::printf("limits_probe: not so: %s\n", what);
        ++failures;
    }
}

std::size_t files() {
    const std::filesystem::directory_iterator folder(std::getenv("TMPDIR"));
    return static_cast<std::size_t>(std::distance(begin(folder), end(folder)));
}

// Writes every byte of a block: where its space was not reserved, this is what ends the process.
bool fill(void* block, std::size_t size) {
    if (block == nullptr) {
        return false;
    }
    std::memset(block, 'x', size);
    return true;
}

// Blocks handed out, each as large as its file and written to, before the first null or up to `most`.
std::size_t fill_allocator(unsigned long segment, std::size_t most) {
    vlVmAllocator allocator(segment, segment);
    std::size_t count = 0;
    while (count < most && fill(allocator.Alloc(segment), segment)) {
        ++count;
    }
    return count;
}

void file_size() {  // at most 1 MiB a file
    expect(fill(CMemoryMap(4 * MIB), 4 * MIB), "a map too large for a file is on the heap");
    const CMemoryMap small(512 * KIB);
    expect(fill(small, 512 * KIB) && files() == 1, "a smaller map is a file");
    expect(fill_allocator(4 * MIB, 1) == 0, "no block where its file would be too large");
    expect(fill_allocator(512 * KIB, 20) == 20, "blocks in smaller files");
}

void address_space() {  // at most 300 MB in all
    CMemoryMap map;
    expect(!map.Create(1024 * MIB), "no map, not even on the heap");
    expect(files() == 0, "nothing of it left on the disk");
    unsigned long handle = 0;
    expect(vlMMapFileAllocator::Alloc(nullptr, 1024 * MIB, RESERVE, &handle) == nullptr && handle == 0,
           "no view");
    expect(vlSharedMemoryAllocator::Alloc(nullptr, 1024 * MIB, RESERVE, nullptr) == nullptr,
           "no reservation");
    const std::size_t blocks = fill_allocator(32 * MIB, 100);
    expect(blocks > 0 && blocks < 10, "some blocks, then null");
    expect(fill(CMemoryMap(32 * MIB), 32 * MIB), "room again afterwards");
    void* const range = vlSharedMemoryAllocator::Alloc(nullptr, 64 * MIB, RESERVE, nullptr);
    expect(fill(vlSharedMemoryAllocator::Alloc(range, 64 * MIB, COMMIT, nullptr), 64 * MIB),
           "a range in pieces");
    expect(vlSharedMemoryAllocator::Free(range, 0, RELEASE, 0) != 0, "the range released");
}

// Takes descriptors until only so many are left; for good, since the process ends soon.
void leave_descriptors(std::size_t count) {
    std::vector<std::FILE*> taken;
    while (std::FILE* const file = std::fopen("/dev/null", "r")) {
        taken.push_back(file);
    }
    for (; count > 0; --count, taken.pop_back()) {
        std::fclose(taken.back());
    }
}

void no_descriptors() {
    leave_descriptors(0);
    expect(fill(CMemoryMap(MIB), MIB), "a map on the heap");
    expect(fill_allocator(MIB, 1) == 0, "no block without a file");
    CMemoryMap::CleanUp();
}

void few_descriptors() {
    leave_descriptors(2);
    std::vector<std::unique_ptr<CMemoryMap>> maps;
    for (int i = 0; i < 300; ++i) {
        maps.push_back(std::make_unique<CMemoryMap>(4 * KIB));
        expect(fill(*maps.back(), 4 * KIB), "a map");
    }
    expect(files() == 300, "every map is a file and keeps no descriptor");
    expect(fill_allocator(4 * KIB, 300) == 300, "so are the files of blocks");
    CMemoryMap::CleanUp();
    expect(files() == 300, "living maps stay");
}

void full_disk() {  // 8 MiB in all
    expect(fill(CMemoryMap(16 * MIB), 16 * MIB), "a map too large for the disk is on the heap");
    expect(files() == 0, "nothing of it left on the disk");
    const std::size_t blocks = fill_allocator(MIB, 100);
    expect(blocks >= 6 && blocks <= 8, "as many blocks as there is room for, then null");
    std::vector<std::unique_ptr<CMemoryMap>> maps;
    for (int i = 0; i < 20; ++i) {
        maps.push_back(std::make_unique<CMemoryMap>(MIB));
        expect(fill(*maps.back(), MIB), "a map, on the heap once the disk is full");
    }
    expect(files() >= 6 && files() <= 8, "the first of them are files");
    maps.clear();
    expect(fill_allocator(MIB, 6) == 6, "room again afterwards");
}

}  // namespace

int main(int argc, char** argv) {
    const std::string_view shortage = argc == 2 ? argv[1] : "";
    basalt::platform::SetDebugOutputHandler([](const wchar_t*) {});
    if (shortage == "file_size") {
        file_size();
    } else if (shortage == "address_space") {
        address_space();
    } else if (shortage == "no_descriptors") {
        no_descriptors();
    } else if (shortage == "few_descriptors") {
        few_descriptors();
    } else if (shortage == "full_disk") {
        full_disk();
    } else {
        std::puts("usage: limits_probe file_size|address_space|no_descriptors|few_descriptors|full_disk");
        return 2;
    }
    return failures == 0 ? 0 : 1;
}
