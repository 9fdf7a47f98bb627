// File names as the system takes them.
#ifndef BASALT_SRC_PLATFORM_SYSTEM_FILE_NAME_H
#define BASALT_SRC_PLATFORM_SYSTEM_FILE_NAME_H

#include <algorithm>
#include <string>
#include <string_view>

#include "src/platform/utf8.h"

namespace basalt::platform {

// UTF-8 whatever the locale, and both separators as the system's own.
inline std::string system_file_name(std::wstring_view name) {
    std::string bytes = utf8_from_wide(name);
    std::replace(bytes.begin(), bytes.end(), '\\', '/');
    return bytes;
}

}  // namespace basalt::platform

#endif
