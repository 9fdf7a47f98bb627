#include "basalt/frame.h"

#include <gtest/gtest.h>
#include <time.h>

#include <bit>
#include <cstdlib>
#include <set>
#include <utility>

#include "src/frame/environment_state.h"
#include "src/platform/system_info.h"

namespace {

using basalt::frame::environment;

// Stand-ins for the version query and the system's clock, put in place by the linker.
struct FakePlatform {
    bool query_works = true;
    DWORD platform = 2;
    DWORD major = 6;
    DWORD minor = 2;
    int queries = 0;
    bool clock_is_set = false;
    timespec clock{};
} fake;

}  // namespace

extern "C" {
// The names the linker's --wrap makes of GetVersionExW and clock_gettime.
int __real_clock_gettime(clockid_t id, timespec* time);
int __wrap_clock_gettime(clockid_t id, timespec* time) {
    if (!fake.clock_is_set) {
        return __real_clock_gettime(id, time);
    }
    *time = fake.clock;
    return 0;
}
BOOL __wrap__Z13GetVersionExWP14OSVERSIONINFOW(OSVERSIONINFOW* information) {
    ++fake.queries;
    if (!fake.query_works || information->dwOSVersionInfoSize != 276) {
        return 0;
    }
    information->dwPlatformId = fake.platform;
    information->dwMajorVersion = fake.major;
    information->dwMinorVersion = fake.minor;
    return 1;
}
}

namespace {

class Environment : public testing::Test {
protected:
    void SetUp() override {
        fake = {};
        environment.os_code.store(0);
        environment.handheld_code.store(0);
        environment.new_generation.store(false);
        environment.rtk_option.store(false);
    }
    void TearDown() override { SetUp(); }

    static void set_tick(std::uint64_t milliseconds) {
        fake.clock_is_set = true;
        fake.clock.tv_sec = static_cast<time_t>(milliseconds / 1000);
        fake.clock.tv_nsec = static_cast<long>(milliseconds % 1000) * 1'000'000 + 999'999;
    }
};

TEST_F(Environment, operating_system_is_asked_for_until_it_is_determined) {
    fake.minor = 3;
    EXPECT_EQ(_operatingsystem(), 0U);
    fake.query_works = false;
    EXPECT_EQ(_operatingsystem(), 0U);
    fake = {.queries = 2};
    EXPECT_EQ(_operatingsystem(), 11U);
    fake.minor = 1;
    EXPECT_EQ(_operatingsystem(), 11U);
    EXPECT_EQ(fake.queries, 3);
}

TEST_F(Environment, version_number_is_0_and_detects_at_every_call) {
    EXPECT_EQ(_operatingsystemversion(), 0);
    EXPECT_EQ(environment.os_code.load(), 11U);
    fake.minor = 1;
    EXPECT_EQ(_operatingsystemversion(), 0);
    EXPECT_EQ(environment.os_code.load(), 10U) << "a detection stores what it finds";
    fake.major = 10;
    EXPECT_EQ(_operatingsystemversion(), 0);
    EXPECT_EQ(environment.os_code.load(), 10U) << "an unlisted version leaves the code alone";
    EXPECT_EQ(fake.queries, 3);
}

TEST_F(Environment, handheld_capabilities) {
    for (basalt_hh code = 1; code <= 15; ++code) {
        const auto is_one_of = [code](const std::set<basalt_hh>& codes) { return codes.contains(code); };
        for (const bool flag : {false, true}) {
            SCOPED_TRACE(testing::Message() << code << ' ' << flag);
            environment.handheld_code.store(code);
            environment.new_generation.store(flag);
            environment.rtk_option.store(flag);
            EXPECT_EQ(_handheldCanHaveInBuildKV7Radio(), is_one_of({5, 6, 8}));
            EXPECT_EQ(_handheldCanHaveInBuildModem(), is_one_of({3, 7, 10, 11, 14}));
            EXPECT_EQ(_handheldCanHaveInBuildKestraRTK(), code == 7 || (code == 11 && flag));
            EXPECT_EQ(_isDefaultFontSize(), !is_one_of({8, 9}));
            EXPECT_EQ(_isNewLumoOS(), flag && is_one_of({6, 13}));
        }
    }
}

TEST_F(Environment, every_capability_query_detects_the_handheld) {
    EXPECT_EQ(_handheldVersion(), 1U);
    for (bool (*query)() : {_isNewLumoOS, _handheldCanHaveInBuildKV7Radio, _handheldCanHaveInBuildModem,
                            _handheldCanHaveInBuildKestraRTK, _isDefaultFontSize}) {
        environment.handheld_code.store(0);
        query();
        EXPECT_EQ(environment.handheld_code.load(), 1U);
    }
}

TEST_F(Environment, resolution_factor_is_set_only_while_it_holds_the_start_value) {
    EXPECT_EQ(std::bit_cast<std::uint64_t>(basalt::frame::RESOLUTION_NOT_DETERMINED), 0x000E61ACF033D1A4U);
    for (const auto& [stored, answer] : {std::pair(2e-308, 1.0), std::pair(1.5, 1.5), std::pair(0.0, 0.0)}) {
        environment.resolution_factor.store(stored);
        EXPECT_EQ(_checkForHighResolution(), answer);
        EXPECT_EQ(_checkForHighResolution(), answer);
    }
    environment.resolution_factor.store(basalt::frame::RESOLUTION_NOT_DETERMINED);
}

TEST_F(Environment, language_0_reads_as_15) {
    EXPECT_EQ(_languageVersion(), 15U);
    for (const basalt_language language : {7U, 0U, 0xFFFFFFFFU, 15U}) {
        _setLanguageVersion(language);
        EXPECT_EQ(_languageVersion(), language == 0 ? 15U : language);
    }
    EXPECT_EQ(_taskbarheight(), 26);
}

TEST_F(Environment, random_numbers_follow_the_tick_count) {
    // The model: seed at each new tick, then draw on.
    std::srand(123'456);
    const int first = std::rand() % 65535;
    const int second = std::rand() % 65535;

    set_tick(123'456);
    EXPECT_EQ(_random_uint16(), first);
    EXPECT_EQ(_random_uint16(), second) << "one sequence within a millisecond";
    set_tick(123'457);
    _random_uint16();
    set_tick(123'456 + (std::uint64_t{1} << 32));
    EXPECT_EQ(_random_uint16(), first) << "the count has 32 bits; the same tick draws the same again";
}

TEST_F(Environment, tick_0_does_not_reseed_a_fresh_library) {
    environment.last_random_seed.store(0);
    std::srand(99);
    const int unseeded = std::rand() % 65535;
    std::srand(99);
    set_tick(0);
    EXPECT_EQ(_random_uint16(), unseeded);
}

}  // namespace
