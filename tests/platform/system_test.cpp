// Errors, their messages and debugger output, the clock and locks.
#include <gtest/gtest.h>
#include <time.h>

#include <array>
#include <cerrno>
#include <thread>

#include "basalt/platform/error.h"
#include "src/platform/clock.h"
#include "src/platform/error_message.h"
#include "src/platform/errors/error_from_errno.h"
#include "src/platform/system/lock.h"
#include "tests/support/threads.h"

namespace {

using namespace basalt::platform;

TEST(Errors, are_a_threads_own_and_come_from_errno) {
    SetLastError(0xFFFFFFFF);
    std::thread([] { EXPECT_EQ(GetLastError(), 0U); }).join();
    EXPECT_EQ(GetLastError(), 0xFFFFFFFFU);
    static_assert(HRESULT_FROM_WIN32(0) == 0 && DWORD(HRESULT_FROM_WIN32(0x12345)) == 0x80072345);
    static_assert(DWORD(HRESULT_FROM_WIN32(0x8007000E)) == 0x8007000E);
    constexpr std::pair<int, DWORD> ROWS[] = {
        {0, 0},           {ENOENT, 2},       {ENOTDIR, 3},  {EMFILE, 4},         {ENFILE, 4},
        {EACCES, 5},      {EPERM, 5},        {EISDIR, 5},   {EBADF, 6},          {ENOMEM, 8},
        {EROFS, 19},      {-1, 31},          {99999, 31},   {ETXTBSY, 32},       {ENOSYS, 50},
        {EOPNOTSUPP, 50}, {ENODEV, 55},      {ENXIO, 55},   {EEXIST, 80},        {EINVAL, 87},
        {ENOSPC, 112},    {EDQUOT, 112},     {EBUSY, 170},  {ENAMETOOLONG, 206}, {EFBIG, 223},
        {EOVERFLOW, 534}, {EINTR, 995},      {EFAULT, 998}, {EILSEQ, 1113},      {EIO, 1117},
        {EAGAIN, 1450},   {ETIMEDOUT, 1460}, {ELOOP, 1921}};
    for (const auto& [number, code] : ROWS) {
        EXPECT_EQ(error_from_errno(number), code) << number;
    }
}

TEST(Errors, have_messages_without_line_breaks) {
    wchar_t* text = nullptr;
    for (const DWORD code : {0U, 6U, 8U, 87U, 487U, 9999U, 0xFFFFFFFFU}) {
        const DWORD length = FormatMessageW(0x1300, nullptr, code, 0, &text, 0, nullptr);
        const std::wstring message(text, length);
        const bool is_unknown = message.starts_with(L"Unknown error " + std::to_wstring(code));
        EXPECT_EQ(is_unknown, code >= 9999) << code;
        EXPECT_EQ(message.find_first_of(std::wstring(L"\0\r\n", 3)), message.npos);
        EXPECT_EQ(text[length], L'\0');
        LocalFree(text);
    }
}

TEST(Errors, debugger_output_is_utf8_on_standard_error_or_the_handlers) {
    static std::wstring received;
    const DebugOutputHandler handler = [](const wchar_t* text) {
        received += text;
        SetLastError(errno = 1);
    };
    std::wstring text;
    std::string expected;
    for (std::size_t i = 0; i < 10'000; ++i) {  // longer than any buffer, each length at each offset
        text += L"a\u00E9\u20AC\U0001F600\xD800\x110000"[i % 6];
        expected += std::array{"a", "\xC3\xA9", "\xE2\x82\xAC", "\xF0\x9F\x98\x80", "?", "?"}[i % 6];
    }
    testing::internal::CaptureStderr();
    SetLastError(77);
    for (const DebugOutputHandler next : {handler, DebugOutputHandler(nullptr)}) {
        errno = E2BIG;
        OutputDebugStringW(text.c_str());
        OutputDebugStringW(nullptr);
        EXPECT_TRUE(errno == E2BIG && GetLastError() == 77);
        EXPECT_NE(SetDebugOutputHandler(next), next);
    }
    EXPECT_EQ(testing::internal::GetCapturedStderr(), expected);
    EXPECT_EQ(received, text);
}

TEST(Clock, counts_the_machines_monotonic_time) {
    timespec before{}, after{};
    LARGE_INTEGER count{};
    clock_gettime(CLOCK_MONOTONIC, &before);
    const DWORD tick = GetTickCount();
    EXPECT_NE(QueryPerformanceCounter(&count), 0);
    clock_gettime(CLOCK_MONOTONIC, &after);
    const auto nanoseconds = [](const timespec& time) { return time.tv_sec * 1'000'000'000 + time.tv_nsec; };
    EXPECT_TRUE(count.QuadPart >= nanoseconds(before) && count.QuadPart <= nanoseconds(after));
    EXPECT_LE(tick - DWORD(nanoseconds(before) / 1'000'000), 1'000U);
}

constinit Lock before_any_constructor;

template <class AnyLock>
void expect_one_thread_inside(AnyLock& lock) {
    int inside = 0, entered = 0;
    basalt::test::run_threads(4, [&](int thread) {
        for (int round = 0; round < 20'000; ++round) {
            errno = 17;
            while (!(thread % 2 == 0 || round % 4 == 0 ? (lock.lock(), true) : lock.try_lock())) {
                std::this_thread::yield();
            }
            ASSERT_TRUE(errno == 17 && ++inside == 1);
            round % 16 == 0 ? std::this_thread::yield() : void();  // held for long: the others go to sleep
            --inside, ++entered;
            lock.unlock();
        }
    });
    EXPECT_EQ(entered, 80'000);
}

TEST(Lock, admits_one_thread_at_a_time_and_keeps_errno_and_the_recursive_one_its_owner_again) {
    RecursiveLock recursive;
    expect_one_thread_inside(before_any_constructor);
    expect_one_thread_inside(recursive);
    before_any_constructor.lock();
    EXPECT_FALSE(before_any_constructor.try_lock());
    recursive.lock(), recursive.lock();
    EXPECT_TRUE(recursive.try_lock());
    for (int left = 3; left >= 0; --left) {
        bool other_entered = false;
        std::thread([&] { other_entered = recursive.try_lock() && (recursive.unlock(), true); }).join();
        EXPECT_EQ(other_entered, left == 0) << left;
        left > 0 ? recursive.unlock() : void();
    }
}

}  // namespace
