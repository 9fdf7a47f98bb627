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

using basalt::test::ScratchFolder;
using vex_util::CMemoryMap;
using Names = std::set<std::string>;

constexpr unsigned long SIZE = 100'000;

char* bytes(const CMemoryMap& map) {
    return static_cast<char*>(static_cast<void*>(map));
}

bool is_zero_and_usable(const CMemoryMap& map, std::size_t size = SIZE) {
    char* const data = bytes(map);
    return data != nullptr && std::count(data, data + size, 0) == static_cast<long>(size) &&
           std::fill_n(data, size, 'x') != nullptr;
}

TEST(MemoryMap, is_a_hidden_file_while_it_lives) {
    const ScratchFolder folder;
    const long descriptors = basalt::test::open_descriptors();
    CMemoryMap map(SIZE);
    EXPECT_TRUE(is_zero_and_usable(map));
    const std::string name = *folder.names().begin();
    EXPECT_EQ(name.substr(0, 3) + name.substr(8), "~00.mem");
    EXPECT_EQ(std::filesystem::file_size(folder / name), SIZE);
    EXPECT_EQ(basalt::test::open_descriptors(), descriptors);
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
    std::string deep = folder / "";
    deep.resize(245, 'd');
    std::filesystem::create_directory(deep), std::filesystem::create_directory(deep + "d");
    for (const std::string& place : {folder / "missing", std::string(300, 'x'), deep + "d", deep}) {
        ScratchFolder::set_temporary(place);
        const CMemoryMap map(SIZE);
        EXPECT_TRUE(is_zero_and_usable(map));
        CMemoryMap::CleanUp();
        EXPECT_EQ(std::filesystem::is_empty(deep), place != deep) << place;
        EXPECT_TRUE(std::filesystem::is_empty(deep + "d"));
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
        const std::string other = "other/" + *folder.names().rbegin();
        folder.write(other);
        const HANDLE holder =
            CreateFileW(folder.wide({other.begin(), other.end()}).c_str(), GENERIC_READ | GENERIC_WRITE, 0,
                        nullptr, OPEN_EXISTING, 0, nullptr);
        is_held ? 1 : CloseHandle(holder);
        ScratchFolder::set_temporary(folder / "other");
        map.Destroy();
        EXPECT_EQ(folder.names(), Names{"other"});
        EXPECT_EQ(std::filesystem::is_empty(folder / "other"), !is_held);
        is_held ? CloseHandle(holder) : 0;
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
    EXPECT_TRUE(is_zero_and_usable(CMemoryMap(SIZE)));
}

TEST(MemoryMap, clean_up_deletes_what_no_process_holds) {
    const ScratchFolder folder;
    std::filesystem::create_directory(folder / "~within");
    const Names kept = {"x~0000001.mem", "~0000001.tmp", "~0000001.MEM", "~within/kept.mem"};
    std::ranges::for_each(kept, [&](const std::string& name) { folder.write(name); });
    for (const char* name : {"~.mem", "~other~.mem", "~\xFF.mem", "~within\\kept.mem"}) {
        folder.write(name);
    }
    const CMemoryMap map(SIZE);
    CMemoryMap::CleanUp();
    EXPECT_EQ(folder.names().size(), kept.size() + 1) << "and the map's";
    EXPECT_TRUE(
        std::ranges::all_of(kept, [&](auto& name) { return std::filesystem::exists(folder / name); }));
}

// A child that makes blocks and stops; when continued, it exits.
pid_t child_with_blocks(int count) {
    const pid_t child = fork();
    if (child == 0) {
        static CMemoryMap* s_blocks[40];  // reachable for the leak search
        for (; count > 0; --count) {
            s_blocks[count - 1] = new CMemoryMap(SIZE);
            bytes(*s_blocks[count - 1])[SIZE - 1] = 'x';
        }
        raise(SIGSTOP), std::exit(0);
    }
    waitpid(child, nullptr, WUNTRACED);
    return child;
}

TEST(MemoryMap, files_of_killed_processes_are_deleted_and_those_of_living_ones_kept) {
    const ScratchFolder folder;
    const CMemoryMap ours(SIZE);
    const pid_t killed = child_with_blocks(40), living = child_with_blocks(20),
                exiting = child_with_blocks(3);
    kill(exiting, SIGCONT), waitpid(exiting, nullptr, 0);
    EXPECT_EQ(folder.names().size(), 61U) << "an exit takes its files along, and leaves the parent's";
    kill(killed, SIGKILL), waitpid(killed, nullptr, 0);
    EXPECT_EQ(folder.names().size(), 61U);
    CMemoryMap::CleanUp();
    EXPECT_EQ(folder.names().size(), 21U);
    kill(living, SIGKILL), waitpid(living, nullptr, 0);
    CMemoryMap::CleanUp();
    EXPECT_EQ(folder.names().size(), 1U);
}

// Constructed before any file is made, and so destroyed after those that are left have been deleted.
void (*at_the_end)() = [] {};
const struct AtTheEnd {
    ~AtTheEnd() { at_the_end(); }
} the_end{};

TEST(MemoryMap, a_block_made_while_the_process_ends_leaves_no_file) {
    const ScratchFolder folder;
    basalt::test::in_child([] {
        at_the_end = [] {
            static CMemoryMap* const s_last = new CMemoryMap(SIZE);  // reachable for the leak search
            bytes(*s_last)[SIZE - 1] = 'x';
        };
        const CMemoryMap first(SIZE);
        std::exit(0);
    });
    EXPECT_EQ(folder.names(), Names{});
}

}  // namespace
