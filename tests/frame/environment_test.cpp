#include <gtest/gtest.h>
#include <time.h>

#include <algorithm>
#include <bit>
#include <cstdlib>
#include <tuple>
#include <vector>

#include "src/frame/environment_state.h"
#include "src/frame/os_detection.h"

namespace {

using basalt::frame::environment;

DWORD fake_major = 6;
DWORD fake_minor = 2;  // beyond 99: the query fails
int queries = 0;
std::uint64_t milliseconds = 0;

}  // namespace

// The linker's --wrap puts these in place of the version query and the system's clock.
extern "C" {
int __wrap_clock_gettime(clockid_t, timespec* time) {
    *time = {static_cast<time_t>(milliseconds / 1000),
             static_cast<long>(milliseconds % 1000) * 1'000'000 + 999'999};
    return 0;
}
BOOL __wrap__Z13GetVersionExWP14OSVERSIONINFOW(OSVERSIONINFOW* version) {
    ++queries;
    *version = {version->dwOSVersionInfoSize, fake_major, fake_minor, 0, 2, {}};
    return static_cast<BOOL>(fake_minor < 100 && version->dwOSVersionInfoSize == 276);
}
}

namespace {

TEST(Environment, operating_system_codes) {
    constexpr DWORD ROWS[][4] = {{0, 0, 0, 1},  {0, 3, 10, 1}, {1, 4, 0, 2},  {1, 9, 0, 2},  {1, 4, 10, 3},
                                 {1, 4, 90, 4}, {1, 4, 1, 0},  {1, 4, 91, 0}, {1, 4, 9, 0},  {1, 4, 11, 0},
                                 {1, 4, 89, 0}, {2, 3, 51, 0}, {2, 4, 0, 5},  {2, 4, 77, 5}, {2, 5, 0, 6},
                                 {2, 5, 1, 7},  {2, 5, 2, 7},  {2, 5, 3, 0},  {2, 6, 0, 9},  {2, 6, 1, 10},
                                 {2, 6, 2, 11}, {2, 6, 3, 0},  {2, 10, 0, 0}, {2, 0, 0, 0},  {3, 6, 2, 0}};
    for (const auto& [platform, major, minor, code] : ROWS) {
        const OSVERSIONINFOW version{276, major, minor, 0, platform, {}};
        EXPECT_EQ(basalt::frame::release_code(version), code) << platform << ' ' << major << '.' << minor;
    }
    environment.os_code.store(0);
    for (const auto& [next_major, next_minor, code] :
         {std::tuple(6U, 3U, 0U), {6, 100, 0}, {6, 2, 11}, {6, 1, 11}}) {
        fake_major = next_major;
        fake_minor = next_minor;
        EXPECT_EQ(_operatingsystem(), code) << "queried until it is determined";
    }
    EXPECT_EQ(queries, 3);
    EXPECT_EQ(_operatingsystemversion(), 0);
    EXPECT_EQ(_operatingsystem(), 10U) << "each version query stores what it detects";
    fake_major = 10;
    EXPECT_EQ(_operatingsystemversion(), 0);
    EXPECT_EQ(_operatingsystem(), 10U) << "but not an unlisted version";
    EXPECT_EQ(queries, 5);
    environment.os_code.store(0);
    fake_major = 6;
    fake_minor = 2;
}

TEST(Environment, handheld_display_and_language) {
    struct Row {
        bool (*query)();
        unsigned without_flags, with_flags;  // a bit for each code that can
    };
    constexpr Row ROWS[] = {{_handheldCanHaveInBuildKV7Radio, 0x160, 0x160},
                            {_handheldCanHaveInBuildModem, 0x4C88, 0x4C88},
                            {_handheldCanHaveInBuildKestraRTK, 0x80, 0x880},
                            {_isNewLumoOS, 0, 0x2040},
                            {_isDefaultFontSize, 0xFCFF, 0xFCFF}};
    for (const auto& [query, without_flags, with_flags] : ROWS) {
        for (basalt_hh code = 0; code < 16; ++code) {
            for (const unsigned codes : {without_flags, with_flags}) {
                environment.handheld_code.store(code);
                environment.new_generation.store(codes == with_flags);
                environment.rtk_option.store(codes == with_flags);
                EXPECT_EQ(query(), (codes >> code & 1) != 0) << code;
                EXPECT_EQ(_handheldVersion(), std::max(code, 1U)) << "0 is detected as the desktop";
            }
        }
    }
    EXPECT_EQ(std::bit_cast<std::uint64_t>(basalt::frame::RESOLUTION_NOT_DETERMINED), 0x000E61ACF033D1A4U);
    for (const double stored : {1.5, 0.0, 2e-308}) {
        environment.resolution_factor.store(stored);
        EXPECT_EQ(_checkForHighResolution(), stored == 2e-308 ? 1.0 : stored);
    }
    EXPECT_EQ(_languageVersion(), 15U);
    for (const basalt_language language : {7U, 0U, 0xFFFFFFFFU, 15U}) {
        _setLanguageVersion(language);
        EXPECT_EQ(_languageVersion(), language == 0 ? 15U : language);
    }
    EXPECT_EQ(_taskbarheight(), 26);
}

TEST(Environment, random_numbers_follow_the_tick_count) {
    std::srand(123'456);
    const int first = std::rand() % 65535;
    const int second = std::rand() % 65535;
    milliseconds = 123'456;
    EXPECT_EQ(_random_uint16(), first);
    EXPECT_EQ(_random_uint16(), second) << "one sequence within a millisecond";
    milliseconds = (1ULL << 32) - 1;
    _random_uint16();
    milliseconds = 123'456 + (1ULL << 32);
    EXPECT_EQ(_random_uint16(), first) << "the count has 32 bits; the same tick draws the same again";
    environment.last_random_seed.store(0);
    milliseconds = 1ULL << 32;
    std::srand(123'456);
    EXPECT_EQ(_random_uint16(), first) << "a fresh library is seeded with tick 0";
}

TEST(Environment, reverses_bytes_of_any_number_and_alignment) {
    _reversebytes(nullptr, 0);
    for (std::uint32_t count = 0; count <= 100; ++count) {
        for (std::size_t offset = 0; offset < 8; ++offset) {
            std::vector<unsigned char> bytes(count + offset + 8);
            std::generate(bytes.begin(), bytes.end(),
                          [n = 0]() mutable { return static_cast<unsigned char>(n += 37); });
            std::vector<unsigned char> expected = bytes;
            std::reverse(expected.begin() + static_cast<long>(offset), expected.end() - 8);
            _reversebytes(bytes.data() + offset, count);
            ASSERT_EQ(bytes, expected) << count << " bytes at " << offset;
        }
    }
}

}  // namespace
