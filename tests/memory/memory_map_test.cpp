#include "basalt/memory/memory_map.h"

#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <functional>
#include <memory>
#include <regex>
#include <set>
#include <string>
#include <thread>
#include <type_traits>
#include <vector>

#include "tests/support/failing_new.h"
#include "tests/support/scratch_folder.h"
#include "tests/support/system_failures.h"

namespace {
thread_local bool heap_is_exhausted = false;
}

extern "C" {
void* __real_calloc(size_t, size_t);
void* __wrap_calloc(size_t count, size_t size) {
    return heap_is_exhausted ? nullptr : __real_calloc(count, size);
}
}

namespace {

using basalt::test::mapped_balance;
using basalt::test::open_descriptors;
using basalt::test::ScratchFolder;
using basalt::test::SystemFailure;
using vex_util::CMemoryMap;
using Names = std::set<std::string>;

constexpr unsigned long SIZE = 100'000;

char* bytes(const CMemoryMap& map) {
    return static_cast<char*>(static_cast<void*>(map));
}

bool is_usable(const CMemoryMap& map, std::size_t size) {
    char* const data = bytes(map);
    if (data == nullptr || std::count(data, data + size, 0) != static_cast<long>(size)) {
        return false;
    }
    std::fill_n(data, size, 'x');
    return true;
}

// A child process that runs a function with one end of a pipe, and is over when this is.
class Child {
public:
    template <class Body>
    explicit Child(Body body) {
        int ready[2];
        EXPECT_EQ(pipe(ready), 0);
        m_process = fork();
        if (m_process == 0) {
            close(ready[0]);
            body(ready[1]);
            std::exit(0);
        }
        close(ready[1]);
        char byte;
        EXPECT_EQ(read(ready[0], &byte, 1), 1);  // its maps stand
        close(ready[0]);
    }
    ~Child() { end(SIGKILL); }
    Child(const Child&) = delete;
    Child& operator=(const Child&) = delete;

    void end(int signal) {
        if (m_process > 0) {
            kill(m_process, signal);
            waitpid(m_process, nullptr, 0);
            m_process = 0;
        }
    }

    static void tell(int ready) { EXPECT_EQ(write(ready, "!", 1), 1); }
    [[noreturn]] static void tell_and_wait(int ready) {
        tell(ready);
        for (;;) {
            pause();
        }
    }

private:
    pid_t m_process;
};

TEST(MemoryMap, is_a_hidden_file_while_it_lives) {
    const ScratchFolder folder;
    const long mapped = mapped_balance();
    const long descriptors = open_descriptors();
    {
        CMemoryMap map(SIZE);
        EXPECT_TRUE(is_usable(map, SIZE));
        ASSERT_EQ(folder.names().size(), 1U);
        const std::string name = *folder.names().begin();
        EXPECT_TRUE(std::regex_match(name, std::regex("~00\\d{5}\\.mem"))) << name;
        EXPECT_EQ(std::filesystem::file_size(folder / name), SIZE);
        EXPECT_EQ(open_descriptors(), descriptors);

        EXPECT_TRUE(map.Create(2 * SIZE)) << "the first block and its file are given up";
        EXPECT_TRUE(is_usable(map, 2 * SIZE));
        EXPECT_EQ(folder.names().size(), 1U);
        EXPECT_TRUE(map.Destroy());
        EXPECT_EQ(bytes(map), nullptr);
        EXPECT_EQ(folder.names(), Names{});
        EXPECT_TRUE(map.Destroy());
        EXPECT_TRUE(map.Create(1));
    }
    EXPECT_EQ(folder.names(), Names{});
    EXPECT_EQ(mapped_balance(), mapped);
    CMemoryMap empty;
    EXPECT_EQ(bytes(empty), nullptr);
    EXPECT_TRUE(empty.Destroy());
    static_assert(!std::is_copy_constructible_v<CMemoryMap> && !std::is_copy_assignable_v<CMemoryMap>);
}

TEST(MemoryMap, without_a_file_it_is_on_the_heap) {
    const ScratchFolder folder;
    const long mapped = mapped_balance();
    for (const std::string& place :
         {folder / "missing", std::string(300, 'x'), folder / std::string(238, 'y')}) {
        ScratchFolder::set_temporary(place);
        CMemoryMap map(1024);
        EXPECT_TRUE(is_usable(map, 1024));
        CMemoryMap::CleanUp();
        EXPECT_EQ(mapped_balance(), mapped);
    }
    ScratchFolder::set_temporary(folder.path());
    CMemoryMap none(0);
    EXPECT_NE(bytes(none), nullptr);
    EXPECT_EQ(folder.names(), Names{});
    CMemoryMap map(SIZE);
    EXPECT_FALSE(map.Create(0x100000001)) << "refused, not cut to one byte";
    EXPECT_EQ(bytes(map), nullptr);
    EXPECT_EQ(folder.names(), Names{});
    heap_is_exhausted = true;
    const bool is_made = map.Create(0);
    heap_is_exhausted = false;
    EXPECT_FALSE(is_made);
    EXPECT_EQ(bytes(map), nullptr);
}

// Of a folder's 245 characters, two separators and 12 of the file's own name comes 259.
TEST(MemoryMap, the_longest_name_that_fits) {
    const ScratchFolder folder;
    for (const std::size_t length : {245U, 246U}) {
        const std::string place = folder / std::string(length - folder.path().size() - 1, 'd');
        ASSERT_EQ(place.size(), length);
        std::filesystem::create_directory(place);
        ScratchFolder::set_temporary(place);
        const CMemoryMap map(SIZE);
        EXPECT_NE(bytes(map), nullptr);
        EXPECT_EQ(std::filesystem::is_empty(place), length == 246) << length;
    }
}

TEST(MemoryMap, deletes_the_file_it_made_wherever_the_folder_is_by_then) {
    const ScratchFolder folder;
    std::filesystem::create_directory(folder / "other");
    CMemoryMap map(SIZE);
    const std::string name = *folder.names().begin();
    folder.write("other/" + name, "not ours");
    ScratchFolder::set_temporary(folder / "other");
    map.Destroy();
    EXPECT_EQ(folder.names(), Names{"other"});
    EXPECT_TRUE(std::filesystem::exists(folder / ("other/" + name)));
}

TEST(MemoryMap, a_thousand_names_taken_lead_to_the_heap) {
    const ScratchFolder folder;
    CMemoryMap map;
    {
        const SystemFailure taken(1, SystemFailure::Then::STAYS, EEXIST);
        EXPECT_TRUE(map.Create(SIZE));
    }
    EXPECT_TRUE(is_usable(map, SIZE));
    EXPECT_EQ(folder.names(), Names{});
    {
        const SystemFailure taken(1, SystemFailure::Then::RECOVERS, EEXIST);
        EXPECT_TRUE(map.Create(SIZE)) << "the next number is free";
    }
    EXPECT_EQ(folder.names().size(), 1U);
}

TEST(MemoryMap, many_processes_share_the_folder) {
    const ScratchFolder folder;
    {
        std::vector<std::unique_ptr<Child>> children;
        for (int i = 0; i < 6; ++i) {
            children.push_back(std::make_unique<Child>([](int ready) {
                static std::vector<CMemoryMap> maps(40);
                for (CMemoryMap& map : maps) {
                    map.Create(SIZE);
                    std::fill_n(bytes(map), SIZE, 'x');
                }
                Child::tell_and_wait(ready);
            }));
        }
        EXPECT_EQ(folder.names().size(), 240U);
        CMemoryMap::CleanUp();
        EXPECT_EQ(folder.names().size(), 240U);
        children.front()->end(SIGKILL);
        EXPECT_EQ(folder.names().size(), 240U) << "nobody had the time to delete them";
        CMemoryMap::CleanUp();
        EXPECT_EQ(folder.names().size(), 200U);
    }
    CMemoryMap::CleanUp();
    EXPECT_EQ(folder.names(), Names{});
}

TEST(MemoryMap, an_owner_that_exits_takes_its_files_along) {
    const ScratchFolder folder;
    CMemoryMap ours(SIZE);
    Child child([](int ready) {
        static CMemoryMap* const map = new CMemoryMap(SIZE);
        EXPECT_NE(bytes(*map), nullptr);
        Child::tell(ready);
    });
    child.end(0);  // waits for it
    EXPECT_EQ(folder.names().size(), 1U) << "those of its parent stay";
    EXPECT_TRUE(is_usable(ours, SIZE));
}

TEST(MemoryMap, clean_up_deletes_what_nobody_holds) {
    const ScratchFolder folder;
    CMemoryMap::CleanUp();
    for (const char* name : {"~0000001.mem", "~.mem", "~other~.mem", "~\xFF.mem", "x~0000001.mem",
                             "~0000001.tmp", "~0000001.MEM", "vma1.tmp"}) {
        folder.write(name);
    }
    std::filesystem::create_directory(folder / "~folder.mem");
    const CMemoryMap map(SIZE);
    CMemoryMap::CleanUp();
    Names left = folder.names();
    for (const char* name : {"x~0000001.mem", "~0000001.tmp", "~0000001.MEM", "vma1.tmp", "~folder.mem"}) {
        EXPECT_EQ(left.erase(name), 1U) << name;
    }
    EXPECT_EQ(left.size(), 1U);
    bytes(map)[SIZE - 1] = 'x';
}

TEST(MemoryMap, clean_up_beside_creation_never_takes_a_living_file) {
    const ScratchFolder folder;
    const auto make = [&folder](int& lost) {
        for (int i = 0; i < 300; ++i) {
            const CMemoryMap map(4096);
            const std::size_t files = folder.names().size();
            lost += files == 0 ? 1 : 0;
            CMemoryMap::CleanUp();
        }
    };
    int lost = 0, lost_too = 0;
    std::thread other(make, std::ref(lost_too));
    make(lost);
    other.join();
    EXPECT_EQ(lost + lost_too, 0);
    EXPECT_EQ(folder.names(), Names{});
}

TEST(MemoryMap, every_failing_call_is_made_up_for_by_the_heap) {
    const ScratchFolder folder;
    const long mapped = mapped_balance();
    const long descriptors = open_descriptors();
    const long live = live_allocations();
    for (const auto then : {SystemFailure::Then::RECOVERS, SystemFailure::Then::STAYS}) {
        bool fails = true;
        for (int n = 1; fails; ++n) {
            CMemoryMap map;
            bool is_made = false;
            {
                const SystemFailure failure(n, then);
                is_made = map.Create(SIZE);
                fails = SystemFailure::struck();
            }
            EXPECT_TRUE(is_made);
            EXPECT_TRUE(is_usable(map, SIZE));
            EXPECT_EQ(folder.names().size(), fails ? 0U : 1U) << n;
            EXPECT_EQ(open_descriptors(), descriptors);
            {
                CMemoryMap none;
                const SystemFailure failure(1, then);
                heap_is_exhausted = true;
                is_made = none.Create(SIZE);
                heap_is_exhausted = false;
            }
            EXPECT_FALSE(is_made);
            map.Destroy();
            EXPECT_EQ(folder.names(), Names{});
        }
    }
    bool has_failed = true;
    for (long n = 1; has_failed; ++n) {
        CMemoryMap map;
        {
            const FailAllocation failure(n);
            map.Create(SIZE);
            has_failed = failure.fired();
        }
        EXPECT_TRUE(is_usable(map, SIZE));
        EXPECT_EQ(folder.names().size(), has_failed ? 0U : 1U) << n;
        folder.write("~stale.mem");
        {
            const FailAllocation failure(n);
            CMemoryMap::CleanUp();
        }
        std::filesystem::remove(folder / "~stale.mem");
        EXPECT_EQ(open_descriptors(), descriptors);
    }
    EXPECT_EQ(live_allocations(), live);
    EXPECT_EQ(mapped_balance(), mapped);
}

}  // namespace
