#include "basalt/util/file_logger.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <map>
#include <random>
#include <sstream>
#include <string>

#include "tests/support/failing_new.h"
#include "tests/support/locales.h"
#include "tests/support/open_descriptors.h"
#include "tests/support/scratch_folder.h"
#include "tests/support/threads.h"
#include "tests/support/with_failing_allocations.h"

namespace {

std::atomic<std::size_t> taken_at_once = SIZE_MAX;

}  // namespace

/// Stands in for the system's (linked with --wrap): it may take a part of what it is given, and a signal may
/// come before every other of its calls.
extern "C" {
ssize_t __real_write(int file, const void* bytes, std::size_t count);
ssize_t __wrap_write(int file, const void* bytes, std::size_t count) {
    static std::atomic<unsigned> calls = 0;
    if (taken_at_once != SIZE_MAX && ++calls % 2 == 0) {
        errno = EINTR;
        return -1;
    }
    return __real_write(file, bytes, std::min(count, taken_at_once.load()));
}
}

namespace {

using basalt::test::open_descriptors;
using vex_util::FileLogger;
namespace fs = std::filesystem;

std::string contents(const fs::path& file) {
    std::ifstream stream(file, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(stream), {});
}

using LineCounts = std::map<char, int>;

class FileLog : public testing::Test {
protected:
    static std::string line_of(char writer, int number) {
        return writer + (' ' + std::to_string(number) + ' ') +
               std::string(static_cast<std::size_t>(number % 80 + 1), 'x');
    }
    static void write_lines(FileLogger& log, char writer) {
        for (int number = 0; number < 1000; ++number) {
            log.Write(CString((line_of(writer, number) + '\n').c_str()));
        }
    }
    // How many lines of each writer the file holds, each of which has to be whole and in its turn.
    LineCounts lines_in_order() const {
        LineCounts counts;
        std::istringstream stream(contents(file));
        for (std::string line; std::getline(stream, line);) {
            int& number = counts[line[0]];
            EXPECT_EQ(line, line_of(line[0], number) + '\r');
            ++number;
        }
        return counts;
    }

    const basalt::test::ScratchFolder scratch;
    const fs::path folder = scratch.path();
    const fs::path file = folder / "a log.txt";
};

TEST_F(FileLog, opening_closes_first_and_what_cannot_be_opened_leaves_it_closed) {
    for (const char* const path :
         {static_cast<const char*>(nullptr), "", "/no such folder/log", folder.c_str()}) {
        FileLogger log(file.c_str());
        log.Write(L"text");
        log.Open(path);
        EXPECT_EQ(contents(file), "text");
        log.Write(L"lost\n");
        log.Close();
        EXPECT_EQ(contents(file), "text");
        fs::remove(file);
    }
    EXPECT_TRUE(fs::is_empty(folder));
}

TEST_F(FileLog, texts_follow_each_other_with_nothing_between) {
    std::ofstream(file) << "what was there before";
    FileLogger log(file.c_str());
    EXPECT_EQ(contents(file), "") << "opening empties the file";
    log.Write(L"a");
    log.Write(CString());
    log.Write(L"b");
    EXPECT_EQ(contents(file), "") << "nothing is flushed";
    log.Close();
    EXPECT_EQ(contents(file), "ab");
}

TEST_F(FileLog, text_is_in_the_code_page_with_two_characters_for_a_line_feed_and_ends_at_its_first_zero) {
    FileLogger log(file.c_str());
    log.Write(L"line\n");
    log.Write(L"\n\nhas one already\r\nend|");
    log.Write(CString(L"5\x20AC \x1F30D \xD800|\0 lost", 15));
    log.Close();
    EXPECT_EQ(contents(file), "line\r\n\r\n\r\nhas one already\r\r\nend|5\xE2\x82\xAC \xF0\x9F\x8C\x8D ?|");
}

TEST_F(FileLog, separators_are_told_in_names_that_are_no_text) {
    for (const char* const name : {"caf\xE9", "half \xE2\x82", "a real \xEF\xBF\xBD"}) {
        FileLogger log((folder.string() + '\\' + name).c_str());
        log.Write(L"text");
        log.Close();
        EXPECT_EQ(contents(folder / name), "text") << name;
    }
}

TEST_F(FileLog, texts_of_every_length_arrive_whole_and_take_no_memory) {
    const unsigned seed = std::random_device{}();
    SCOPED_TRACE(seed);
    std::mt19937 random(seed);
    std::string expected;
    bool took_memory = false;
    FileLogger log(file.c_str());
    for (int round = 0; round < 300; ++round) {
        const int lengths[] = {1, 80, 255, 256, 257, 511, 513, 4095, 4096, 9000};
        std::wstring text;
        for (int left = lengths[random() % std::size(lengths)]; left > 0; --left) {
            const auto kind = random() % 40;
            const auto letter = static_cast<char>('a' + kind % 26);
            text += kind == 0 ? L'\n' : kind == 1 ? L'\xE9' : static_cast<wchar_t>(letter);
            expected += kind == 0 ? "\r\n" : kind == 1 ? "\xC3\xA9" : std::string(1, letter);
        }
        const CString line(text.c_str());
        const FailAllocation guard(1, true);
        log.Write(line);
        took_memory |= guard.fired();
    }
    log.Close();
    EXPECT_EQ(contents(file), expected);
    EXPECT_FALSE(took_memory);
}

TEST_F(FileLog, killed_process_leaves_whole_texts) {
    GTEST_FLAG_SET(death_test_style, "fast");
    const auto write_and_die = [this] {
        FileLogger log(file.c_str());
        write_lines(log, 'a');
        std::raise(SIGKILL);
    };
    EXPECT_EXIT(write_and_die(), testing::KilledBySignal(SIGKILL), "");
    EXPECT_GT(lines_in_order()['a'], 800) << "at most a buffer of text is lost";
}

TEST_F(FileLog, threads_and_other_logs_on_the_file_do_not_cut_each_others_texts) {
    FileLogger log(file.c_str());
    FileLogger other(file.c_str());
    basalt::test::run_threads(4, [&](int writer) { write_lines(writer < 3 ? log : other, "abcd"[writer]); });
    log.Close();
    other.Close();
    EXPECT_EQ(lines_in_order(), (LineCounts{{'a', 1000}, {'b', 1000}, {'c', 1000}, {'d', 1000}}));
}

TEST_F(FileLog, what_a_log_left_open_holds_is_sent_once_when_its_process_exits) {
    GTEST_FLAG_SET(death_test_style, "fast");
    const auto leave_open = [&] {
        static FileLogger* const left = new FileLogger(file.c_str());
        static FileLogger* const another = new FileLogger((folder / "another").c_str());
        // in the midst of others that come and go
        FileLogger oldest((folder / "oldest").c_str());
        FileLogger midst((folder / "midst").c_str());
        FileLogger newest((folder / "newest").c_str());
        midst.Close();
        oldest.Close();
        left->Write(L"left");
        another->Write(L"another");
        // A child's end leaves its parent's texts alone.
        const pid_t child = fork();
        if (child == 0) {
            std::exit(0);
        }
        waitpid(child, nullptr, 0);
        EXPECT_EQ(contents(file), "");
        std::exit(testing::Test::HasFailure() ? 1 : 0);
    };
    EXPECT_EXIT(leave_open(), testing::ExitedWithCode(0), "");
    EXPECT_EQ(contents(file), "left");
    EXPECT_EQ(contents(folder / "another"), "another");
}

TEST_F(FileLog, what_a_forked_child_wrote_itself_is_sent_when_it_exits) {
    const auto become_a_daemon = [&] {
        auto* const log = new FileLogger(file.c_str());
        log->Write(L"parent;");
        const pid_t child = fork();
        if (child != 0) {
            waitpid(child, nullptr, 0);
            _exit(0);
        }
        log->Write(L"child;");
        std::exit(0);
    };
    EXPECT_EXIT(become_a_daemon(), testing::ExitedWithCode(0), "");
    EXPECT_EQ(contents(file), "parent;child;");
}

TEST_F(FileLog, a_child_forked_while_threads_write_writes_too_and_sends_nothing_twice) {
    FileLogger log(file.c_str());
    log.Write(L"parent");
    FileLogger other((folder / "other").c_str());
    std::atomic<bool> over{false};
    std::thread writing([&] {
        while (!over) {
            other.Write(L"some text of the parent that is being written\n");
        }
    });
    for (int round = 0; round < 50; ++round) {
        const pid_t child = fork();
        if (child == 0) {
            alarm(10);
            log.Close();
            other.Write(L"child\n");
            other.Close();
            std::_Exit(0);
        }
        int status = -1;
        waitpid(child, &status, 0);
        ASSERT_EQ(status, 0) << "the child waits for a thread that it does not have";
    }
    over = true;
    writing.join();
    log.Close();
    other.Close();
    EXPECT_EQ(contents(file), "parent") << "from the parent alone";
    const std::string text = contents(folder / "other");
    std::size_t children = 0;
    for (std::size_t at = 0; (at = text.find("child\r\n", at)) != std::string::npos; ++at) {
        ++children;
    }
    EXPECT_EQ(children, 50U);
}

TEST_F(FileLog, what_the_system_takes_in_parts_is_whole) {
    FileLogger log(file.c_str());
    taken_at_once = 7;
    write_lines(log, 'a');
    log.Close();
    taken_at_once = SIZE_MAX;
    EXPECT_EQ(lines_in_order(), (LineCounts{{'a', 1000}}));
}

TEST_F(FileLog, full_disk_is_silent) {
    FileLogger log("/dev/full");
    write_lines(log, 'a');
    log.Open(file.c_str());
    log.Write(L"still usable");
    log.Close();
    EXPECT_EQ(contents(file), "still usable");
}

TEST_F(FileLog, pipe_that_nobody_reads_is_refused_and_one_that_is_read_is_written_to) {
    const fs::path pipe = folder / "pipe";
    ASSERT_EQ(mkfifo(pipe.c_str(), 0600), 0);
    alarm(20);  // a call that waits for a reader ends here
    FileLogger log(pipe.c_str());
    log.Write(L"lost");
    log.Close();
    const int reader = open(pipe.c_str(), O_RDONLY | O_NONBLOCK);
    log.Open(pipe.c_str());
    const CString text(L'x', 100'000);  // more than a pipe holds
    std::size_t taken = 0;
    std::thread reading([&] {
        char bytes[4096];
        for (ssize_t count = -1; count != 0 || taken == 0; count = read(reader, bytes, sizeof bytes)) {
            taken += count > 0 ? static_cast<std::size_t>(count) : 0;
            std::this_thread::yield();
        }
    });
    log.Write(text);
    log.Close();
    reading.join();
    EXPECT_EQ(taken, 100'000U);
    close(reader);
    alarm(0);
}

TEST_F(FileLog, limit_on_file_sizes_is_silent) {
    constexpr rlim_t LIMIT = 20'000;
    const auto log_beyond_it = [&] {
        rlimit limit = {};
        getrlimit(RLIMIT_FSIZE, &limit);
        limit.rlim_cur = LIMIT;
        setrlimit(RLIMIT_FSIZE, &limit);
        FileLogger log(file.c_str());
        write_lines(log, 'a');
        log.Close();
        std::_Exit(fs::file_size(file) == LIMIT ? 0 : 1);
    };
    GTEST_FLAG_SET(death_test_style, "fast");
    EXPECT_EXIT(log_beyond_it(), testing::ExitedWithCode(0), "");
}

TEST_F(FileLog, opening_without_memory_is_silent_and_leaves_no_file_open) {
    const auto before = open_descriptors();
    FileLogger log;
    with_failing_allocations([&] { log.Open(file.c_str()); },
                             [&](bool fired) {
                                 EXPECT_EQ(open_descriptors(), before + (fired ? 0 : 1));
                                 log.Write(L"text");
                                 log.Close();
                                 EXPECT_EQ(fs::exists(file) ? contents(file) : "", fired ? "" : "text");
                             });
}

// In encodings other than UTF-8, of locales made here; each in a process of its own, since the environment is
// read once.
TEST_F(FileLog, follows_the_environments_encoding) {
    struct Row {
        const char* charmap;
        std::string name, name_on_disk;
        std::wstring text;
        std::string expected;
    };
    const std::wstring most_of_a_piece(255, L'x');
    const test_locales::Folder locales;
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    for (const Row& row :
         {Row{"ISO-8859-15", "caf\xE9", "caf\xC3\xA9", L"\x20AC \xE9 \x65E5 \xD800\n", "\xA4 \xE9 ? ?\r\n"},
          Row{"EUC-JP", "caf\x8F\xAB\xB1\\\xC6", "caf\xC3\xA9/\xC6", L"\x20AC \xE9 \x65E5 \xD800\n",
              "? \x8F\xAB\xB1 \xC6\xFC ?\r\n"},
          // A letter at the end of what is converted at once waits for its mark, or for nothing.
          Row{"BIG5-HKSCS", "log", "log",
              most_of_a_piece + L"\xCA\x304\n" + most_of_a_piece.substr(2) + L"\xCA\nz\xCA",
              std::string(255, 'x') + "\x88\x62\r\n" + std::string(253, 'x') + "\x88\x66\r\nz\x88\x66"}}) {
        if (!locales.has(row.charmap)) {
            GTEST_SKIP() << "localedef cannot make the locales";
        }
        const auto log_in_that_locale = [&] {
            locales.enter(row.charmap);
            const fs::path on_disk = folder / row.name_on_disk;
            fs::create_directories(on_disk.parent_path());
            FileLogger log((folder.string() + "/" + row.name).c_str());
            log.Write(row.text.c_str());
            log.Close();
            const bool right = contents(on_disk) == row.expected;
            fs::remove_all(folder);  // of the test that runs again in this process
            std::_Exit(right ? 0 : 1);
        };
        EXPECT_EXIT(log_in_that_locale(), testing::ExitedWithCode(0), "") << row.charmap;
    }
}

}  // namespace
