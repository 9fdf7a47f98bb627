#include "src/platform/error_message.h"

#include <algorithm>
#include <charconv>
#include <cstdlib>
#include <iterator>
#include <string_view>

#include "src/platform/system/failure.h"

using namespace basalt::platform;

namespace {

struct Message {
    DWORD code;
    std::wstring_view text;
};

// Of the codes with which heaps, page ranges and views fail.
constexpr Message MESSAGES[] = {
    {ERROR_SUCCESS, L"No error."},
    {ERROR_INVALID_HANDLE, L"The handle is not valid."},
    {ERROR_NOT_ENOUGH_MEMORY, L"There is not enough memory."},
    {ERROR_INVALID_PARAMETER, L"An argument is not valid."},
    {ERROR_INVALID_ADDRESS, L"The address is not valid."},
};

constexpr std::wstring_view UNKNOWN_ERROR = L"Unknown error ";

constexpr std::size_t MAX_DIGITS = 10;

}  // namespace

DWORD FormatMessageW(DWORD /*flags*/, const void* /*source*/, DWORD code, DWORD /*language*/,
                     wchar_t** buffer, DWORD /*size*/, void* /*arguments*/) {
    *buffer = nullptr;
    const auto* const known = std::find_if(std::begin(MESSAGES), std::end(MESSAGES),
                                           [code](const Message& message) { return message.code == code; });
    const bool is_known = known != std::end(MESSAGES);
    const std::wstring_view text = is_known ? known->text : UNKNOWN_ERROR;
    char digits[MAX_DIGITS];
    char* const digits_end = is_known ? digits : std::to_chars(digits, std::end(digits), code).ptr;
    const std::size_t capacity = text.size() + MAX_DIGITS + 1;
    auto* const message = static_cast<wchar_t*>(std::malloc(capacity * sizeof(wchar_t)));
    if (message == nullptr) {
        return fail_with(ERROR_NOT_ENOUGH_MEMORY, DWORD{0});
    }
    wchar_t* const end = std::copy(digits, digits_end, std::copy(text.begin(), text.end(), message));
    *end = L'\0';
    *buffer = message;
    return static_cast<DWORD>(end - message);
}

void* LocalFree(void* block) {
    std::free(block);
    return nullptr;
}
