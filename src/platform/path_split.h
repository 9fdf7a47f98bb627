// Taking a path apart.
#ifndef BASALT_SRC_PLATFORM_PATH_SPLIT_H
#define BASALT_SRC_PLATFORM_PATH_SPLIT_H

#include <string_view>

namespace basalt::platform {

constexpr bool is_separator(wchar_t ch) {
    return ch == L'\\' || ch == L'/';
}

// The four parts of a path, in the place that it has: joined they are the path.
struct PathParts {
    std::wstring_view drive, directory, name, extension;
};

// Splits a path as the published splitter does, without a look at the disk: the drive is the first two
// characters when the second is a colon, the directory ends with the last `\` or `/`, the name ends before
// the last dot behind that, and the extension is the rest, its dot included. So ".profile" is all extension.
// False, with all four empty, when one has more than the published 255 characters. Threads: reentrant.
bool split_path(std::wstring_view path, PathParts& parts);

}  // namespace basalt::platform

#endif
