// The platform queries, random numbers, reversed bytes and the guard of the codec.
#include <gtest/gtest.h>
#include <time.h>

#include <algorithm>
#include <cstdlib>
#include <numeric>
#include <tuple>
#include <vector>

#include "src/frame/codec_guard.h"
#include "src/frame/environment_state.h"
#include "src/frame/os_detection.h"
#include "src/platform/codec.h"

namespace {

using basalt::frame::environment;

DWORD fake_major = 6, fake_minor = 2;  // beyond 99: the query fails
int queries = 0;
std::uint64_t milliseconds = 0;

bool codec_works = true;
std::uintptr_t starts = 0, running = 0;
int codec_faults = 0;  // runs within another and wrong tokens

}  // namespace

// The linker's --wrap puts these in place of the version query, the system's clock and the codec's start and
// end.
extern "C" {
int __wrap_clock_gettime(clockid_t, timespec* time) {
    *time = {static_cast<time_t>(milliseconds / 1000),
             static_cast<long>(milliseconds % 1000) * 1'000'000 + 999'999};
    return 0;
}
Gdiplus::Status __wrap__Z14GdiplusStartupPmPK19GdiplusStartupInputP20GdiplusStartupOutput(
    std::uintptr_t* token, const GdiplusStartupInput* input, GdiplusStartupOutput*) {
    codec_faults += running != 0 || input->GdiplusVersion != 1;
    *token = ++starts;
    running = codec_works ? *token : 0;
    return codec_works ? Gdiplus::Ok : Gdiplus::Win32Error;
}
void __wrap__Z15GdiplusShutdownm(std::uintptr_t token) {
    codec_faults += token == 0 || token != running;
    running = 0;
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
    // The version reported, code and number of queries afterwards: queried until it is determined, and by
    // each version query, which stores no unlisted version.
    environment.os_code.store(0);
    using Query = std::tuple<DWORD, DWORD, bool, DWORD, int>;
    for (const auto& [next_major, next_minor, asks_version, code, count] :
         {Query(6, 3, false, 0, 1), Query(6, 100, false, 0, 2), Query(6, 2, false, 11, 3),
          Query(6, 1, false, 11, 3), Query(6, 1, true, 10, 4), Query(10, 0, true, 10, 5)}) {
        fake_major = next_major, fake_minor = next_minor;
        EXPECT_TRUE(!asks_version || _operatingsystemversion() == 0);
        EXPECT_TRUE(_operatingsystem() == code && queries == count) << count;
    }
    environment.os_code.store(0), fake_major = 6, fake_minor = 2;
}

TEST(Environment, handheld_display_and_language) {
    using Row = std::tuple<bool (*)(), unsigned, unsigned>;  // bits of the codes that can, then with flags
    for (const auto& [query, without_flags, with_flags] :
         {Row(_handheldCanHaveInBuildKV7Radio, 0x160, 0x160),
          Row(_handheldCanHaveInBuildModem, 0x4C88, 0x4C88),
          Row(_handheldCanHaveInBuildKestraRTK, 0x80, 0x880), Row(_isNewLumoOS, 0, 0x2040),
          Row(_isDefaultFontSize, 0xFCFF, 0xFCFF)}) {
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
    for (const double stored : {1.5, 0.0, 2e-308}) {
        environment.resolution_factor.store(stored);
        EXPECT_EQ(_checkForHighResolution(), stored == 2e-308 ? 1.0 : stored);
    }
    EXPECT_TRUE(_languageVersion() == 15 && _taskbarheight() == 26);
    for (const basalt_language language : {7U, 0U, 0xFFFFFFFFU, 15U}) {
        _setLanguageVersion(language);
        EXPECT_EQ(_languageVersion(), language == 0 ? 15U : language);
    }
}

TEST(Environment, random_numbers_follow_the_tick_count) {
    std::srand(123'456);
    milliseconds = 123'456;
    const int first = std::rand() % 65535, second = std::rand() % 65535;
    EXPECT_TRUE(_random_uint16() == first && _random_uint16() == second) << "one sequence a millisecond";
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
    for (std::uint32_t i = 0; i <= 800; ++i) {
        const std::uint32_t count = i / 8, offset = i % 8;
        std::vector<unsigned char> bytes(count + offset + 8);
        std::iota(bytes.begin(), bytes.end(), static_cast<unsigned char>(count));
        std::vector<unsigned char> expected = bytes;
        std::reverse(&expected[offset], &expected[offset + count]);
        _reversebytes(&bytes[offset], count);
        ASSERT_EQ(bytes, expected) << count << " bytes at " << offset;
    }
}

TEST(CodecGuard, one_run_lasts_from_the_first_start_to_the_last_image) {
    {
        basalt::frame::CodecGuard guard;
        for (const std::uintptr_t run : {1U, 2U}) {
            guard.AddImage(), guard.AddImage();
            EXPECT_EQ(running, 0U) << "an image alone starts nothing";
            EXPECT_TRUE(guard.Start() && guard.Start() && running == run);
            for (const std::uintptr_t left : {run, std::uintptr_t{0}, std::uintptr_t{0}}) {
                guard.ReleaseImage();  // the third time, none is alive
                EXPECT_EQ(running, left);
            }
        }
        codec_works = false;
        EXPECT_FALSE(guard.Start() || guard.Start());
        codec_works = true;
        EXPECT_TRUE(guard.Start() && starts == 5) << "a start that failed is repeated";
    }
    basalt::frame::CodecGuard without_lock(ERROR_NOT_ENOUGH_MEMORY);
    EXPECT_EQ(static_cast<std::uint32_t>(without_lock.LastError()), 0x80070008U);
    EXPECT_TRUE(!without_lock.Start() && running == 0 && codec_faults == 0)
        << "the guard's end is the codec's";
}

}  // namespace
