#include "basalt/platform/error.h"

#include <gtest/gtest.h>

#include <array>
#include <cerrno>
#include <thread>

#include "src/platform/error_message.h"
#include "src/platform/errors/error_from_errno.h"

namespace {

using namespace basalt::platform;

TEST(Errors, are_a_threads_own_and_come_from_errno) {
    SetLastError(0xFFFFFFFF);
    std::thread([] { EXPECT_EQ(GetLastError(), 0U); }).join();
    EXPECT_EQ(GetLastError(), 0xFFFFFFFFU);
    static_assert(HRESULT_FROM_WIN32(0) == 0 &&
                  static_cast<DWORD>(HRESULT_FROM_WIN32(0x12345)) == 0x80072345);
    static_assert(static_cast<DWORD>(HRESULT_FROM_WIN32(0x8007000E)) == 0x8007000E);
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
    for (const DWORD code : {0U, 2U, 8U, 87U, 487U, 1921U, 9999U, 0xFFFFFFFFU}) {
        const DWORD length = FormatMessageW(0x1300, nullptr, code, 0, &text, code == 0 ? 5000 : 0, nullptr);
        text[code == 0 ? 4999 : length] = L'\0';  // the size requested
        const std::wstring message(text, length);
        const std::wstring unknown = L"Unknown error " + std::to_wstring(code);
        EXPECT_EQ(message.find(unknown), code < 9999 ? message.npos : 0) << code;
        EXPECT_EQ(message.find_first_of(std::wstring(L"\0\r\n", 3)), message.npos);
        LocalFree(text);
    }
    for (const DWORD flags : {0U, 0x1000U, 0x1200U, 0x1100U, 0x1301U, 0x1B00U, 0x1300U}) {
        wchar_t dummy[] = L"x";
        text = dummy;
        SetLastError(0);
        EXPECT_EQ(FormatMessageW(flags, nullptr, 5, flags == 0x1300 ? 1033 : 0, &text, 0, nullptr), 0U);
        EXPECT_TRUE(GetLastError() == 87 && text == nullptr) << flags;
    }
    EXPECT_EQ(FormatMessageW(0x1300, nullptr, 5, 0, nullptr, 0, nullptr), 0U);
}

TEST(Errors, debugger_output_is_utf8_on_standard_error_or_the_handlers) {
    static std::wstring received;
    const DebugOutputHandler handler = [](const wchar_t* text) {
        received += text;
        SetLastError(errno = 1);
    };
    testing::internal::CaptureStderr();
    std::wstring text;
    std::string expected;
    for (std::size_t i = 0; i < 10'000; ++i) {  // longer than any buffer, each length at each offset
        text += L"a\u00E9\u20AC\U0001F600\xD800\x110000"[i % 6];
        expected += std::array{"a", "\xC3\xA9", "\xE2\x82\xAC", "\xF0\x9F\x98\x80", "?", "?"}[i % 6];
    }
    SetLastError(77);
    for (const DebugOutputHandler next : {handler, static_cast<DebugOutputHandler>(nullptr)}) {
        errno = E2BIG;
        OutputDebugStringW(text.c_str());
        OutputDebugStringW(nullptr);
        EXPECT_TRUE(errno == E2BIG && GetLastError() == 77);
        EXPECT_NE(SetDebugOutputHandler(next), next);
    }
    EXPECT_EQ(testing::internal::GetCapturedStderr(), expected);
    EXPECT_EQ(received, text);
}

}  // namespace
