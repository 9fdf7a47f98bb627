// Splitting a path into its parts.
#ifndef BASALT_SRC_PLATFORM_PATH_SPLIT_H
#define BASALT_SRC_PLATFORM_PATH_SPLIT_H

#include <string_view>

namespace basalt::platform {

constexpr bool is_separator(wchar_t ch) {
    return ch == L'\\' || ch == L'/';
}

// Views of the path; concatenated, they are the path.
struct PathParts {
    std::wstring_view drive, directory, name, extension;
};

// Splits a path as Win32 does, without reading the disk: the drive is the first two characters if the second
// is a colon, the directory ends with the last '\' or '/', the name ends before the last dot behind that, and
// the extension is the rest with its dot. So ".profile" is all extension.
// Returns false, with all parts empty, if one has more than 255 characters. Threads: reentrant.
bool split_path(std::wstring_view path, PathParts& parts);

}  // namespace basalt::platform

#endif
