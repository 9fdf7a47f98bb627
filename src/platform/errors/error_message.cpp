#include "src/platform/error_message.h"

#include <algorithm>
#include <charconv>
#include <cstdlib>
#include <iterator>
#include <string_view>

#include "src/platform/system/failure.h"

using namespace basalt::platform;

namespace {

constexpr DWORD SUPPORTED_FLAGS =
    FORMAT_MESSAGE_ALLOCATE_BUFFER | FORMAT_MESSAGE_FROM_SYSTEM | FORMAT_MESSAGE_IGNORE_INSERTS;

struct Message {
    DWORD code;
    std::wstring_view text;
};

// In ascending order of the codes.
constexpr Message MESSAGES[] = {
    {ERROR_SUCCESS, L"No error."},
    {ERROR_FILE_NOT_FOUND, L"The file does not exist."},
    {ERROR_PATH_NOT_FOUND, L"A folder of the path does not exist."},
    {ERROR_TOO_MANY_OPEN_FILES, L"Too many files are open."},
    {ERROR_ACCESS_DENIED, L"Access is not allowed."},
    {ERROR_INVALID_HANDLE, L"The handle is not valid."},
    {ERROR_NOT_ENOUGH_MEMORY, L"There is not enough memory."},
    {ERROR_NO_MORE_FILES, L"There are no further files."},
    {ERROR_WRITE_PROTECT, L"The medium is read-only."},
    {ERROR_GEN_FAILURE, L"The system reported a failure that has no code of its own."},
    {ERROR_SHARING_VIOLATION, L"The file is in use and not shared."},
    {ERROR_NOT_SUPPORTED, L"The operation is not supported."},
    {ERROR_DEV_NOT_EXIST, L"The device does not exist."},
    {ERROR_FILE_EXISTS, L"The file exists already."},
    {ERROR_INVALID_PARAMETER, L"An argument is not valid."},
    {ERROR_DISK_FULL, L"The disk is full."},
    {ERROR_INSUFFICIENT_BUFFER, L"The buffer is too small."},
    {ERROR_INVALID_NAME, L"The name is not valid."},
    {ERROR_BUSY, L"The object is busy."},
    {ERROR_FILENAME_EXCED_RANGE, L"The name is too long."},
    {ERROR_FILE_TOO_LARGE, L"The file is too large."},
    {ERROR_INVALID_ADDRESS, L"The address is not valid."},
    {ERROR_ARITHMETIC_OVERFLOW, L"A number does not fit in its type."},
    {ERROR_OPERATION_ABORTED, L"The operation was interrupted."},
    {ERROR_NOACCESS, L"The memory at the address cannot be accessed."},
    {ERROR_FILE_INVALID, L"The file was changed from outside and is no longer valid."},
    {ERROR_NO_UNICODE_TRANSLATION, L"A character has no counterpart in the encoding."},
    {ERROR_IO_DEVICE, L"The device failed to read or write."},
    {ERROR_NO_SYSTEM_RESOURCES, L"The system is short of resources."},
    {ERROR_TIMEOUT, L"The operation took too long."},
    {ERROR_RESOURCE_DATA_NOT_FOUND, L"The file does not hold the resource."},
    {ERROR_RESOURCE_TYPE_NOT_FOUND, L"The resource does not hold the value."},
    {ERROR_CANT_RESOLVE_FILENAME, L"The name cannot be followed to a file."},
};
static_assert(std::is_sorted(std::begin(MESSAGES), std::end(MESSAGES),
                             [](const Message& a, const Message& b) { return a.code < b.code; }));

constexpr std::wstring_view UNKNOWN_ERROR = L"Unknown error ";

constexpr std::size_t MAX_DIGITS = 10;

}  // namespace

DWORD FormatMessageW(DWORD flags, const void* /*source*/, DWORD code, DWORD language, wchar_t** buffer,
                     DWORD size, void* /*arguments*/) {
    if (buffer != nullptr) {
        *buffer = nullptr;
    }
    if (flags != SUPPORTED_FLAGS || language != 0 || buffer == nullptr) {
        return fail_with(ERROR_INVALID_PARAMETER, DWORD{0});
    }
    const auto* known = std::lower_bound(std::begin(MESSAGES), std::end(MESSAGES), code,
                                         [](const Message& m, DWORD wanted) { return m.code < wanted; });
    const bool is_known = known != std::end(MESSAGES) && known->code == code;
    const std::wstring_view text = is_known ? known->text : UNKNOWN_ERROR;
    char digits[MAX_DIGITS];
    char* const digits_end = is_known ? digits : std::to_chars(digits, std::end(digits), code).ptr;
    const std::size_t capacity = std::max<std::size_t>(size, text.size() + MAX_DIGITS + 1);
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
