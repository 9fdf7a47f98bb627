#include "basalt/platform/error.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cwchar>
#include <string>
#include <thread>
#include <utility>

#include "src/platform/error_message.h"
#include "src/platform/errors/error_from_errno.h"

namespace {

constexpr DWORD SYSTEM_TEXT = 0x1300;

std::wstring message_of(DWORD code) {
    wchar_t* text = nullptr;
    const DWORD length = FormatMessageW(SYSTEM_TEXT, nullptr, code, 0, &text, 0, nullptr);
    std::wstring message = text != nullptr ? text : L"(none)";
    EXPECT_EQ(length, message.size());
    EXPECT_EQ(LocalFree(text), nullptr);
    return message;
}

// What a function writes to standard error.
template <class Function>
std::string standard_error_of(Function function) {
    std::FILE* const file = std::tmpfile();
    const int kept = dup(STDERR_FILENO);
    dup2(fileno(file), STDERR_FILENO);
    function();
    dup2(kept, STDERR_FILENO);
    close(kept);
    std::rewind(file);
    std::string output(200'000, '\0');
    output.resize(std::fread(output.data(), 1, output.size(), file));
    std::fclose(file);
    return output;
}

TEST(LastError, each_thread_has_its_own) {
    SetLastError(0xFFFFFFFF);
    std::thread([] {
        EXPECT_EQ(GetLastError(), 0U);
        SetLastError(5);
        EXPECT_EQ(GetLastError(), 5U);
    }).join();
    EXPECT_EQ(GetLastError(), 0xFFFFFFFFU);
}

TEST(LastError, result_codes) {
    static_assert(HRESULT_FROM_WIN32(0) == 0);
    static_assert(HRESULT_FROM_WIN32(5) == static_cast<HRESULT>(0x80070005));
    static_assert(HRESULT_FROM_WIN32(0x12345) == static_cast<HRESULT>(0x80072345));
    static_assert(HRESULT_FROM_WIN32(0x8007000E) == static_cast<HRESULT>(0x8007000E));
}

TEST(LastError, from_errno) {
    using Row = std::pair<int, DWORD>;
    for (const auto& [number, code] :
         {Row{0, 0},    {ENOENT, 2},       {ENOTDIR, 3},  {EMFILE, 4},         {ENFILE, 4},
          {EACCES, 5},  {EPERM, 5},        {EBADF, 6},    {ENOMEM, 8},         {EEXIST, 80},
          {EINVAL, 87}, {ENOSPC, 112},     {EDQUOT, 112}, {ENAMETOOLONG, 206}, {EAGAIN, 1450},
          {-1, 31},     {99999, 31},       {EISDIR, 5},   {EROFS, 19},         {ETXTBSY, 32},
          {ENOSYS, 50}, {EOPNOTSUPP, 50},  {ENODEV, 55},  {ENXIO, 55},         {EBUSY, 170},
          {EFBIG, 223}, {EOVERFLOW, 534},  {EINTR, 995},  {EFAULT, 998},       {EILSEQ, 1113},
          {EIO, 1117},  {ETIMEDOUT, 1460}, {ELOOP, 1921}}) {
        errno = number;
        basalt::platform::set_last_error_from_errno();
        EXPECT_EQ(GetLastError(), code) << number;
    }
}

TEST(ErrorMessage, every_code_has_one_without_a_line_break) {
    EXPECT_EQ(message_of(9999), L"Unknown error 9999");
    EXPECT_EQ(message_of(0xFFFFFFFF), L"Unknown error 4294967295");
    for (const DWORD code : {2U, 3U, 4U, 5U, 6U, 8U, 80U, 87U, 112U, 122U, 206U, 487U, 1450U}) {
        const std::wstring message = message_of(code);
        EXPECT_EQ(message.find(L"Unknown"), message.npos) << code;
        EXPECT_EQ(message.find_first_of(L"\r\n"), message.npos) << code;
    }
    EXPECT_NE(message_of(2), message_of(3));
}

TEST(ErrorMessage, buffer_has_the_least_size_asked_for) {
    wchar_t* text = nullptr;
    ASSERT_NE(FormatMessageW(SYSTEM_TEXT, nullptr, 5, 0, &text, 5000, nullptr), 0U);
    text[4999] = L'x';
    LocalFree(text);
}

TEST(ErrorMessage, other_uses_are_refused) {
    wchar_t dummy[2] = L"x";
    for (const DWORD flags : {0U, 0x1000U, 0x1200U, 0x1100U, 0x1301U, 0x1B00U}) {
        wchar_t* text = dummy;
        SetLastError(0);
        EXPECT_EQ(FormatMessageW(flags, nullptr, 5, 0, &text, 0, nullptr), 0U);
        EXPECT_EQ(GetLastError(), 87U);
        EXPECT_EQ(text, nullptr);
    }
    wchar_t* text = dummy;
    EXPECT_EQ(FormatMessageW(SYSTEM_TEXT, nullptr, 5, 1033, &text, 0, nullptr), 0U);
    SetLastError(0);
    EXPECT_EQ(FormatMessageW(SYSTEM_TEXT, nullptr, 5, 0, nullptr, 0, nullptr), 0U);
    EXPECT_EQ(GetLastError(), 87U);
}

TEST(DebugOutput, standard_error_gets_utf8_and_nothing_else_changes) {
    std::wstring text;
    std::string expected;
    // Longer than any buffer on the way, with characters of one to four bytes at every offset, and two that
    // UTF-8 does not have.
    for (std::size_t i = 0; i < 60'000; ++i) {
        text += L"aé€\x1F600\xD800\x110000"[i % 6];
        expected += std::array{"a", "\xC3\xA9", "\xE2\x82\xAC", "\xF0\x9F\x98\x80", "?", "?"}[i % 6];
    }
    errno = E2BIG;
    SetLastError(1234);
    EXPECT_EQ(standard_error_of([&] {
                  OutputDebugStringW(text.c_str());
                  OutputDebugStringW(L"");
                  OutputDebugStringW(nullptr);
              }),
              expected);
    EXPECT_EQ(GetLastError(), 1234U);

    const int kept = dup(STDERR_FILENO);
    close(STDERR_FILENO);
    errno = E2BIG;
    OutputDebugStringW(L"nowhere");
    const int errno_after = errno;
    dup2(kept, STDERR_FILENO);
    close(kept);
    EXPECT_EQ(errno_after, E2BIG);
}

TEST(DebugOutput, handler_takes_over_and_back) {
    static std::wstring received;
    const auto handler = [](const wchar_t* text) {
        received += text;
        SetLastError(1);
        errno = 1;
    };
    EXPECT_EQ(basalt::platform::SetDebugOutputHandler(handler), nullptr);
    SetLastError(77);
    errno = 7;
    EXPECT_EQ(standard_error_of([] {
                  OutputDebugStringW(L"one");
                  OutputDebugStringW(nullptr);
                  OutputDebugStringW(L"two");
              }),
              "");
    EXPECT_EQ(received, L"onetwo");
    EXPECT_EQ(GetLastError(), 77U);
    EXPECT_EQ(basalt::platform::SetDebugOutputHandler(nullptr),
              static_cast<basalt::platform::DebugOutputHandler>(handler));
    EXPECT_EQ(standard_error_of([] { OutputDebugStringW(L"three"); }), "three");
}

}  // namespace
