// Names of files between wide text and the disk.
#ifndef BASALT_SRC_PLATFORM_FILE_NAME_H
#define BASALT_SRC_PLATFORM_FILE_NAME_H

#include <string>
#include <string_view>

#include "basalt/platform/types.h"

namespace basalt::platform {

// The name the system knows: UTF-8, each `\` a `/`. False for text with values that are no characters; those
// from 0xDC80 to 0xDCFF stand for single bytes.
bool file_name_from_wide(std::wstring_view name, std::string& result);

// The wide text that file_name_from_wide leads back to the same bytes. Should a name not be UTF-8, each of
// its bytes from 0x80 on becomes a value from 0xDC80 on.
std::wstring wide_from_file_name(std::string_view name);

// The published code of an errno value that a call gave for a path: a missing file is told from a missing
// folder.
DWORD error_of_path(const std::string& path, int number);

}  // namespace basalt::platform

#endif
