// Uses blocks on files under a resource limit and checks that calls fail as documented. Run by
// scripts/check.sh limits, with TMPDIR naming an empty folder. Every block is written to: where its space was
// not reserved, a signal ends the process.
#include <fcntl.h>
#include <unistd.h>

#include <cstring>
#include <filesystem>
#include <iostream>
#include <memory>
#include <vector>

#include "basalt/memory.h"

namespace {

bool fill(void* block, unsigned long size) {
    return block != nullptr && std::memset(block, 'x', size) == block;
}
// Blocks of an allocator, each as large as its file, before the first null.
long blocks(long most, unsigned long size) {
    vex_lib::vlVmAllocator allocator(size, size);
    long count = 0;
    for (; count < most && fill(allocator.Alloc(size), size); ++count) {
    }
    return count;
}
// How many of so many living mapped blocks are files; -1 where there is not even memory for one.
long mapped(long count, unsigned long size) {
    std::vector<std::unique_ptr<vex_util::CMemoryMap>> maps;
    for (; count > 0; --count) {
        maps.push_back(std::make_unique<vex_util::CMemoryMap>(size));
        if (!fill(*maps.back(), size)) {
            return -1;
        }
    }
    vex_util::CMemoryMap::CleanUp();  // keeps the files of living blocks
    std::error_code none;
    return std::distance(std::filesystem::directory_iterator(std::getenv("TMPDIR"), none), {});
}

constexpr unsigned long KIB = 1024, MIB = 1024 * KIB;
constexpr struct {
    std::string_view limit;
    long (*measure)(long count, unsigned long size);
    long count;
    unsigned long size;
    long least, most;  // of the result
} ROWS[] = {
    {"file_size", mapped, 1, 4 * MIB, 0, 0},  // at most 1 MiB a file; else on the heap
    {"file_size", mapped, 1, 512 * KIB, 1, 1},
    {"file_size", blocks, 1, 4 * MIB, 0, 0},
    {"file_size", blocks, 20, 512 * KIB, 20, 20},
    {"address_space", mapped, 1, 1024 * MIB, -1, -1},  // at most 300 MB in all
    {"address_space", blocks, 100, 32 * MIB, 1, 9},
    {"address_space", mapped, 1, 32 * MIB, 1, 1},
    {"no_descriptors", mapped, 1, MIB, 0, 0},
    {"no_descriptors", blocks, 1, MIB, 0, 0},
    {"few_descriptors", mapped, 300, 4 * KIB, 300, 300},  // files keep no descriptor
    {"few_descriptors", blocks, 300, 4 * KIB, 300, 300},
    {"full_disk", mapped, 1, 16 * MIB, 0, 0},  // 8 MiB in all
    {"full_disk", blocks, 100, MIB, 6, 8},
    {"full_disk", mapped, 20, MIB, 6, 8},
};

}  // namespace

int main(int argc, char** argv) {
    const std::string_view limit = argc == 2 ? argv[1] : "";
    while (limit.ends_with("_descriptors") && open("/dev/null", O_RDONLY) >= 0) {
    }
    for (int i = 10; limit == "few_descriptors" && i < 12; ++i) {
        close(i);
    }
    int rows = 0, wrong = 0;
    for (const auto& row : ROWS) {
        if (row.limit == limit) {
            const long result = row.measure(row.count, row.size);
            std::cerr << limit << ", row " << ++rows << ": " << result << '\n';
            wrong += result < row.least || result > row.most ? 1 : 0;
        }
    }
    return rows == 0 || wrong > 0 ? 1 : 0;
}
