#include "basalt/util/file_logger.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <optional>
#include <random>
#include <sstream>
#include <string>
#include <vector>

#include "tests/support/failing_new.h"
#include "tests/support/locales.h"
#include "tests/support/open_descriptors.h"
#include "tests/support/scratch_folder.h"
#include "tests/support/threads.h"
#include "tests/support/with_failing_allocations.h"

namespace {

std::atomic<std::size_t> taken_at_once = SIZE_MAX;

}  // namespace

/// Stands in for the system's (linked with --wrap): it may take a part of what it is given.
extern "C" {
ssize_t __real_write(int file, const void* bytes, std::size_t count);
ssize_t __wrap_write(int file, const void* bytes, std::size_t count) {
    return __real_write(file, bytes, std::min(count, taken_at_once.load()));
}
}

namespace {

using basalt::test::open_descriptors;
using vex_util::FileLogger;
namespace fs = std::filesystem;
using namespace std::string_literals;

std::string contents(const fs::path& file) {
    std::ifstream stream(file, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(stream), {});
}

class FileLog : public testing::Test {
protected:
    // The lines of the file, each of which has to be "<writer> <number> <filler>".
    static std::vector<int> counted_lines(const std::string& text, char writer) {
        std::vector<int> numbers;
        std::istringstream stream(text);
        for (std::string line; std::getline(stream, line, '\n');) {
            char who = '\0';
            int number = -1;
            char filler[100] = "";
            char end = '\0';
            EXPECT_EQ(std::sscanf(line.c_str(), "%c %d %99[x]%c", &who, &number, filler, &end), 4) << line;
            EXPECT_EQ(end, '\r');
            EXPECT_EQ(std::string(filler).size(), static_cast<std::size_t>(number % 80 + 1)) << line;
            if (who == writer) {
                numbers.push_back(number);
            }
        }
        return numbers;
    }
    static void write_line(FileLogger& log, char writer, int number) {
        CString line;
        line.Format(L"%c %d %s\n", writer, number,
                    std::string(static_cast<std::size_t>(number % 80 + 1), 'x').c_str());
        log.Write(line);
    }
    static std::vector<int> up_to(std::size_t count) {
        std::vector<int> numbers(count);
        for (std::size_t i = 0; i < count; ++i) {
            numbers[i] = static_cast<int>(i);
        }
        return numbers;
    }

    const basalt::test::ScratchFolder scratch;
    const fs::path folder = scratch.path();
    const fs::path file = folder / "a log.txt";
};

TEST_F(FileLog, closed_log_ignores_writes) {
    for (const char* const path :
         {static_cast<const char*>(nullptr), "", "/no such folder/log", folder.c_str()}) {
        FileLogger log(path);
        log.Write(L"lost\n");
        log.Close();
    }
    FileLogger().Write(L"lost\n");
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
    log.Write(L"lost");
    EXPECT_EQ(contents(file), "ab");
}

TEST_F(FileLog, each_line_feed_becomes_two_characters) {
    {
        FileLogger log(file.c_str());
        log.Write(L"line\n");
        log.Write(L"\n\nhas one already\r\nend");
    }
    EXPECT_EQ(contents(file), "line\r\n\r\n\r\nhas one already\r\r\nend");
}

TEST_F(FileLog, text_is_in_the_code_page_and_ends_at_its_first_zero) {
    {
        FileLogger log(file.c_str());
        log.Write(CString(L"5\x20AC \x1F30D \xD800|\0 lost", 15));
    }
    EXPECT_EQ(contents(file), "5\xE2\x82\xAC \xF0\x9F\x8C\x8D ?|");
}

TEST_F(FileLog, opening_closes_first_whatever_the_new_path) {
    const std::string missing = (folder / "none" / "log").string();
    int text = 0;
    for (const char* const path : {static_cast<const char*>(nullptr), "", missing.c_str()}) {
        FileLogger log(file.c_str());
        const std::string expected = std::to_string(++text);
        log.Write(CString(expected.c_str()));
        log.Open(path);
        log.Write(L"lost");
        EXPECT_EQ(contents(file), expected);
    }
    FileLogger log(file.c_str());
    log.Write(L"first");
    log.Open((folder.string() + "\\second").c_str());  // either separator
    log.Write(L"second");
    log.Close();
    EXPECT_EQ(contents(file), "first");
    EXPECT_EQ(contents(folder / "second"), "second");
}

TEST_F(FileLog, separators_are_told_in_names_that_are_no_text) {
    for (const char* const name : {"caf\xE9", "half \xE2\x82", "a real \xEF\xBF\xBD"}) {
        FileLogger log((folder.string() + '\\' + name).c_str());
        log.Write(L"text");
        log.Close();
        EXPECT_EQ(contents(folder / name), "text") << name;
    }
}

TEST_F(FileLog, texts_of_every_length_arrive_whole) {
    const unsigned seed = std::random_device{}();
    SCOPED_TRACE(seed);
    std::mt19937 random(seed);
    std::string expected;
    FileLogger log(file.c_str());
    for (int round = 0; round < 300; ++round) {
        const int lengths[] = {1, 80, 255, 256, 257, 511, 513, 4095, 4096, 9000};
        std::wstring text;
        for (int left = lengths[random() % std::size(lengths)]; left > 0; --left) {
            const int kind = static_cast<int>(random() % 40);
            text += kind == 0 ? L'\n' : kind == 1 ? L'\xE9' : static_cast<wchar_t>(L'a' + kind % 26);
            expected += kind == 0   ? "\r\n"s
                        : kind == 1 ? "\xC3\xA9"s
                                    : std::string(1, static_cast<char>('a' + kind % 26));
        }
        log.Write(CString(text.c_str()));
    }
    log.Close();
    EXPECT_EQ(contents(file), expected);
}

TEST_F(FileLog, writing_takes_no_memory) {
    FileLogger log(file.c_str());
    const CString line(L"2021-02-01 12:00:00 RTK fixed, age 0.8 s\n");
    const CString long_text(L'x', 10'000);
    bool took_memory;
    {
        const FailAllocation guard(1, true);
        for (int i = 0; i < 1000; ++i) {
            log.Write(line);
        }
        log.Write(long_text);
        took_memory = guard.fired();
    }
    EXPECT_FALSE(took_memory);
}

TEST_F(FileLog, killed_process_leaves_whole_texts) {
    GTEST_FLAG_SET(death_test_style, "fast");
    const auto write_and_die = [this] {
        FileLogger log(file.c_str());
        for (int i = 0; i < 1000; ++i) {
            write_line(log, 'a', i);
        }
        std::raise(SIGKILL);
    };
    EXPECT_EXIT(write_and_die(), testing::KilledBySignal(SIGKILL), "");
    const std::vector<int> lines = counted_lines(contents(file), 'a');
    EXPECT_GT(lines.size(), 800U) << "at most a buffer of text is lost";
    EXPECT_EQ(lines, up_to(lines.size()));
}

TEST_F(FileLog, two_logs_on_one_file_do_not_cut_each_others_texts) {
    FileLogger a(file.c_str());
    FileLogger b(file.c_str());
    for (int i = 0; i < 1000; ++i) {
        write_line(a, 'a', i);
        write_line(b, 'b', i);
    }
    a.Close();
    b.Close();
    EXPECT_EQ(counted_lines(contents(file), 'a'), up_to(1000));
    EXPECT_EQ(counted_lines(contents(file), 'b'), up_to(1000));
}

TEST_F(FileLog, threads_write_whole_texts) {
    FileLogger log(file.c_str());
    basalt::test::run_threads(3, [&](int writer) {
        for (int i = 0; i < 500; ++i) {
            write_line(log, "abc"[writer], i);
        }
    });
    log.Close();
    for (const char writer : {'a', 'b', 'c'}) {
        EXPECT_EQ(counted_lines(contents(file), writer), up_to(500));
    }
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

TEST_F(FileLog, what_the_system_takes_in_parts_is_whole) {
    FileLogger log(file.c_str());
    taken_at_once = 7;
    for (int i = 0; i < 1000; ++i) {
        write_line(log, 'a', i);
    }
    log.Close();
    taken_at_once = SIZE_MAX;
    EXPECT_EQ(counted_lines(contents(file), 'a'), up_to(1000));
}

TEST_F(FileLog, full_disk_is_silent) {
    FileLogger log("/dev/full");
    for (int i = 0; i < 1000; ++i) {
        write_line(log, 'a', i);
    }
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
        for (int i = 0; i < 1000; ++i) {
            write_line(log, 'a', i);
        }
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
            fs::create_directories((folder / row.name_on_disk).parent_path());
            FileLogger log((folder.string() + "/" + row.name).c_str());
            log.Write(row.text.c_str());
            log.Close();
            const bool right = contents(folder / row.name_on_disk) == row.expected;
            fs::remove_all(folder);  // of the test that runs again in this process
            std::_Exit(right ? 0 : 1);
        };
        EXPECT_EXIT(log_in_that_locale(), testing::ExitedWithCode(0), "") << row.charmap;
    }
}

}  // namespace
