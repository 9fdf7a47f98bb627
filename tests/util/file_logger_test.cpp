#include "basalt/util/file_logger.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/stat.h>

#include <algorithm>
#include <atomic>
#include <cerrno>
#include <csignal>
#include <random>
#include <thread>

#include "tests/support/child.h"
#include "tests/support/failing_new.h"
#include "tests/support/scratch_folder.h"

static std::atomic<std::size_t> taken_at_once = SIZE_MAX;

// Linked in place of the system's (--wrap): may take only a part, and fail with EINTR every other time.
extern "C" ssize_t __real_write(int file, const void* bytes, std::size_t count);
extern "C" ssize_t __wrap_write(int file, const void* bytes, std::size_t count) {
    static std::atomic<unsigned> calls = 0;
    errno = EINTR;
    const bool interrupts = taken_at_once != SIZE_MAX && ++calls % 2 == 0;
    return interrupts ? -1 : __real_write(file, bytes, std::min(count, taken_at_once.load()));
}

namespace {

using basalt::test::in_child;
using vex_util::FileLogger;

struct FileLog : testing::Test {
    const basalt::test::ScratchFolder folder;
    const std::string file = folder / "a log.txt", other = folder / "other";
    std::string contents(const std::string& name = "a log.txt") const { return folder.read(name); }
};

// Writes lines of up to 400 characters. What is in the file then.
std::string write_lines(FileLogger& log, int lines) {
    std::string all;
    for (int line = 0; line < lines; ++line) {
        const std::string text(static_cast<std::size_t>(line % 400), static_cast<char>('A' + line % 30));
        log.Write(CString((text + '\n').c_str()));
        all += text + "\r\n";
    }
    return all;
}

TEST_F(FileLog, opening_closes_first_and_a_file_that_cannot_be_opened_leaves_it_closed) {
    ASSERT_EQ(mkfifo(other.c_str(), 0600), 0);
    const char* const paths[] = {other.c_str(), "", "/none/log", "/tmp", nullptr};
    for (const char* const path : paths) {
        FileLogger log(file.c_str());
        EXPECT_EQ(contents(), "") << "opening empties the file";
        log.Write(L"text");
        EXPECT_EQ(contents(), "") << "nothing is flushed";
        log.Open(path);
        EXPECT_EQ(contents(), "text");
        log.Write(L"lost\n"), log.Close();
        EXPECT_EQ(contents(), "text");
    }
}

TEST_F(FileLog, texts_are_in_the_code_page_without_anything_between_them) {
    for (const char* const name : {"a log.txt", "caf\xE9", "half \xE2\x82", "a real \xEF\xBF\xBD"}) {
        FileLogger log((folder.path() + '\\' + name).c_str());
        for (const CString& text : {CString(L"a"), CString(), CString(L"b"), CString(L"\n\nhas one\r\nend|"),
                                    CString(L"5\x20AC \x1F30D \xD800|\0 lost", 15)}) {
            log.Write(text);
        }
        log.Close();
        EXPECT_EQ(contents(name), "ab\r\n\r\nhas one\r\r\nend|5\xE2\x82\xAC \xF0\x9F\x8C\x8D ?|") << name;
    }
}

TEST_F(FileLog, texts_of_every_length_arrive_whole_and_allocate_nothing) {
    std::mt19937 random(std::random_device{}());
    std::string expected;
    FileLogger opened(file.c_str()), log;
    log = std::move(opened);
    for (int round = 0; round < 300; ++round) {
        taken_at_once = round % 2 == 0 ? SIZE_MAX : 997;
        const int lengths[] = {1, 80, 255, 256, 257, 511, 513, 4095, 4096, 9000};
        CString text;
        for (int left = lengths[random() % std::size(lengths)]; left > 0; --left) {
            const auto kind = random() % 40;
            text += kind == 0 ? L'\n' : kind == 1 ? L'\xE9' : L'a';
            expected += kind == 0 ? "\r\n" : kind == 1 ? "\xC3\xA9" : "a";
        }
        const FailAllocation guard(1, true);
        log.Write(text);
        ASSERT_FALSE(guard.fired());
    }
    taken_at_once = SIZE_MAX;
    log.Close();
    EXPECT_EQ(contents(), expected);
}

TEST_F(FileLog, keeps_whole_texts_however_its_process_ends) {
    FileLogger closed;
    const auto killed = [&] {
        FileLogger log(file.c_str());
        write_lines(log, 1000);
        raise(SIGKILL);
    };
    in_child(killed, SIGKILL);
    EXPECT_EQ(contents(), write_lines(closed, 1000).substr(0, contents().size()));
    EXPECT_TRUE(contents().size() > 30'000 && contents().back() == '\n') << "at most a buffer is lost";
    in_child([&] {
        auto* const left = new FileLogger(file.c_str());
        FileLogger oldest, midst(other.c_str()), newest((folder / "newest").c_str());
        midst.Close();
        left->Write(L"parent;");
        in_child([] { std::exit(0); });
        EXPECT_EQ(contents(), "") << "a child leaves its parent's texts alone";
        in_child([&] { left->Write(L"child;"), std::exit(0); });
        EXPECT_EQ(contents(), "parent;child;");
        std::exit(HasFailure() ? 1 : 0);
    });
    EXPECT_EQ(contents(), "parent;child;parent;");
}

TEST_F(FileLog, children_forked_while_a_thread_writes_neither_hang_nor_write_twice) {
    FileLogger log(other.c_str());
    std::jthread writing([&](const std::stop_token& end) {
        while (!end.stop_requested()) {
            log.Write(L"of the parent\n");
        }
    });
    for (int round = 0; round < 50; ++round) {
        in_child([&] { log.Write(L"child\n"), log.Close(); });
    }
    writing = {};
    log.Close();
    const std::string both = contents("other");
    EXPECT_EQ(std::count(both.begin(), both.end(), 'c'), 50);
}

// No call ends the process by a signal or blocks.
TEST_F(FileLog, drops_what_the_system_does_not_take) {
    FileLogger log("/dev/full");
    const std::string all = write_lines(log, 1000);
    ASSERT_EQ(mkfifo(other.c_str(), 0600), 0);
    in_child([&] {
        const int reader = open(other.c_str(), O_RDONLY | O_NONBLOCK);
        log.Open(other.c_str());
        write_lines(log, 3000);  // more than a pipe holds
        char start[1000];
        EXPECT_TRUE(read(reader, start, 1000) == 1000 && all.starts_with(std::string(start, 1000)));
        close(reader);
        write_lines(log, 1000);
        rlimit limit;
        getrlimit(RLIMIT_FSIZE, &limit);
        limit.rlim_cur = 20'000;
        setrlimit(RLIMIT_FSIZE, &limit);
        log.Open(file.c_str());
        write_lines(log, 1000);
        log.Close();
    });
    EXPECT_EQ(contents(), all.substr(0, 20'000));
}

}  // namespace
