// Names of files between wide text and the disk.
#ifndef BASALT_SRC_PLATFORM_TEXT_FILE_NAME_H
#define BASALT_SRC_PLATFORM_TEXT_FILE_NAME_H

#include <string>
#include <string_view>

namespace basalt::platform {

// The name the system knows: UTF-8, each `\` a `/`. False for text with values that are no characters; those
// from 0xDC80 to 0xDCFF and 0xDC5C stand for single bytes, the last for a `\` that is part of a name.
bool file_name_from_wide(std::wstring_view name, std::string& result);

// The same for the time of a call. A name in ASCII that is not very long, as nearly all are, takes no memory.
class FileName {
public:
    FileName() = default;
    FileName(const FileName&) = delete;
    FileName& operator=(const FileName&) = delete;

    bool set(std::wstring_view name);
    const char* c_str() const { return m_name; }

private:
    const char* m_name = "";
    std::string m_long;
    char m_short[512];
};

// The value that stands for a byte that belongs to no character.
constexpr wchar_t wide_from_byte(char byte) {
    const auto value = static_cast<unsigned char>(byte);
    return static_cast<wchar_t>(value < 0x80 ? value : 0xDC00 + value);
}

// The wide text that file_name_from_wide leads back to the same bytes. Should a name not be UTF-8, each of
// its bytes from 0x80 on becomes a value from 0xDC80 on.
std::wstring wide_from_file_name(std::string_view name);
// The same in the storage that the result has.
void wide_from_file_name(std::string_view name, std::wstring& result);
// The same of a name that the system gave, where a `\` is no separator: it would lead somewhere else.
void wide_from_system_name(std::string_view name, std::wstring& result);

}  // namespace basalt::platform

#endif
