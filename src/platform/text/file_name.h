// File names between wide text and the system.
#ifndef BASALT_SRC_PLATFORM_TEXT_FILE_NAME_H
#define BASALT_SRC_PLATFORM_TEXT_FILE_NAME_H

#include <string>
#include <string_view>

namespace basalt::platform {

// The system's name: UTF-8, with '/' for each '\'. Values from 0xDC80 to 0xDCFF and 0xDC5C are single bytes,
// the last a '\' that is part of a name. Empty if there is any other value that is not a character.
std::string file_name_from_wide(std::wstring_view name);

// The same for the duration of a call. Names in ASCII of usual length need no allocation.
class FileName {
public:
    FileName() = default;
    FileName(const FileName&) = delete;
    FileName& operator=(const FileName&) = delete;

    // False if there is a value that is not a character.
    bool set(std::wstring_view name);
    const char* c_str() const { return m_name; }

private:
    const char* m_name = "";
    std::string m_long;
    char m_short[512];
};

// Low surrogates, which UTF-8 does not contain, encode single bytes.
inline constexpr wchar_t BYTE_VALUES = 0xDC00;

// The value for a byte that is not part of a character.
constexpr wchar_t wide_from_byte(char byte) {
    const auto value = static_cast<unsigned char>(byte);
    return static_cast<wchar_t>(value < 0x80 ? value : BYTE_VALUES + value);
}

// The wide text that file_name_from_wide() converts back to the same bytes. If a name is not UTF-8, each of
// its bytes from 0x80 becomes a value from 0xDC80.
std::wstring wide_from_file_name(std::string_view name);
// The same for a name returned by the system, in which '\' is not a separator; reuses the result's storage.
void wide_from_system_name(std::string_view name, std::wstring& result);

}  // namespace basalt::platform

#endif
