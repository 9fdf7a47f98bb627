#include "basalt/memory/memory_map.h"

#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <csignal>
#include <filesystem>
#include <set>
#include <string>

#include "src/platform/file.h"
#include "tests/support/child.h"
#include "tests/support/open_descriptors.h"
#include "tests/support/scratch_folder.h"

namespace {

using basalt::test::open_descriptors;
using basalt::test::ScratchFolder;
using vex_util::CMemoryMap;
using Names = std::set<std::string>;

constexpr unsigned long SIZE = 100'000;

char* bytes(const CMemoryMap& map) {
    return static_cast<char*>(static_cast<void*>(map));
}

bool is_zero_and_usable(const CMemoryMap& map, std::size_t size) {
    char* const data = bytes(map);
    return data != nullptr && std::count(data, data + size, 0) == static_cast<long>(size) &&
           std::fill_n(data, size, 'x') != nullptr;
}

TEST(MemoryMap, is_a_hidden_file_while_it_lives) {
    const ScratchFolder folder;
    const long descriptors = open_descriptors();
    CMemoryMap map(SIZE);
    EXPECT_TRUE(is_zero_and_usable(map, SIZE));
    const std::string name = *folder.names().begin();
    EXPECT_EQ(name.substr(0, 3) + name.substr(8), "~00.mem");
    EXPECT_EQ(std::filesystem::file_size(folder / name), SIZE);
    EXPECT_EQ(open_descriptors(), descriptors);
    EXPECT_TRUE(map.Create(2 * SIZE) && is_zero_and_usable(map, 2 * SIZE));
    EXPECT_EQ(folder.names().size(), 1U) << "the first file is deleted";
    EXPECT_TRUE(map.Destroy() && map.Destroy());
    EXPECT_FALSE(map.Create(0x100000001)) << "refused, not truncated to one byte";
    EXPECT_EQ(bytes(map), nullptr);
    EXPECT_EQ(folder.names(), Names{});
}

// 245 characters of the folder, a separator and 12 of the file's name (with its own) are 259, the most.
TEST(MemoryMap, without_a_file_it_is_on_the_heap) {
    const ScratchFolder folder;
    const auto long_folder = [&](std::size_t length) {
        return folder / std::string(length - folder.path().size() - 1, 'd');
    };
    const std::pair<std::string, bool> ROWS[] = {{folder / "missing", false},
                                                 {std::string(300, 'x'), false},
                                                 {long_folder(246), false},
                                                 {long_folder(245), true}};
    for (const auto& [place, has_file] : ROWS) {
        place.size() > 200 && place.size() < 300 ? std::filesystem::create_directory(place) : false;
        ScratchFolder::set_temporary(place);
        const CMemoryMap map(1024);
        EXPECT_TRUE(is_zero_and_usable(map, 1024));
        CMemoryMap::CleanUp();
        std::error_code missing;
        EXPECT_EQ(std::filesystem::exists(place, missing) && !std::filesystem::is_empty(place), has_file)
            << place.size();
    }
    ScratchFolder::set_temporary(folder.path());
    EXPECT_NE(bytes(CMemoryMap(0)), nullptr);
}

TEST(MemoryMap, deletes_its_own_file_and_an_unheld_one_of_its_name_in_the_current_folder) {
    const ScratchFolder folder;
    std::filesystem::create_directory(folder / "other");
    for (const bool is_held : {false, true}) {
        ScratchFolder::set_temporary(folder.path());
        CMemoryMap map(SIZE);
        const std::string name = *folder.names().rbegin();
        folder.write("other/" + name);
        const std::wstring other = folder.wide(L"other/" + std::wstring(name.begin(), name.end()));
        const HANDLE holder = is_held ? CreateFileW(other.c_str(), GENERIC_READ | GENERIC_WRITE, 0, nullptr,
                                                    OPEN_EXISTING, FILE_FLAG_DELETE_ON_CLOSE, nullptr)
                                      : INVALID_HANDLE_VALUE;
        ScratchFolder::set_temporary(folder / "other");
        map.Destroy();
        EXPECT_EQ(folder.names(), Names{"other"});
        EXPECT_EQ(std::filesystem::is_empty(folder / "other"), !is_held);
        CloseHandle(holder);
    }
}

TEST(MemoryMap, finds_the_last_free_number_or_takes_the_heap) {
    const ScratchFolder folder;
    folder.write("odd"), folder.write("even");  // a file has at most about 65,000 names
    for (int number = 0; number < 65'535; ++number) {
        char name[20];
        std::snprintf(name, sizeof name, "~%07i.mem", number);
        ASSERT_TRUE(number == 54'321 || link((folder / (number % 2 != 0 ? "odd" : "even")).c_str(),
                                             (folder / name).c_str()) == 0);
    }
    const CMemoryMap map(SIZE);
    EXPECT_TRUE(std::filesystem::exists(folder / "~0054321.mem"));
    EXPECT_TRUE(is_zero_and_usable(CMemoryMap(SIZE), SIZE));
}

TEST(MemoryMap, clean_up_deletes_what_no_process_holds) {
    const ScratchFolder folder;
    const Names KEPT = {"x~0000001.mem", "~0000001.tmp", "~0000001.MEM",
                        "vma1.tmp",      "~folder.mem",  "~within"};
    std::filesystem::create_directory(folder / "~folder.mem");
    std::filesystem::create_directory(folder / "~within");
    for (const char* name :
         {"~0000001.mem", "~.mem", "~other~.mem", "~\xFF.mem", "x~0000001.mem", "~0000001.tmp",
          "~0000001.MEM", "vma1.tmp", "~within/kept.mem", "~within\\kept.mem"}) {
        folder.write(name);
    }
    const CMemoryMap map(SIZE);
    CMemoryMap::CleanUp();
    EXPECT_TRUE(std::filesystem::exists(folder / "~within/kept.mem"))
        << "a backslash in a name is no separator";
    const Names left = folder.names();
    EXPECT_TRUE(std::includes(left.begin(), left.end(), KEPT.begin(), KEPT.end()));
    EXPECT_EQ(left.size(), KEPT.size() + 1);
}

// A child that makes blocks and is killed, or exits, once it has said so.
pid_t child_with_blocks(int count, bool exits) {
    int ready[2];
    EXPECT_EQ(pipe(ready), 0);
    const pid_t child = fork();
    if (child == 0) {
        for (int i = 0; i < count; ++i) {
            bytes(*new CMemoryMap(SIZE))[SIZE - 1] = 'x';
        }
        EXPECT_EQ(write(ready[1], "!", 1), 1);
        exits ? std::exit(0) : static_cast<void>(pause());
    }
    char byte;
    EXPECT_EQ(read(ready[0], &byte, 1), 1);
    close(ready[0]), close(ready[1]);
    return child;
}

TEST(MemoryMap, files_of_killed_processes_are_deleted_and_those_of_living_ones_kept) {
    const ScratchFolder folder;
    const CMemoryMap ours(SIZE);
    waitpid(child_with_blocks(3, true), nullptr, 0);
    EXPECT_EQ(folder.names().size(), 1U) << "an exit takes its files along, and leaves the parent's";
    const pid_t killed = child_with_blocks(40, false), living = child_with_blocks(20, false);
    kill(killed, SIGKILL), waitpid(killed, nullptr, 0);
    EXPECT_EQ(folder.names().size(), 61U);
    CMemoryMap::CleanUp();
    EXPECT_EQ(folder.names().size(), 21U);
    kill(living, SIGKILL), waitpid(living, nullptr, 0);
    CMemoryMap::CleanUp();
    EXPECT_EQ(folder.names().size(), 1U);
}

// Constructed before any file is made, and so destroyed after those that are left have been deleted.
void (*at_the_end)() = nullptr;
const struct AtTheEnd {
    AtTheEnd() {}
    ~AtTheEnd() { at_the_end != nullptr ? at_the_end() : void(); }
} the_end;

TEST(MemoryMap, a_block_made_while_the_process_ends_leaves_no_file) {
    const ScratchFolder folder;
    basalt::test::in_child([] {
        at_the_end = [] { bytes(*new CMemoryMap(SIZE))[SIZE - 1] = 'x'; };
        const CMemoryMap first(SIZE);
        std::exit(0);
    });
    EXPECT_EQ(folder.names(), Names{});
}

}  // namespace
