// Temporary blocks of several processes in one folder.
#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <csignal>
#include <cstdlib>
#include <memory>
#include <set>
#include <string>
#include <vector>

#include "basalt/memory/memory_map.h"
#include "tests/memory/mapped_bytes.h"
#include "tests/support/scratch_folder.h"

namespace {

using basalt::test::bytes;
using basalt::test::ScratchFolder;
using vex_util::CMemoryMap;
using Names = std::set<std::string>;

constexpr unsigned long SHARED_SIZE = 100'000;

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

// Does what a child has asked for when the files that are left have been deleted: it was made before any of
// them.
void (*at_the_end)() = nullptr;
const struct AtTheEnd {
    AtTheEnd() {}
    ~AtTheEnd() {
        if (at_the_end != nullptr) {
            at_the_end();
        }
    }
} the_end;

TEST(MemoryMapProcesses, many_processes_share_the_folder) {
    const ScratchFolder folder;
    {
        std::vector<std::unique_ptr<Child>> children;
        for (int i = 0; i < 6; ++i) {
            children.push_back(std::make_unique<Child>([](int ready) {
                static std::vector<CMemoryMap> maps(40);
                for (CMemoryMap& map : maps) {
                    map.Create(SHARED_SIZE);
                    std::fill_n(bytes(map), SHARED_SIZE, 'x');
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

TEST(MemoryMapProcesses, an_owner_that_exits_takes_its_files_along) {
    const ScratchFolder folder;
    CMemoryMap ours(SHARED_SIZE);
    Child child([](int ready) {
        static CMemoryMap* const map = new CMemoryMap(SHARED_SIZE);
        EXPECT_NE(bytes(*map), nullptr);
        Child::tell(ready);
    });
    child.end(0);  // waits for it
    EXPECT_EQ(folder.names().size(), 1U) << "those of its parent stay";
    bytes(ours)[SHARED_SIZE - 1] = 'x';
}

TEST(MemoryMapProcesses, a_block_made_while_the_process_ends_leaves_no_file) {
    const ScratchFolder folder;
    Child child([](int ready) {
        at_the_end = [] {
            static CMemoryMap* const late = new CMemoryMap(SHARED_SIZE);
            bytes(*late)[SHARED_SIZE - 1] = 'x';
        };
        const CMemoryMap first(SHARED_SIZE);
        Child::tell(ready);
    });
    child.end(0);
    EXPECT_EQ(folder.names(), Names{});
}

}  // namespace
